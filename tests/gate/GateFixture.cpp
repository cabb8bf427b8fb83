#include "GateFixture.h"

#include <dlfcn.h>

#include <algorithm>

#include "schema/MofWriter.h"
#include "support/UnderTest.h"

/** Two computers with different names and node paths. */
const char* const agentNodes = R"(
[[instrumentation.node]]
type = 1
path = "/system"
properties = { "36" = "Example Maker", "108" = "alpha" }

[[instrumentation.node]]
type = 40
path = "/system/computer1"
properties = { "36" = "Example Maker", "39" = "Model X - Tower", "108" = "alpha" }

[[instrumentation.node]]
type = 40
path = "/system/computer2"
properties = { "36" = "Example Maker", "39" = "Model Y - Tower", "108" = "beta" }
)";

namespace gatetest {

namespace {

using testing::AllOf;
using testing::Field;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::ResultOf;

Instance computer(const std::string& name) {
    return testsupport::instance(computerPath(name), {named("Name", text(name)), named("Vendor", text("Example Maker")),
                                                      named("Model", text("Model of " + name))});
}

int answersOf(const Outcome& outcome) {
    return static_cast<int>(outcome.instances().size() + outcome.paths().size());
}

}  // namespace

ObjectPath classPath(const std::string& className) {
    return testsupport::objectPath(nameSpace, className);
}

ObjectPath keyedPath(const std::string& className, const std::string& instanceId) {
    return testsupport::objectPath(nameSpace, className, {named("InstanceID", text(instanceId))});
}

ObjectPath computerPath(const std::string& name) {
    return testsupport::objectPath(nameSpace, "VELKO_ComputerSystem", {named("Name", text(name))});
}

std::optional<std::string> valueIn(const Instance& instance, const std::string& property) {
    const auto& properties = instance.properties;
    const cimhost::Value* value = testsupport::find(properties, property);
    if (value == nullptr || value->isNull) {
        return std::nullopt;
    }
    if (const auto characters = testsupport::stringOf(properties, property)) {
        return characters;
    }
    const auto date = testsupport::dateTimeOf(properties, property);
    return date ? date : cimhost::formatMof(*value);
}

std::vector<std::string> identifiersOf(const std::vector<ObjectPath>& paths) {
    std::vector<std::string> identifiers;
    for (const ObjectPath& path : paths) {
        identifiers.push_back(testsupport::stringOf(path.keys, "InstanceID").value_or("(none)"));
    }
    return identifiers;
}

std::vector<std::string> identifiersOf(const std::vector<Instance>& instances) {
    std::vector<std::string> identifiers;
    for (const Instance& instance : instances) {
        identifiers.push_back(valueIn(instance, "InstanceID").value_or("(none)"));
    }
    return identifiers;
}

std::vector<std::string> formattedPaths(const std::vector<ObjectPath>& paths) {
    std::vector<std::string> shown;
    for (const ObjectPath& path : paths) {
        shown.push_back(testsupport::toText(path));
    }
    std::sort(shown.begin(), shown.end());
    return shown;
}

testing::Matcher<const Outcome&> isAnswered(int answers) {
    return AllOf(Field("rc", &Outcome::rc, CMPI_RC_OK), Field("message", &Outcome::message, IsEmpty()),
                 Field("threw", &Outcome::threw, false), Field("doneCount", &Outcome::doneCount, 1),
                 ResultOf("answers", answersOf, answers));
}

testing::Matcher<const Outcome&> isDone() {
    return AllOf(Field("rc", &Outcome::rc, CMPI_RC_OK), Field("message", &Outcome::message, IsEmpty()),
                 Field("threw", &Outcome::threw, false), ResultOf("answers", answersOf, 0));
}

testing::Matcher<const Outcome&> isRefused(CMPIrc rc, const std::string& words) {
    return AllOf(Field("rc", &Outcome::rc, rc), Field("message", &Outcome::message, HasSubstr(words)),
                 Field("threw", &Outcome::threw, false), Field("events", &Outcome::events, IsEmpty()));
}

bool isLoaded(const std::string& file) {
    void* handle = dlopen(file.c_str(), RTLD_LAZY | RTLD_NOLOAD);
    if (handle != nullptr) {
        dlclose(handle);
    }
    return handle != nullptr;
}

GateTest::GateTest() {
    agentEnvironment::clear();
    broker.serve("VELKO_ComputerSystem", {computer("alpha"), computer("beta")});
}

GateTest::~GateTest() {
    unload();
    agentEnvironment::clear();
}

testsupport::ProviderLibrary& GateTest::gate() {
    if (library == nullptr) {
        library = std::make_unique<testsupport::ProviderLibrary>(testsupport::underTest(GATE_LIBRARY),
                                                                 "LeaseAndWarrantyGate", broker);
    }
    return *library;
}

void GateTest::close() {
    library.reset();
}

void GateTest::unload() {
    close();
    EXPECT_FALSE(isLoaded(testsupport::underTest(GATE_LIBRARY))) << "the gate is still loaded";
    EXPECT_FALSE(isLoaded(testsupport::underTest(PROVIDER_LIBRARY))) << "the provider is still loaded";
}

Outcome GateTest::create(const std::string& id, std::vector<NamedValue> properties, const std::string& of) {
    const ObjectPath path = keyedPath(of, id);
    return gate().createInstance(path, testsupport::instance(path, std::move(properties)));
}

Outcome GateTest::modify(const std::string& id, std::vector<NamedValue> properties, const std::string& of) {
    const ObjectPath path = keyedPath(of, id);
    return gate().modifyInstance(path, testsupport::instance(path, std::move(properties)));
}

Outcome GateTest::remove(const std::string& id, const std::string& of) {
    return gate().deleteInstance(keyedPath(of, id));
}

std::vector<std::string> GateTest::identifiers(const std::string& of) {
    const Outcome outcome = gate().enumerateInstanceNames(classPath(of));
    EXPECT_EQ(outcome.rc, CMPI_RC_OK) << outcome.message;
    return identifiersOf(outcome.paths());
}

Instance GateTest::instanceOf(const std::string& id, const std::string& of) {
    const Outcome outcome = gate().getInstance(keyedPath(of, id));
    EXPECT_THAT(outcome, isAnswered(1)) << id;
    return outcome.instances().empty() ? Instance{} : outcome.instances().front();
}

Instance GateTest::only(const std::string& className) {
    const Outcome outcome = gate().enumerateInstances(classPath(className));
    EXPECT_EQ(outcome.rc, CMPI_RC_OK) << outcome.message;
    return outcome.instances().empty() ? Instance{} : outcome.instances().front();
}

std::filesystem::path GateTest::dataFile(const std::string& name) {
    return agentEnvironment::dataDirectory() / name;
}

}  // namespace gatetest
