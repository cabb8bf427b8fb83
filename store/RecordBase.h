#pragma once

#include "FixedString.h"
#include "Trace.h"

#include <cstddef>
#include <exception>
#include <limits>
#include <string>
#include <vector>

namespace KO::LeaseWarrantyProvider {

/** The names in the log and the messages of a record store, derived from the kind of its records ("Lease"). */
struct RecordStoreNames {
    explicit constexpr RecordStoreNames(const char* kind)
        : unitName{kind, "Unit"},
          cacheName{kind, "Cache"},
          cacheDestructorName{"~", kind, "Cache"},
          baseName{kind, "Base"},
          baseDestructorName{"~", kind, "Base"},
          selectName{"select", kind},
          createName{"create", kind},
          removeName{"delete", kind},
          fileName{kind, ".dat"},
          countName{"recordCount", kind},
          noRecords{"Zero ", kind, " Records Available"},
          notAvailable{kind, " record not available"},
          identifierExists{kind, " with the supplied instance Id exists."},
          fileCannotBeOpened{"Could not open ", kind, " record."} {}

    FixedString unitName;  ///< the record type
    FixedString cacheName;
    FixedString cacheDestructorName;
    FixedString baseName;
    FixedString baseDestructorName;
    FixedString selectName;
    FixedString createName;
    FixedString removeName;
    FixedString fileName;            ///< of the record file in the agent's data directory
    FixedString countName;           ///< under which the number of records is traced
    FixedString noRecords;           ///< thrown if the count is not 0 and no record is in use
    FixedString notAvailable;        ///< thrown if no record is current
    FixedString identifierExists;    ///< thrown if a record in use has the identifier
    FixedString fileCannotBeOpened;  ///< thrown if the record file cannot be rewritten
};

/**
 * The table of one kind of records and its file: what LeaseCache and WarrantyCache share. It is
 * loaded once, with the library, and written back by whoever changes it. The count, which each kind
 * names in its own way, is always the number of records in use.
 */
template <class Traits>
class RecordCache : public Traits::Count {
public:
    /** Loads the file. Never fails: a file that is absent, unreadable or too large gives an empty table and count 0. */
    RecordCache() noexcept;
    /** Releases the table. The file is not written. */
    ~RecordCache();
    RecordCache(const RecordCache&) = delete;
    RecordCache& operator=(const RecordCache&) = delete;

    /** Rewrites the file from the table. Throws InstrumentationException when it cannot be opened. */
    void flushCache();

    std::vector<typename Traits::Unit> table{};  ///< in file order, new records at the end, deleted ones included

private:
    /** Releases the records read so far and logs the reason. */
    void abandonLoading(const CallSite& site, const char* reason) noexcept;
};

/**
 * A cursor over the process-wide table of one kind of records, with typed property access: the
 * design that LeaseBase and WarrantyBase share. Each has its own table; they share nothing at run
 * time. One cursor belongs to one request.
 *
 * Changes are in the table at once, seen by every other cursor; the record file is rewritten when a
 * cursor that changed something ends its life. The cursor is an index, so another cursor's append
 * does not disturb it.
 *
 * Traits tells the two apart:
 *   Unit, Property     record type and property numbers
 *   Count              base of the table with the record count, to be had from count()
 *   traceSource, names trace source and RecordStoreNames of the store
 *   fields             its table of RecordField, in file order
 *   cache()            the one table of the process
 */
template <class Traits>
class RecordBase {
public:
    using Property = typename Traits::Property;

    /**
     * Stands on the first record in use; at the end when the count is 0. Throws InstrumentationException
     * when the count tells of records and none is in use.
     */
    RecordBase();

    /**
     * Rewrites the record file if this cursor changed anything; that may throw InstrumentationException.
     * While another exception is leaving, a failure is only logged: the process belongs to the object
     * manager.
     */
    ~RecordBase() noexcept(false);
    RecordBase(const RecordBase&) = delete;
    RecordBase& operator=(const RecordBase&) = delete;

    /** Whether the cursor stands on a record in use. Moves it forward over deleted ones first. */
    operator bool();

    /** Moves to the next record in use, or to the end; at the end it stays. */
    void operator++();

    /** Moves forward from the current record to the one with the identifier, byte for byte, or to the end. */
    void select(const std::string& instanceId);

    /**
     * Appends a record with its identifier and default values. A cursor that stood on an entry then
     * stands on the new one, a cursor at the end on the first of the table.
     * @return true
     * @throws InstrumentationException when a record in use has the identifier
     */
    bool create(const std::string& instanceId);

    /** Deletes the current record; the cursor stays. Throws InstrumentationException when it is at the end. */
    void remove();

    /** @name Typed property access
     * Copies a property of the current record out, or changes it. The getters answer true.
     * Throws InstrumentationException when the cursor is at the end, when the property is of another
     * type, and on setting the identifier. A failure changes nothing. Whether the record has been deleted
     * meanwhile is not looked at.
     */
    ///@{
    bool getProperty(Property property, std::string& value) const;
    bool getProperty(Property property, unsigned int& value) const;
    void setProperty(Property property, std::string value);
    void setProperty(Property property, unsigned int value);
    ///@}

protected:
    /** Typed access under the name of the calling operation. */
    template <class Value>
    bool get(const CallSite& site, Property property, Value& value) const;
    template <class Value>
    void set(const CallSite& site, Property property, const Value& value, const char* wrongType);

private:
    using Unit = typename Traits::Unit;
    static constexpr std::size_t end = std::numeric_limits<std::size_t>::max();

    void rewrite(const CallSite& site);
    void requireCurrent(const CallSite& site) const;
    void skipTo(std::size_t index);

    template <class Value>
    static Value Unit::*memberOf(Property property, bool forWriting);

    bool cacheModified = false;
    std::size_t cursor = end;
    int exceptionsBefore = std::uncaught_exceptions();  ///< how many were leaving when this cursor was made
};

}  // namespace KO::LeaseWarrantyProvider
