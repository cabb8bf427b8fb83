#pragma once

#include "FixedString.h"
#include "Trace.h"

#include <string>
#include <vector>

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
    FixedString removeUnfiltered;   ///< thrown if a record is to be removed and no filter is set
    FixedString identifierMissing;  ///< thrown if the current record has no identifier
};

/**
 * An element over a record store: it walks the records in table order, narrowed by filters, and
 * gives access to the current one. The design that Lease and Warranty share.
 *
 * One is made for a request. It then stands on the first record; only setFilter and operator++ look at
 * the filters. What it changes is seen by all at once, and the record file is rewritten when it ends.
 *
 * Traits gives:
 *   Base               the record cursor
 *   traceSource, names trace source and RecordElementNames of the element
 */
template <class Traits>
class RecordElement {
public:
    /** What a filter compares. Values without a name are kept and match every record. */
    enum FilterType : int {
        InstanceIDFilter = 0,  ///< the identifier, byte for byte
    };

    /** A condition on records. */
    struct Filter {
        FilterType type;
        std::string reference;  ///< the value that the record must have
    };

    /** Stands on the first record. May throw InstrumentationException, as the store does. */
    RecordElement();

    /** Rewrites the file if this element changed anything; that may throw. */
    ~RecordElement() noexcept(false);
    RecordElement(const RecordElement&) = delete;
    RecordElement& operator=(const RecordElement&) = delete;

    /** Whether the element stands on a record. */
    operator bool();

    /** Moves to the next record that passes the filters, or to the end. */
    void operator++();

    /** Adds a filter and moves forward, from the current record on, to the first that passes all. */
    void setFilter(FilterType type, std::string reference);

    /**
     * Whether the current record passes all filters. Throws InstrumentationException when an identifier
     * is to be compared and no record is current.
     */
    bool evaluate() const;

    /** Makes a record. @return true. Throws InstrumentationException when the identifier is taken. */
    bool create(std::string instanceId);

    /** Removes the current record. Throws InstrumentationException when no filter was set, or at the end. */
    void remove();

    /** @name Properties that every record has alike
     * A getter that answers false leaves its argument untouched: the property is to stay unset.
     */
    ///@{
    bool getElementName(std::string& value) const;
    bool getCaption(std::string& value) const;
    bool getDescription(std::string& value) const;
    bool getConfigurationName(std::string& value) const;
    bool getChangeableType(unsigned short& value) const;
    ///@}

    /** The current record's identifier. Throws InstrumentationException when no record is current. */
    bool getInstanceID(std::string& value) const;

protected:
    using Property = typename Traits::Base::Property;

    /** Reads or writes a property of the current record under the name of the calling operation. */
    template <class Value>
    bool get(const CallSite& site, Property property, Value& value) const;
    template <class Value>
    void set(const CallSite& site, Property property, const Value& value);

    bool filterSet = false;
    std::vector<Filter> filters{};
    typename Traits::Base base{};
};

}  // namespace KO::LeaseWarrantyProvider
