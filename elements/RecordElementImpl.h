#pragma once

// Definitions of RecordElement. Included only by the source file of each element, so that its code and trace buffers
// belong to that translation unit.

#include <algorithm>

#include "KO/Exceptions.h"
#include "RecordElement.h"

namespace KO::LeaseWarrantyProvider {

template <class Traits>
RecordElement<Traits>::RecordElement() {
    const Traced traced(at(Traits::traceSource, Level::flow, Traits::names.className));
}

template <class Traits>
RecordElement<Traits>::~RecordElement() noexcept(false) {
    const Traced traced(at(Traits::traceSource, Level::flow, Traits::names.destructorName));
}

template <class Traits>
RecordElement<Traits>::operator bool() {
    const Traced traced(at(Traits::traceSource));
    return base;
}

template <class Traits>
void RecordElement<Traits>::operator++() {
    const Traced traced(at(Traits::traceSource));
    ++base;
    if (filterSet) {
        skipToPassing();
    }
}

template <class Traits>
void RecordElement<Traits>::setFilter(FilterType type, std::string reference) {
    const Traced traced(at(Traits::traceSource), label::filterType, type, label::reference, reference);
    filterSet = true;
    filters.push_back({type, reference});
    skipToPassing();
}

template <class Traits>
void RecordElement<Traits>::skipToPassing() {
    const auto comparesIdentifier = [](const Filter& filter) { return filter.type == InstanceIDFilter; };
    const auto filter = std::find_if(filters.begin(), filters.end(), comparesIdentifier);
    const bool isTraced = isWanted(at(Traits::traceSource)) || base.isTraced();
    const auto skip = [&] {
        if (!isTraced && filter != filters.end()) {
            base.skipTo(filter->reference);
        }
    };
    for (skip(); base && !evaluate(); skip()) {
        ++base;
    }
}

template <class Traits>
bool RecordElement<Traits>::evaluate() const {
    const Traced traced(at(Traits::traceSource));
    const auto passes = [&](const Filter& filter) {
        if (filter.type != InstanceIDFilter) {
            return true;
        }
        std::string identifier;
        if (!base.getProperty(Property::InstanceID, identifier)) {
            fail<InstrumentationException>(at(Traits::traceSource, Level::flow, "evaluate"),
                                           Traits::names.identifierMissing);
        }
        return identifier == filter.reference;
    };
    return std::all_of(filters.begin(), filters.end(), passes);
}

template <class Traits>
bool RecordElement<Traits>::getElementName(std::string& value) const {
    const Traced traced(at(Traits::traceSource));
    value = Traits::names.elementName;
    return true;
}

template <class Traits>
bool RecordElement<Traits>::notAvailable(const char* function, unsigned int line) const {
    const Traced traced(at(Traits::traceSource, Level::flow, function, line));
    return false;
}

template <class Traits>
bool RecordElement<Traits>::getInstanceID(std::string& value) const {
    return get(Property::InstanceID, value);
}

template <class Traits>
bool RecordElement<Traits>::create(std::string instanceId) {
    const Traced traced(at(Traits::traceSource, Level::flow, Traits::names.createName), label::instanceId, instanceId);
    return base.create(instanceId);
}

template <class Traits>
void RecordElement<Traits>::remove() {
    const CallSite site = at(Traits::traceSource, Level::flow, Traits::names.removeName);
    const Traced traced(site);
    if (!filterSet) {
        fail<InstrumentationException>(here(site), Traits::names.removeUnfiltered);
    }
    base.remove();
}

template <class Traits>
template <class Value>
bool RecordElement<Traits>::get(Property property, Value& value, const char* function, unsigned int line) const {
    const Traced traced(at(Traits::traceSource, Level::flow, function, line));
    return base.getProperty(property, value);
}

template <class Traits>
template <class Value>
void RecordElement<Traits>::set(Property property, const Value& value, const char* function, unsigned int line) {
    const Traced traced(at(Traits::traceSource, Level::flow, function, line));
    base.setProperty(property, value);
}

}  // namespace KO::LeaseWarrantyProvider
