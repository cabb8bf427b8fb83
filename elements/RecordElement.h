#pragma once

#include <string>
#include <vector>

#include "FixedString.h"
#include "Trace.h"

namespace KO::LeaseWarrantyProvider {

/** The names in the log and the messages of a record element, derived from its class name ("Lease"). */
struct RecordElementNames {
    explicit constexpr RecordElementNames(const char* className)
        : name{className},
          destructorName{"~", className},
          createName{"create", className},
          removeName{"remove", className},
          elementName{className, " Information"},
          removeUnfiltered{"Identify a ", className, " to remove."},
          identifierMissing{"Could not find Instance ID property on ", className, "."} {}

    FixedString name;
    FixedString destructorName;
    FixedString createName;
    FixedString removeName;
    FixedString elementName;        ///< value of the ElementName property
    FixedString removeUnfiltered;   ///< thrown if a record is removed without a filter
    FixedString identifierMissing;  ///< thrown if the current record has no identifier
};

/**
 * A cursor over the records of a store in table order, restricted by filters. Base of Lease and Warranty.
 *
 * An element belongs to one request. It starts at the first record; only setFilter() and operator++ apply the filters.
 * Changes are visible to all elements at once. The destructor of an element that changed anything rewrites the file.
 *
 * Traits defines:
 *   Base               the record cursor
 *   traceSource, names trace source and RecordElementNames of the element
 */
template <class Traits>
class RecordElement {
public:
    /** Property that a filter compares. Filters with other values of this type match every record. */
    enum FilterType : int {
        InstanceIDFilter = 0,  ///< the identifier, byte for byte
    };

    /** A condition on records. */
    struct Filter {
        FilterType type;
        std::string reference;  ///< the required value
    };

    /** Starts at the first record in use. Throws InstrumentationException if the constructor of the base does. */
    RecordElement();

    /** Rewrites the file if this element changed anything. Throws InstrumentationException if that fails. */
    ~RecordElement() noexcept(false);
    RecordElement(const RecordElement&) = delete;
    RecordElement& operator=(const RecordElement&) = delete;

    /** Returns whether there is a current record. */
    operator bool();

    /** Moves to the next record that passes the filters, or to the end. */
    void operator++();

    /** Adds a filter. Moves to the first record that passes all filters, starting at the current one, or to the end. */
    void setFilter(FilterType type, std::string reference);

    /**
     * Returns whether the current record passes all filters. Throws InstrumentationException if there is no current
     * record and a filter compares the identifier.
     */
    bool evaluate() const;

    /** Creates a record and returns true. Throws InstrumentationException if a record in use has the identifier. */
    bool create(std::string instanceId);

    /** Removes the current record. Throws InstrumentationException if no filter was set or the cursor is at the end. */
    void remove();

    /** @name Properties with the same value for every record
     * A getter returns false and leaves its argument unchanged if records do not have the property.
     */
    ///@{
    bool getElementName(std::string& value) const;
    bool getCaption(std::string& value) const;
    bool getDescription(std::string& value) const;
    bool getConfigurationName(std::string& value) const;
    bool getChangeableType(unsigned short& value) const;
    ///@}

    /** Reads the current record's identifier. Throws InstrumentationException if there is no current record. */
    bool getInstanceID(std::string& value) const;

protected:
    using Property = typename Traits::Base::Property;

    /** Reads or writes a property of the current record. Traced under the name of the calling operation. */
    template <class Value>
    bool get(const CallSite& site, Property property, Value& value) const;
    template <class Value>
    void set(const CallSite& site, Property property, const Value& value);

    /**
     * Moves to the first record that passes all filters, starting at the current one. Traces each record on the way. If
     * tracing is off, uses the index of identifiers instead.
     */
    void skipToPassing();

    bool filterSet = false;
    std::vector<Filter> filters{};
    typename Traits::Base base{};
};

}  // namespace KO::LeaseWarrantyProvider
