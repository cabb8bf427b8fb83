#include "ManagedGate.h"

#include <regex>

#include "schema/MofReader.h"
#include "support/Files.h"
#include "support/UnderTest.h"

namespace gatetest {

namespace {

using cimhost::Request;

std::filesystem::path configuration() {
    return agentEnvironment::directory() / "agent.toml";
}

cimhost::ObjectManagerOptions optionsOf(cimhost::lab::Manager manager) {
    cimhost::Schema schema;
    cimhost::MofReader(schema).readFile(SCHEMA_MOF);
    cimhost::ObjectManagerOptions options;
    options.libraries.searchPath = {std::filesystem::path(testsupport::underTest(GATE_LIBRARY)).parent_path()};
    options.classInfo = cimhost::classInfos(schema);
    options.behaviour = cimhost::lab::emulationOf(manager);
    return options;
}

cimhost::ProviderRegistry registryOf(std::initializer_list<const char*> files) {
    cimhost::ProviderRegistry registry;
    for (const char* file : files) {
        for (const auto& registration : cimhost::readRegistrationFile(file)) {
            registry.add(registration);
        }
    }
    return registry;
}

}  // namespace

ManagedGate::ManagedGate(cimhost::lab::Manager manager, Served served)
    : host(std::make_unique<cimhost::ObjectManager>(
          optionsOf(manager),
          registryOf({served == Served::byGate ? GATE_REGISTRATION : PROVIDER_REGISTRATION, COMPUTER_REGISTRATION}))) {}

std::vector<std::string> ManagedGate::identifiers(const std::string& className) {
    return identifiersOf(paths(className));
}

std::vector<ObjectPath> ManagedGate::paths(const std::string& className) {
    auto answer = host->perform(Request::enumerateInstanceNames(classPath(className)));
    EXPECT_TRUE(answer.ok()) << answer.status.message;
    return answer.paths;
}

Instance ManagedGate::instanceOf(const ObjectPath& path) {
    auto answer = host->perform(Request::getInstance(path));
    EXPECT_TRUE(answer.ok()) << answer.status.message;
    return answer.instance();
}

cimhost::Status ManagedGate::ask(const cimhost::Request& request) {
    const cimhost::Response response = host->perform(request);
    cimhost::Status status{response.status.rc};
    for (const cimhost::ProviderResponse& each : response.providers) {
        status.message += each.status.message;
    }
    return status;
}

cimhost::Status ManagedGate::create(const std::string& id, std::vector<NamedValue> properties, const std::string& of) {
    const ObjectPath path = keyedPath(of, id);
    properties.push_back(named("InstanceID", text(id)));
    return ask(Request::createInstance(path, {path, std::move(properties)}));
}

cimhost::Status ManagedGate::modify(const ObjectPath& path, std::vector<NamedValue> properties) {
    return ask(Request::modifyInstance(path, {path, std::move(properties)}));
}

cimhost::Status ManagedGate::remove(const std::string& id, const std::string& of) {
    return ask(Request::deleteInstance(keyedPath(of, id)));
}

SilentLog::SilentLog() : before(testsupport::readFile(configuration())) {
    testsupport::writeFile(configuration(), std::regex_replace(before, std::regex("_level = [0-9]+"), "_level = 0"));
}

SilentLog::~SilentLog() {
    testsupport::writeFile(configuration(), before);
}

}  // namespace gatetest
