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

/** Leases and warranties. */
const std::vector<LoadedKind>& loadedKinds();

/** The asset properties that clients change: each belongs to the client whose number is its place. */
const std::vector<const char*>& loadedAssetProperties();

/** What somebody was told is there: all fields of records, and asset data. */
struct Told {
    using Records = std::map<std::string, testsupport::ModelRecord>;  ///< by identifier

    std::map<std::string, Records> records;    ///< by class
    std::map<std::string, std::string> asset;  ///< by property
};

/** A record with values in all fields, which depend on the number. */
testsupport::ModelRecord filledRecord(const LoadedKind& kind, const std::string& id, int number);

/** The properties of a record, as a client sends them. */
std::vector<NamedValue> propertiesOf(const LoadedKind& kind, const testsupport::ModelRecord& record);

/**
 * One of many clients of a gate over two computers, the first of which has a lease and a warranty. It creates, reads,
 * changes, enumerates, associates and deletes; client 0 besides gives the second computer a lease and a warranty and
 * takes them away. It notes what goes wrong instead of failing the test, which only the main thread may do.
 */
class LoadClient {
public:
    /** @param itsNumber from 0 */
    LoadClient(ManagedGate& itsGate, int itsNumber) : gate(itsGate), number(itsNumber) {}

    /** A round of requests about each class. @param round from 0; in odd ones its own records go again */
    void work(int round);

    Told told;
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
    void expectBelongings(const LoadedKind& kind, const char* computer, const std::vector<std::string>& identifiers);
    void expectComputer(const LoadedKind& kind, const char* place, const std::string& computer);
    void changeAsset(int round);

    ManagedGate& gate;
    int number;
};

}  // namespace gatetest
