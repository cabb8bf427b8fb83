#pragma once

#include "Differences.h"
#include "gate/session/ProviderSession.h"

#include <cstddef>
#include <functional>
#include <optional>
#include <string>

namespace gate {

/**
 * A change of one instance, which is stored completely or rolled back. The provider reports success in either case, so
 * the change is committed only after checks of the instance and of the data file; see runOrRollBack().
 *
 * All functions fail with CMPI_RC_ERR_FAILED if the change cannot be stored.
 */
class Transaction {
public:
    Transaction(ProviderSession& itsSession, const Class& itsClass, const DataFile& itsFile,
                const LocalObjectPath& itsPath);

    /**
     * Creates a record with these values.
     * @param returnPath returns the record's path to the client; if it throws, the record is removed
     */
    void create(const Values& given, const std::function<void()>& returnPath);

    /** Changes these values of the current instance. */
    void modify(const CMPIInstance* current, const Values& changes);

    /** Deletes the record, which is the current instance. */
    void remove(const CMPIInstance* current);

private:
    template <class Change, class RollBack>
    void runOrRollBack(Change change, RollBack rollBack) const;
    std::string damageNote() const;

    void apply(const CMPIInstance* current, const Values& changes, const FileState& before);
    bool recreate(const Values& values);

    void requireRecord(const FileState& state) const;
    void requireReadOnlyValues(const Values& given) const;
    bool hasCount(std::optional<std::size_t> before) const;
    bool isRolledBack(const FileState& before, const FileState& failed) const;

    ProviderSession& session;
    const Class& owner;
    const DataFile& file;
    const LocalObjectPath& path;
    const std::string identifier;  ///< of a record; empty otherwise
};

}  // namespace gate
