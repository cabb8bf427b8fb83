#include "ManagedGate.h"

#include "operations/ClassShapes.h"
#include "operations/Interpretation.h"
#include "schema/MofReader.h"
#include "support/Files.h"
#include "support/UnderTest.h"

#include <regex>

namespace gatetest {

namespace {

std::filesystem::path configuration() {
    return agentEnvironment::directory() / "agent.toml";
}

cimhost::ObjectManagerOptions optionsOf(cimhost::Manager manager) {
    cimhost::Schema schema;
    cimhost::MofReader(schema).readFile(SCHEMA_MOF);
    cimhost::ObjectManagerOptions options;
    options.libraries.searchPath = {std::filesystem::path(testsupport::underTest(GATE_LIBRARY)).parent_path()};
    options.classShape = cimhost::classShapes(schema);
    options.manager = manager;
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

ManagedGate::ManagedGate(cimhost::Manager manager, Served served)
    : host(std::make_unique<cimhost::ObjectManager>(
          optionsOf(manager),
          registryOf({served == Served::byGate ? GATE_REGISTRATION : PROVIDER_REGISTRATION, COMPUTER_REGISTRATION}))) {}

std::vector<std::string> ManagedGate::identifiers(const std::string& className) {
    return identifiersOf(paths(className));
}

std::vector<ObjectPath> ManagedGate::paths(const std::string& className) {
    auto answer = host->enumerateInstanceNames({}, classPath(className));
    EXPECT_TRUE(answer.ok()) << answer.status.message;
    return answer.value;
}

Instance ManagedGate::got(const ObjectPath& path) {
    auto answer = host->getInstance({}, path, {});
    EXPECT_TRUE(answer.ok()) << answer.status.message;
    return answer.value;
}

cimhost::Status ManagedGate::ask(const cimhost::Request& request) {
    const auto answers = host->run(request);
    cimhost::Status status = cimhost::statusOf(answers, request.operation);
    if (request.operation == cimhost::Operation::getInstance) {
        status = cimhost::oneInstance(answers, request.path).status;
    } else if (request.operation == cimhost::Operation::createInstance) {
        status = cimhost::createdPath(answers).status;
    }
    status.message.clear();
    for (const cimhost::RawAnswer& answer : answers.value) {
        status.message += answer.status.message;
    }
    return status;
}

cimhost::Status ManagedGate::create(const std::string& id, std::vector<NamedValue> properties, const std::string& of) {
    const ObjectPath path = keyedPath(of, id);
    properties.push_back(named("InstanceID", text(id)));
    return ask({cimhost::Operation::createInstance, path, {}, {path, std::move(properties)}});
}

cimhost::Status ManagedGate::modify(const ObjectPath& path, std::vector<NamedValue> properties) {
    return ask({cimhost::Operation::modifyInstance, path, {}, {path, std::move(properties)}});
}

cimhost::Status ManagedGate::remove(const std::string& id, const std::string& of) {
    return ask({cimhost::Operation::deleteInstance, keyedPath(of, id)});
}

SilentLog::SilentLog() : before(testsupport::readFile(configuration())) {
    testsupport::writeFile(configuration(), std::regex_replace(before, std::regex("_level = [0-9]+"), "_level = 0"));
}

SilentLog::~SilentLog() {
    testsupport::writeFile(configuration(), before);
}

}  // namespace gatetest
