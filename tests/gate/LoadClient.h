#pragma once

#include <map>

#include "ManagedGate.h"
#include "support/RecordModel.h"

namespace gatetest {

/** A class of records under load. */
struct LoadedKind {
    const char* className;
    const char* setting;
    const char* file;
    const testsupport::ModelFields& fields;
};

/** Returns the classes of leases and warranties. */
const std::vector<LoadedKind>& loadedKinds();

/**
 * Returns the asset properties that clients change. Each client changes the property whose index is the client's
 * number.
 */
const std::vector<const char*>& loadedAssetProperties();

/** Expected records and asset data, according to the responses to a client. */
struct ExpectedState {
    using Records = std::map<std::string, testsupport::ModelRecord>;  ///< by identifier

    std::map<std::string, Records> records;    ///< by class
    std::map<std::string, std::string> asset;  ///< by property
};

/** Returns a record with values in all fields, derived from the number. */
testsupport::ModelRecord filledRecord(const LoadedKind& kind, const std::string& id, int number);

/** Returns the properties of a record, as a client sends them. */
std::vector<NamedValue> propertiesOf(const LoadedKind& kind, const testsupport::ModelRecord& record);

/**
 * One of the concurrent clients of a gate with two computers, the first of which has a lease and a warranty. It
 * creates, reads, changes, enumerates and deletes records, and follows associations. Client 0 also creates and deletes
 * a lease and a warranty of the second computer. Failures are collected in `problems`, since only the main thread may
 * fail the test.
 */
class LoadClient {
public:
    /** @param itsNumber number of the client, from 0 */
    LoadClient(ManagedGate& itsGate, int itsNumber) : gate(itsGate), number(itsNumber) {}

    /** Runs requests about each class. @param round from 0; odd rounds delete the client's own records */
    void work(int round);

    ExpectedState expected;
    std::vector<std::string> problems;

private:
    void workOn(const LoadedKind& kind, int round);
    void expect(bool holds, const std::string& what, const cimhost::Status& status = {});
    void create(const LoadedKind& kind, const std::string& id, int value, bool isShared);
    void read(const LoadedKind& kind, const std::string& id);
    void modify(const LoadedKind& kind, const std::string& id, int value);
    void remove(const LoadedKind& kind, const std::string& id);
    void enumerate(const LoadedKind& kind);
    void associate(const LoadedKind& kind);
    void move(const LoadedKind& kind, int round);
    void expectRecordsOf(const LoadedKind& kind, const char* computer, const std::vector<std::string>& identifiers);
    void expectComputer(const LoadedKind& kind, const char* identifier, const std::string& computer);
    void changeAsset(int round);

    ManagedGate& gate;
    int number;
};

}  // namespace gatetest
