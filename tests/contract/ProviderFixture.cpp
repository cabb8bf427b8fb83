#include "ProviderFixture.h"

#include <dlfcn.h>

#include <algorithm>
#include <regex>

#include "schema/Literal.h"
#include "schema/MofWriter.h"
#include "support/Files.h"
#include "support/UnderTest.h"

namespace contract {

namespace {

namespace fs = std::filesystem;
using testing::AllOf;
using testing::Field;
using testing::IsEmpty;

constexpr const char* providerName = "LeaseAndWarrantyProvider";
constexpr const char* entryPointsFile = "LeaseAndWarrantyProvider.cpp";
constexpr int errorLevel = 3000;

std::string identifierOf(const std::vector<NamedValue>& values) {
    return testsupport::stringOf(values, "InstanceID").value_or("(none)");
}

/** Returns the message of a MESSAGE record; nullopt for other records. */
std::optional<std::string> messageOf(const LogRecord& record) {
    static const std::regex message(R"(MESSAGE \[File: [^,]*, Line: [0-9]+\]: ([^]*))");
    std::smatch parts;
    return std::regex_match(record.text, parts, message) ? std::optional<std::string>(parts[1]) : std::nullopt;
}

template <class Accepts>
std::vector<std::string> failures(const std::string& channel, Accepts accepts) {
    std::vector<std::string> strings;
    for (const LogRecord& record : logOf(channel)) {
        const auto text = messageOf(record);
        if (text && record.level == errorLevel && accepts(record)) {
            strings.push_back(*text);
        }
    }
    return strings;
}

}  // namespace

ObjectPath classPath(const std::string& className) {
    return testsupport::objectPath(nameSpace, className);
}

ObjectPath keyedPath(const std::string& className, const std::string& instanceId) {
    return testsupport::objectPath(nameSpace, className,
                                   {testsupport::named("InstanceID", testsupport::text(instanceId))});
}

ObjectPath computerPath(const std::string& name) {
    return testsupport::objectPath(nameSpace, "VELKO_ComputerSystem",
                                   {testsupport::named("Name", testsupport::text(name))});
}

Instance clientInstance(const ObjectPath& path, std::vector<NamedValue> properties) {
    return testsupport::instance(path, std::move(properties));
}

std::vector<std::string> identifiersOf(const std::vector<ObjectPath>& paths) {
    std::vector<std::string> identifiers;
    for (const ObjectPath& path : paths) {
        identifiers.push_back(identifierOf(path.keys));
    }
    return identifiers;
}

std::vector<std::string> identifiersOf(const std::vector<Instance>& instances) {
    std::vector<std::string> identifiers;
    for (const Instance& instance : instances) {
        identifiers.push_back(identifierOf(instance.properties));
    }
    return identifiers;
}

std::vector<std::string> shown(const std::vector<NamedValue>& values) {
    std::vector<std::string> strings;
    for (const NamedValue& each : values) {
        strings.push_back(each.name.string() + "=" + cimhost::formatMof(each.value));
    }
    return strings;
}

std::vector<LogRecord> logOf(const std::string& channel) {
    std::vector<LogRecord> records = agentEnvironment::log();
    const auto other = [&](const LogRecord& record) { return record.channel != channel; };
    records.erase(std::remove_if(records.begin(), records.end(), other), records.end());
    return records;
}

std::vector<std::string> loggedFailures(const std::string& channel) {
    return failures(channel, [](const LogRecord&) { return true; });
}

std::vector<std::string> caughtFailures() {
    return failures("log", [](const LogRecord& record) { return record.file == entryPointsFile; });
}

testing::Matcher<const Outcome&> isOk(int doneCount) {
    return AllOf(Field("rc", &Outcome::rc, CMPI_RC_OK), Field("hasMessage", &Outcome::hasMessage, false),
                 Field("threw", &Outcome::threw, false), Field("doneCount", &Outcome::doneCount, doneCount));
}

testing::Matcher<const Outcome&> isRefused(CMPIrc rc) {
    return AllOf(Field("rc", &Outcome::rc, rc), Field("hasMessage", &Outcome::hasMessage, false),
                 Field("threw", &Outcome::threw, false), Field("events", &Outcome::events, IsEmpty()));
}

ProviderTest::ProviderTest() {
    agentEnvironment::clear();
}

ProviderTest::~ProviderTest() {
    unload();
    agentEnvironment::clear();
}

testsupport::ProviderLibrary& ProviderTest::provider() {
    if (library == nullptr) {
        library = std::make_unique<testsupport::ProviderLibrary>(testsupport::underTest(PROVIDER_LIBRARY), providerName,
                                                                 broker);
    }
    return *library;
}

void ProviderTest::unload() {
    library.reset();
    EXPECT_FALSE(isLoaded()) << "the library stays in the process";
}

bool ProviderTest::isLoaded() {
    void* handle = dlopen(testsupport::underTest(PROVIDER_LIBRARY).c_str(), RTLD_LAZY | RTLD_NOLOAD);
    if (handle != nullptr) {
        dlclose(handle);
    }
    return handle != nullptr;
}

fs::path ProviderTest::dataFile(const std::string& name) {
    return agentEnvironment::dataDirectory() / name;
}

void ProviderTest::writeData(const std::string& name, const std::string& content) {
    testsupport::writeFile(dataFile(name), content);
}

std::optional<std::string> ProviderTest::readData(const std::string& name) {
    if (!fs::exists(dataFile(name))) {
        return std::nullopt;
    }
    return testsupport::readFile(dataFile(name));
}

void ProviderTest::blockData(const std::string& name) {
    fs::remove_all(dataFile(name));
    fs::create_directory(dataFile(name));
}

void ProviderTest::freeData(const std::string& name) {
    fs::remove_all(dataFile(name));
}

}  // namespace contract
