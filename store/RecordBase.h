#pragma once

#include "Trace.h"

#include <cstddef>
#include <limits>
#include <string>
#include <vector>

namespace KO::LeaseWarrantyProvider {

/** What differs in the wording of two record stores. */
struct RecordStoreTexts {
    const char* fileName;            ///< name of the record file in the agent's data directory
    const char* countName;           ///< under which the number of records is traced
    const char* noRecords;           ///< thrown when the count tells of records and there are none
    const char* notAvailable;        ///< thrown when no record is current
    const char* identifierExists;    ///< thrown when a record with that identifier exists
    const char* fileCannotBeOpened;  ///< thrown when the record file cannot be rewritten
};

/**
 * A cursor over the process-wide table of one kind of records, with typed property access: the
 * design that LeaseBase and WarrantyBase share. Each has its own table; they share nothing at run
 * time.
 *
 * Changes are in the table at once, seen by every other cursor; the record file is rewritten when a
 * cursor that changed something ends its life. The cursor is an index, so another cursor's append
 * does not disturb it.
 *
 * Policy tells the two apart:
 *   Unit, Property, Cache         record type, property numbers, table type
 *   unit()                        trace unit of the store
 *   texts()                       its RecordStoreTexts
 *   fields()                      its table of RecordField, in file order
 *   cache(), count(), table()     the one table of the process, its record count and its records
 *
 * What a derived class names itself (construction, selection, creation, deletion) it traces itself,
 * under its own name; the protected operations here do that work untraced.
 */
template <class Policy>
class RecordBase {
public:
    using Property = typename Policy::Property;

    RecordBase(const RecordBase&) = delete;
    RecordBase& operator=(const RecordBase&) = delete;

    /** Whether the cursor stands on a record in use. Moves it forward over deleted ones first. */
    operator bool();

    /** Moves to the next record in use, or to the end; at the end it stays. */
    void operator++();

    /** @name Typed property access
     * Copies a property of the current record out, or changes it. The getters answer true.
     * Throws InstrumentationException when no record is current, when the property is of another
     * type, and on setting the identifier. A failure changes nothing.
     */
    ///@{
    bool getProperty(Property property, std::string& value) const;
    bool getProperty(Property property, unsigned int& value) const;
    void setProperty(Property property, std::string value);
    void setProperty(Property property, unsigned int value);
    ///@}

protected:
    /** Stands nowhere; positionFirst() follows. */
    RecordBase() = default;
    ~RecordBase() = default;

    /** Stands on the first record in use; at the end when the count is 0. Throws when it is not and there is none. */
    void positionFirst();

    /**
     * Rewrites the record file if this cursor changed anything. While another exception is leaving,
     * a failure is only logged: the process belongs to the object manager.
     */
    void rewriteIfModified();

    /** Moves forward from the current record to the one with the identifier, or to the end. */
    void select(const std::string& instanceId);

    /**
     * Appends a record and moves the cursor to the start of the table.
     * @return whether the cursor stood on an entry before
     * @throws InstrumentationException when a record in use has the identifier
     */
    bool create(const std::string& instanceId);

    /** Deletes the current record; the cursor stays. Throws when there is none. */
    void remove();

    /** Typed access under the name of the calling operation. */
    template <class Value>
    bool get(const CallSite& site, Property property, Value& value) const;
    template <class Value>
    void set(const CallSite& site, Property property, const Value& value, const char* wrongType);

private:
    using Unit = typename Policy::Unit;
    static constexpr std::size_t end = std::numeric_limits<std::size_t>::max();

    void requireCurrent(const CallSite& site) const;
    void skipTo(std::size_t index);

    template <class Value>
    static Value Unit::*memberOf(Property property, bool forWriting);

    bool cacheModified = false;
    std::size_t cursor = end;
};

/** Loads a store's file into its empty table. Never fails: an unreadable file gives an empty table and count 0. */
template <class Unit>
void loadStore(const RecordStoreTexts& texts, unsigned int& count, std::vector<Unit>& table) noexcept;

/** Rewrites a store's file from its table. Throws InstrumentationException when it cannot be opened. */
template <class Unit>
void flushStore(const CallSite& site, const RecordStoreTexts& texts, unsigned int count,
                const std::vector<Unit>& table);

}  // namespace KO::LeaseWarrantyProvider
