#pragma once

#include <filesystem>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Faults.h"
#include "support/Files.h"
#include "support/Outcome.h"
#include "support/ProviderLibrary.h"
#include "support/RecordingBroker.h"
#include "support/TemporaryDirectory.h"

namespace faults {

constexpr const char* leaseFile = "Lease.dat";
constexpr const char* warrantyFile = "Warranty.dat";
constexpr const char* assetFile = "asset.dat";

/** Arguments of a request, created before faults are injected. */
struct Arguments {
    CMPIInstanceMI* instances;
    CMPIAssociationMI* associations;
    const CMPIContext* context;
    const CMPIResult* result;
    const CMPIObjectPath* path;
    const CMPIInstance* instance;
};

/** A request for the provider. */
struct RequestCase {
    const char* name;
    cimhost::ObjectPath path;
    cimhost::Instance instance;
    CMPIStatus (*call)(const Arguments& with);
    const char* changes = nullptr;  ///< the data file that the request changes; null if it only reads
};

std::ostream& operator<<(std::ostream& stream, const RequestCase& request);

/** Result of a request. */
struct ObservedResponse {
    testsupport::Outcome outcome;
    Counts counts;
    int leakedDescriptors = 0;  ///< file descriptors that the request left open
};

/** Properties of a class's instances, one per line. */
using Lines = std::vector<std::string>;

/** Contents of the files in the data directory, by name. */
using FileContents = std::map<std::string, std::string>;

/**
 * An agent with a data directory, and a library of the project in this process: the provider or the gate. The agent has
 * one computer with a lease, a warranty and asset data. The computer's lease and warranty are the second records, so
 * that a library that ignores the key accesses the wrong one.
 */
class TestEnvironment {
public:
    enum class Library { provider, gate };

    explicit TestEnvironment(Library itsLibrary = Library::provider);
    ~TestEnvironment();

    /** Unloads the library and restores the initial data files. */
    void restart();

    /** Unloads the library and writes these data files. */
    void restart(const FileContents& files);

    enum class System { present, absent };

    /**
     * Writes the agent's configuration, which is read when a library is loaded next.
     * @param log lines of the table [log]; empty for no log
     * @param system whether the instrumentation has a system node
     */
    void configure(const std::string& log, System system = System::present);

    testsupport::ProviderLibrary& library();
    void unload();

    /** Makes a request, optionally with a fault while the provider runs. */
    ObservedResponse ask(const RequestCase& request, const Fault* fault = nullptr);

    /** Returns the current instances of a class without clock values. */
    Lines instancesOf(const std::string& className);

    FileContents files() const;
    const FileContents& filesAtFirst() const { return first; }
    std::filesystem::path directory() const { return folder.path(); }
    std::filesystem::path dataDirectory() const { return folder.path() / "data"; }
    std::filesystem::path configuration() const { return folder.path() / "agent.toml"; }

private:
    testsupport::TemporaryDirectory folder;
    FileContents first;
    testsupport::RecordingBroker broker;
    Library kind;
    std::unique_ptr<testsupport::ProviderLibrary> loaded;
};

/** Returns the file name of the built provider or gate. */
std::string fileOf(TestEnvironment::Library library);

/** @name Requests
 * The table contains every supported operation of every class and some unsupported ones.
 */
///@{
const std::vector<RequestCase>& allRequests();
std::vector<RequestCase> changingRequests();

/** Returns a request of the table; throws std::out_of_range if there is none. */
const RequestCase& requestNamed(const std::string& name);

/**
 * Returns a request that restores the file after a failure: it sets a property of the first record to its current
 * value, or modifies the asset data.
 */
const RequestCase& repairOf(const std::string& dataFile);

/** Returns a change that repairOf() reverts, for libraries that do not write unchanged values. */
const RequestCase& otherChangeOf(const std::string& dataFile);
///@}

/** Returns the class whose instances a data file contains. */
std::string classOf(const std::string& dataFile);

/** Returns a record file with `count` numbered records. The term of a record is its number. */
std::string leaseRecords(int count);
std::string warrantyRecords(int count);

}  // namespace faults
