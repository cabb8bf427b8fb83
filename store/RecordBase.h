#pragma once

#include <cstddef>
#include <exception>
#include <limits>
#include <string>
#include <vector>

#include "FixedString.h"
#include "IdentifierIndex.h"
#include "RecordStream.h"
#include "Trace.h"

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
    FixedString fileName;            ///< name of the record file in the agent's data directory
    FixedString countName;           ///< name of the record count in the trace
    FixedString noRecords;           ///< thrown if the count is not 0 and no record is in use
    FixedString notAvailable;        ///< thrown if no record is current
    FixedString identifierExists;    ///< thrown if a record in use has the identifier
    FixedString fileCannotBeOpened;  ///< thrown if the record file cannot be rewritten
};

/**
 * Traces construction and copying of records. An empty base of the record types, so that their copy operations can be
 * compiler-generated. Does not trace destruction or moves, such as those of a growing table.
 *
 * Traits is the traits class of the records' store.
 */
template <class Traits>
class RecordTrace {
public:
    RecordTrace();
    explicit RecordTrace(const std::string& instanceId);
    RecordTrace(const RecordTrace& instance);
    RecordTrace& operator=(const RecordTrace& instance);
    RecordTrace(RecordTrace&&) noexcept = default;
    RecordTrace& operator=(RecordTrace&&) noexcept = default;
    ~RecordTrace() = default;
};

/**
 * The table of one kind of records and its file, used as LeaseCache and WarrantyCache. The file is loaded once, with
 * the library, and each request that changes a record rewrites it. The count, whose name depends on the kind, is always
 * the number of records in use.
 */
template <class Traits>
class RecordCache : public Traits::Count {
public:
    /**
     * Loads the file. Never throws: if the file is missing, unreadable or too large, the table is empty and the count
     * 0.
     */
    RecordCache() noexcept;
    /** Frees the table. Does not write the file. */
    ~RecordCache();
    RecordCache(const RecordCache&) = delete;
    RecordCache& operator=(const RecordCache&) = delete;

    /** Rewrites the file from the table. Throws InstrumentationException if the file cannot be opened. */
    void flushCache();

    std::vector<typename Traits::Unit> table{};      ///< in file order, then new records; includes deleted records
    IdentifierIndex<typename Traits::Unit> index{};  ///< of the table

private:
    /** Frees the records read so far and logs the reason. */
    void abandonLoading(const CallSite& site, const char* reason) noexcept;
};

/**
 * A cursor over the process-wide table of one kind of records, with typed property access. Base of LeaseBase and
 * WarrantyBase, which share no data. A cursor belongs to one request.
 *
 * Changes are visible to every other cursor at once. The destructor of a cursor that changed anything rewrites the
 * record file. The cursor is an index, so it stays valid when another cursor appends a record.
 *
 * Traits defines:
 *   Unit, Property     record type and property numbers
 *   Count              base of RecordCache with the record count, which count() returns
 *   traceSource, names trace source and RecordStoreNames of the store
 *   fields             table of the records' RecordField, in file order
 */
template <class Traits>
class RecordBase {
public:
    using Property = typename Traits::Property;

    static RecordCache<Traits> cache;  ///< the process-wide table

    /**
     * Starts at the first record in use, or at the end if the count is 0. Throws InstrumentationException if the count
     * is not 0 and no record is in use.
     */
    RecordBase();

    /**
     * Rewrites the record file if this cursor changed anything. Throws InstrumentationException if that fails. During
     * stack unwinding, the failure is only logged, since a second exception would terminate the object manager.
     */
    ~RecordBase() noexcept(false);
    RecordBase(const RecordBase&) = delete;
    RecordBase& operator=(const RecordBase&) = delete;

    /** Skips deleted records, then returns whether the cursor is at a record in use. */
    operator bool();

    /** Moves to the next record in use, or to the end. Does nothing at the end. */
    void operator++();

    /**
     * Moves to the first record with the identifier, compared byte for byte, starting at the current record. If there
     * is none, moves to the end.
     */
    void select(const std::string& instanceId);

    /** Like select(), but without a trace line. */
    void skipTo(const std::string& instanceId);

    /** Returns whether the current log settings trace the movements of a cursor. */
    bool isTraced() const;

    /**
     * Appends a record with the identifier and default values. Moves a cursor that was at a record to the new one, and
     * a cursor at the end to the first record of the table.
     * @return true
     * @throws InstrumentationException if a record in use has the identifier
     */
    bool create(const std::string& instanceId);

    /**
     * Deletes the current record and does not move the cursor. Throws InstrumentationException if the cursor is at the
     * end.
     */
    void remove();

    /** @name Typed property access
     * Reads or changes a property of the current record, even if that record is deleted. The getters return true.
     * Throws InstrumentationException and changes nothing if the cursor is at the end, if the property has another
     * type, or if a setter is called for the identifier.
     */
    ///@{
    bool getProperty(Property property, std::string& value) const;
    bool getProperty(Property property, unsigned int& value) const;
    void setProperty(Property property, std::string value);
    void setProperty(Property property, unsigned int value);
    ///@}

protected:
    /** Typed access, traced under the name of the calling operation. */
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
    int exceptionsBefore = std::uncaught_exceptions();  ///< exceptions in flight when the cursor was created
};

}  // namespace KO::LeaseWarrantyProvider
