#include "TestEnvironment.h"

#include <unistd.h>

#include <cstdlib>
#include <fstream>

#include "operations/RequestRunner.h"
#include "schema/MofWriter.h"
#include "support/UnderTest.h"
#include "support/Values.h"

namespace faults {

namespace {

namespace fs = std::filesystem;

constexpr int recordsAtFirst = 2;

std::string repeated(int count, std::string (*record)(const std::string& number)) {
    std::string content = std::to_string(count) + "\n";
    for (int number = 1; number <= count; ++number) {
        content += record(std::to_string(number));
    }
    return content;
}

/** The second record belongs to the agent's computer. */
std::string identifierOf(const std::string& kind, const std::string& number) {
    return (number == "2" ? "/system/computer" : kind + "_number_" + number) + "\n";
}

std::string assetContent() {
    std::string content;
    for (const char* key :
         {"AssetNumber", "AssetIdTag", "Name", "Phone", "Position", "Department", "Location", "ZOPMProfile",
          "PersonalizedLabel1", "PersonalizedData1", "PersonalizedLabel2", "PersonalizedData2", "PersonalizedLabel3",
          "PersonalizedData3", "PersonalizedLabel4", "PersonalizedData4", "PersonalizedLabel5", "PersonalizedData5"}) {
        content += std::string("USER.") + key + "=first value of " + key + "\n";
    }
    for (const char* key : {"LastInventoried", "PurchaseDate", "ZOPMUpdateTime"}) {
        content += std::string("USER.") + key + "=20260102030405.000000+000\n";
    }
    return content;
}

/** Keeps a dependency of the libraries under test loaded, since they are loaded and unloaded many times. */
void keepDependenciesLoaded() {
    static void* const kept = dlopen("libsystemd.so.0", RTLD_NOW);
    (void)kept;
}

/** Returns a directory in memory if there is one, since the tests write thousands of files. */
fs::path fastDirectory() {
    constexpr const char* inMemory = "/dev/shm";
    return access(inMemory, W_OK | X_OK) == 0 ? fs::path(inMemory) : fs::temp_directory_path();
}

}  // namespace

std::string leaseRecords(int count) {
    return repeated(count, [](const std::string& number) {
        return identifierOf("lease", number) + "Lessor_with_the_number_" + number + "\n20260101000000.000000+000\n" +
               number + "\n0\n1\n0\n1\n1250.00_EUR_every_month\n1251.00_EUR_every_month\n*\n*\n" + number + "\n";
    });
}

std::string warrantyRecords(int count) {
    return repeated(count, [](const std::string& number) {
        return identifierOf("warranty", number) + "Warrantor_with_the_number_" + number +
               "\n20260202000000.000000+060\n" + number + "\n";
    });
}

std::string fileOf(TestEnvironment::Library library) {
    return testsupport::underTest(library == TestEnvironment::Library::provider ? PROVIDER_LIBRARY : GATE_LIBRARY);
}

TestEnvironment::TestEnvironment(Library itsLibrary)
    : folder(fastDirectory()),
      first{{leaseFile, leaseRecords(recordsAtFirst)},
            {warrantyFile, warrantyRecords(recordsAtFirst)},
            {assetFile, assetContent()}},
      kind(itsLibrary) {
    keepDependenciesLoaded();
    configure({});
    setAbsentDirectory("/var/lib/ostrel/");  // default directory of the agent's configuration
    setenv("OSTREL_CONFIG", configuration().c_str(), 1);
    const cimhost::ObjectPath computer = testsupport::objectPath(
        "root/cimv2", "VELKO_ComputerSystem", {testsupport::named("Name", testsupport::text("testhost"))});
    broker.serve("VELKO_ComputerSystem",
                 {testsupport::instance(computer, {testsupport::named("Name", testsupport::text("testhost"))})});
    restart();
}

TestEnvironment::~TestEnvironment() {
    unload();
    unsetenv("OSTREL_CONFIG");
}

void TestEnvironment::configure(const std::string& log, System system) {
    const std::string systemNode = R"([[instrumentation.node]]
type = 1
path = "/system"
properties = { "36" = "Example Maker", "108" = "testhost" }
)";
    testsupport::writeFile(configuration(), "[directories]\ninstall = \"" + directory().string() +
                                                "/install\"\ndata = \"" + dataDirectory().string() + R"("
[product]
name = "Test Agent"
version = "4.2.0"
build_number = "77"
identifying_number = "ID-1"
vendor = "VEL"
[log]
)" + log + R"(
[instrumentation]
discover = false
)" + (system == System::present ? systemNode : std::string()) +
                                                R"(
[[instrumentation.node]]
type = 40
path = "/system/computer"
properties = { "36" = "Example Maker", "39" = "Model X - Tower", "108" = "testhost" }
)");
}

void TestEnvironment::restart() {
    restart(first);
}

void TestEnvironment::restart(const FileContents& files) {
    unload();
    fs::remove_all(dataDirectory());
    fs::create_directory(dataDirectory());
    for (const auto& [name, content] : files) {
        testsupport::writeFile(dataDirectory() / name, content);
    }
}

testsupport::ProviderLibrary& TestEnvironment::library() {
    if (loaded == nullptr) {
        const char* name = kind == Library::provider ? "LeaseAndWarrantyProvider" : "LeaseAndWarrantyGate";
        loaded = std::make_unique<testsupport::ProviderLibrary>(fileOf(kind), name, broker);
    }
    return *loaded;
}

void TestEnvironment::unload() {
    loaded.reset();
}

ObservedResponse TestEnvironment::ask(const RequestCase& request, const Fault* fault) {
    testsupport::ProviderLibrary& provider = library();
    CMPIInstanceMI* instances = provider.instanceMI();
    CMPIAssociationMI* associations = provider.associationMI();
    ObservedResponse response;
    broker.forget();
    const int openBefore = openDescriptors();
    response.outcome = provider.call([&](auto& scope, const CMPIContext* context, const CMPIResult* result) {
        const Arguments arguments{
            instances, associations, context, result, scope.objectPath(request.path), scope.instance(request.instance)};
        const FaultInjection injection = fault == nullptr ? FaultInjection() : FaultInjection(*fault);
        const CMPIStatus status = request.call(arguments);
        response.counts = injection.counts();
        return status;
    });
    response.leakedDescriptors = openDescriptors() - openBefore;
    return response;
}

Lines TestEnvironment::instancesOf(const std::string& className) {
    const cimhost::ObjectPath path = testsupport::objectPath("root/cimv2", className);
    Lines lines;
    for (const cimhost::Instance& instance : library().enumerateInstances(path).instances()) {
        for (const cimhost::NamedValue& property : instance.properties) {
            if (property.name != "LocalDateTime") {
                lines.push_back(property.name.string() + "=" + cimhost::formatMof(property.value));
            }
        }
    }
    return lines;
}

FileContents TestEnvironment::files() const {
    FileContents contents;
    if (fs::exists(dataDirectory())) {
        for (const auto& entry : fs::directory_iterator(dataDirectory())) {
            contents[entry.path().filename()] = testsupport::readFile(entry.path());
        }
    }
    return contents;
}

}  // namespace faults
