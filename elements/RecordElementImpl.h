#pragma once

// Definitions of RecordElement. Included only by the source file of each element, so that its code and trace buffers
// belong to that translation unit.

#include <algorithm>

#include "KO/Exceptions.h"
#include "RecordElement.h"

namespace KO::LeaseWarrantyProvider {

template <class Traits>
RecordElement<Traits>::RecordElement() {
    const Traced traced(at(Traits::traceSource, Level::flow, Traits::names.name));
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

namespace {

/** Implements the getters of properties that no record has. */
bool notAvailable(const CallSite& site) {
    const Traced traced(site);
    return false;
}

}  // namespace

template <class Traits>
bool RecordElement<Traits>::getCaption(std::string&) const {
    return notAvailable(at(Traits::traceSource));
}

template <class Traits>
bool RecordElement<Traits>::getDescription(std::string&) const {
    return notAvailable(at(Traits::traceSource));
}

template <class Traits>
bool RecordElement<Traits>::getConfigurationName(std::string&) const {
    return notAvailable(at(Traits::traceSource));
}

template <class Traits>
bool RecordElement<Traits>::getChangeableType(unsigned short&) const {
    return notAvailable(at(Traits::traceSource));
}

template <class Traits>
bool RecordElement<Traits>::getInstanceID(std::string& value) const {
    return get(at(Traits::traceSource), Property::InstanceID, value);
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
bool RecordElement<Traits>::get(const CallSite& site, Property property, Value& value) const {
    const Traced traced(site);
    return base.getProperty(property, value);
}

template <class Traits>
template <class Value>
void RecordElement<Traits>::set(const CallSite& site, Property property, const Value& value) {
    const Traced traced(site);
    base.setProperty(property, value);
}

}  // namespace KO::LeaseWarrantyProvider
