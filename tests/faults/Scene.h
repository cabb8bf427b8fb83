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

namespace faults {

constexpr const char* leaseFile = "Lease.dat";
constexpr const char* warrantyFile = "Warranty.dat";
constexpr const char* assetFile = "asset.dat";

/** What a request is called with, made for it before faults are armed. */
struct Arguments {
    CMPIInstanceMI* instances;
    CMPIAssociationMI* associations;
    const CMPIContext* context;
    const CMPIResult* result;
    const CMPIObjectPath* path;
    const CMPIInstance* instance;
};

/** One request for the provider. */
struct Request {
    const char* name;
    cimhost::ObjectPath path;
    cimhost::Instance instance;
    CMPIStatus (*call)(const Arguments& with);
    const char* changes = nullptr;  ///< the data file that it changes; null: it only reads
};

std::ostream& operator<<(std::ostream& stream, const Request& request);

/** What came of a request. */
struct Done {
    testsupport::Outcome outcome;
    Counts counts;
    int leftOpen = 0;  ///< how many more files this process had open after it than before
};

/** What clients see of a class's instances, a line a property. */
using Lines = std::vector<std::string>;

/** Contents of the files in the data directory, by name. */
using FileContents = std::map<std::string, std::string>;

/**
 * An agent with a data directory, and a library of the project in this process: the provider, or the gate over it. The
 * agent knows one computer, which has a lease, a warranty and asset data. Its lease and its warranty are the second:
 * who does not look at the key comes upon another one.
 */
class Scene {
public:
    enum class Library { provider, gate };

    explicit Scene(Library itsLibrary = Library::provider);
    ~Scene();

    /** Nothing is loaded, and the data directory is as at the beginning. */
    void restart();

    /** The same with these files in the data directory. */
    void restart(const FileContents& files);

    enum class System { told, untold };

    /**
     * Writes the agent's configuration, which counts from the next loading.
     * @param log the table [log]'s lines, none for no log
     * @param system whether the instrumentation tells of it beside the computer
     */
    void configure(const std::string& log, System system = System::told);

    testsupport::ProviderLibrary& library();
    void unload();

    /** Makes a request, without or with a fault between the first step of the provider and its last. */
    Done ask(const Request& request, const Fault* fault = nullptr);

    /** The instances that a class has now, without what the clock says. */
    Lines instancesOf(const std::string& className);

    FileContents files() const;
    const FileContents& filesAtFirst() const { return first; }
    std::filesystem::path directory() const { return folder.path(); }
    std::filesystem::path dataDirectory() const { return folder.path() / "data"; }
    std::filesystem::path configuration() const { return folder.path() / "agent.toml"; }

private:
    testsupport::TempDirectory folder;
    FileContents first;
    testsupport::RecordingBroker broker;
    Library kind;
    std::unique_ptr<testsupport::ProviderLibrary> loaded;
};

/** The file of the provider that was built, and what its factories' names begin with; likewise of the gate. */
std::string fileOf(Scene::Library library);

/** @name Requests
 * The table has every operation for every class that serves it, and some that none serves.
 */
///@{
const std::vector<Request>& allRequests();
std::vector<Request> changingRequests();

/** A request of the table; std::out_of_range without one of that name. */
const Request& requestNamed(const std::string& name);

/**
 * What comes after a failure and sets all right: a modification of the first record of a file of records, which gives
 * it the value that it has, or of asset data.
 */
const Request& repairOf(const std::string& dataFile);

/** A change that repairOf() takes back; for those who do not write what is as it was. */
const Request& detourOf(const std::string& dataFile);
///@}

/** The class whose instances a data file keeps. */
std::string classOf(const std::string& dataFile);

/** A file of records: its count, then so many records, told apart by their numbers, which are also their terms. */
std::string leaseRecords(int count);
std::string warrantyRecords(int count);

}  // namespace faults
