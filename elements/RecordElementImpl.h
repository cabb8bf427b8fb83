#pragma once

// Definitions of RecordElement. Included by the source file of each element and nowhere else, so that
// each element's code and trace buffers stand in its own unit.

#include "Exceptions.h"
#include "RecordElement.h"

#include <algorithm>

namespace KO::LeaseWarrantyProvider {

template <class Policy>
RecordElement<Policy>::RecordElement() {
    const Traced traced(at(Policy::unit, Level::flow, Policy::texts.name));
}

template <class Policy>
RecordElement<Policy>::~RecordElement() noexcept(false) {
    const Traced traced(at(Policy::unit, Level::flow, Policy::texts.destructorName));
}

template <class Policy>
RecordElement<Policy>::operator bool() {
    const Traced traced(at(Policy::unit));
    return base;
}

template <class Policy>
void RecordElement<Policy>::operator++() {
    const Traced traced(at(Policy::unit));
    do {
        ++base;
    } while (filterSet && base && !evaluate());
}

template <class Policy>
void RecordElement<Policy>::setFilter(FilterType type, std::string reference) {
    const Traced traced(at(Policy::unit), label::filterType, type, label::reference, reference);
    filterSet = true;
    filters.push_back({type, reference});
    while (base && !evaluate()) {
        ++base;
    }
}

template <class Policy>
bool RecordElement<Policy>::evaluate() const {
    const Traced traced(at(Policy::unit));
    const auto passes = [&](const Filter& filter) {
        if (filter.type != InstanceIDFilter) {
            return true;
        }
        std::string identifier;
        if (!base.getProperty(Property::InstanceID, identifier)) {
            fail<InstrumentationException>(at(Policy::unit, Level::flow, "evaluate"), Policy::texts.identifierMissing);
        }
        return identifier == filter.reference;
    };
    return std::all_of(filters.begin(), filters.end(), passes);
}

template <class Policy>
bool RecordElement<Policy>::getElementName(std::string& value) const {
    const Traced traced(at(Policy::unit));
    value = Policy::texts.elementName;
    return true;
}

namespace {

/** The body of the getters of what no record has. */
bool notAvailable(const CallSite& site) {
    const Traced traced(site);
    return false;
}

}  // namespace

template <class Policy>
bool RecordElement<Policy>::getCaption(std::string&) const {
    return notAvailable(at(Policy::unit));
}

template <class Policy>
bool RecordElement<Policy>::getDescription(std::string&) const {
    return notAvailable(at(Policy::unit));
}

template <class Policy>
bool RecordElement<Policy>::getConfigurationName(std::string&) const {
    return notAvailable(at(Policy::unit));
}

template <class Policy>
bool RecordElement<Policy>::getChangeableType(unsigned short&) const {
    return notAvailable(at(Policy::unit));
}

template <class Policy>
bool RecordElement<Policy>::getInstanceID(std::string& value) const {
    return get(at(Policy::unit), Property::InstanceID, value);
}

template <class Policy>
bool RecordElement<Policy>::create(std::string instanceId) {
    const Traced traced(at(Policy::unit, Level::flow, Policy::texts.createName), label::instanceId, instanceId);
    return base.create(instanceId);
}

template <class Policy>
void RecordElement<Policy>::remove() {
    const CallSite site = at(Policy::unit, Level::flow, Policy::texts.removeName);
    const Traced traced(site);
    if (!filterSet) {
        fail<InstrumentationException>(here(site), Policy::texts.removeUnfiltered);
    }
    base.remove();
}

template <class Policy>
template <class Value>
bool RecordElement<Policy>::get(const CallSite& site, Property property, Value& value) const {
    const Traced traced(site);
    return base.getProperty(property, value);
}

template <class Policy>
template <class Value>
void RecordElement<Policy>::set(const CallSite& site, Property property, const Value& value) {
    const Traced traced(site);
    base.setProperty(property, value);
}

}  // namespace KO::LeaseWarrantyProvider
