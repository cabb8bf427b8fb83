#pragma once

#include <cstddef>
#include <functional>
#include <string>

#include "StoredValues.h"
#include "gate/session/ProviderSession.h"

namespace gate {

/**
 * A change of one instance, which is stored completely or rolled back. The provider also reports success if it fails,
 * so the change is committed only after checks of the instance and of the data file.
 *
 * A rollback restores the data file, and the provider is loaded again to read it, because the provider has no operation
 * that restores a deleted record at its position in the file.
 *
 * All functions fail with CMPI_RC_ERR_FAILED if the change cannot be stored.
 */
class Transaction {
public:
    Transaction(ProviderSession& itsSession, const Class& itsClass, const DataFile& itsFile, const LocalObject& itsPath)
        : session(itsSession), requested(itsClass), file(itsFile), path(itsPath) {}

    /**
     * Creates a record with these values. Fails with CMPI_RC_ERR_ALREADY_EXISTS if a record has the identifier.
     * @param returnPath returns the record's path to the client; if it throws, the creation is rolled back
     */
    void create(const std::string& identifier, const Values& given, const std::function<void()>& returnPath);

    /** Changes these values of the current instance. */
    void modify(const CMPIInstance* current, const Values& changes);

    /** Deletes the record. */
    void remove();

private:
    FileState open(std::size_t growth) const;
    template <class Change>
    void run(const FileState& before, Change change) const;
    std::string rollBack(const std::string& restorable) const;

    void apply(const CMPIInstance* current, const Values& changes) const;
    void requireTable() const;
    void storeTable(const CMPIObjectPath* record) const;
    void requireReadOnlyValues(const Values& given) const;

    ProviderSession& session;
    const Class& requested;
    const DataFile& file;
    const LocalObject& path;
};

}  // namespace gate
