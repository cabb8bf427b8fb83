#pragma once

// Definitions of RecordBase, RecordCache and RecordTrace. Included by the source file of each store and nowhere else,
// so that each store's code and trace buffers stand in its own unit.

#include "Exceptions.h"
#include "RecordBase.h"
#include "RecordTable.h"
#include "RecordTrace.h"

#include <algorithm>
#include <exception>
#include <new>

namespace KO::LeaseWarrantyProvider {

namespace {
constexpr const char* wrongTypeOrProperty = "Incorrect Type or Property";
constexpr const char* wrongTypeOrPropertyOfNumber = "Incorrect Type or Property.";
constexpr const char* wrongTypeOrReadOnly = "Incorrect Type or Property or Property is read-Only.";
constexpr const char* recordsExceedMemory = "The records of the file do not fit into memory.";
}  // namespace

template <class Policy>
RecordTrace<Policy>::RecordTrace() {
    const Traced traced(at(Policy::unit, Level::flow, Policy::texts.unitName));
}

template <class Policy>
RecordTrace<Policy>::RecordTrace(const std::string& instanceId) {
    const Traced traced(at(Policy::unit, Level::flow, Policy::texts.unitName), label::instanceId, instanceId);
}

template <class Policy>
RecordTrace<Policy>::RecordTrace(const RecordTrace& instance) {
    const Traced traced(at(Policy::unit, Level::flow, Policy::texts.unitName), label::instance, &instance);
}

template <class Policy>
RecordTrace<Policy>& RecordTrace<Policy>::operator=(const RecordTrace& instance) {
    const Traced traced(at(Policy::unit), label::instance, &instance);
    return *this;
}

template <class Policy>
RecordCache<Policy>::RecordCache() noexcept {
    const Traced traced(at(Policy::unit, Level::flow, Policy::texts.cacheName));
    try {
        loadRecords(dataFilePath(Policy::texts.fileName), this->count(), table);
    } catch (const std::bad_alloc&) {
        abandonLoading(at(Policy::unit, Level::error, Policy::texts.cacheName), recordsExceedMemory);
    } catch (const std::exception& failure) {
        abandonLoading(at(Policy::unit, Level::error, Policy::texts.cacheName), failure.what());
    }
}

template <class Policy>
void RecordCache<Policy>::abandonLoading(const CallSite& site, const char* reason) noexcept {
    this->count() = 0;
    std::vector<typename Policy::Unit>().swap(table);
    traceMessage(site, reason);
}

template <class Policy>
RecordCache<Policy>::~RecordCache() {
    const Traced traced(at(Policy::unit, Level::flow, Policy::texts.cacheDestructorName));
}

template <class Policy>
void RecordCache<Policy>::flushCache() {
    const Traced traced(at(Policy::unit));
    traceVariable(at(Policy::unit), Policy::texts.countName, this->count());
    if (!writeRecords(dataFilePath(Policy::texts.fileName), this->count(), table)) {
        fail<InstrumentationException>(at(Policy::unit), Policy::texts.fileCannotBeOpened);
    }
}

template <class Policy>
RecordBase<Policy>::RecordBase() {
    const Traced traced(at(Policy::unit, Level::flow, Policy::texts.baseName));
    traceVariable(at(Policy::unit, Level::flow, Policy::texts.baseName), Policy::texts.countName,
                  Policy::cache().count());
    if (Policy::cache().count() == 0) {
        return;
    }
    skipTo(0);
    if (cursor == end) {
        fail<InstrumentationException>(at(Policy::unit, Level::flow, Policy::texts.baseName), Policy::texts.noRecords);
    }
}

template <class Policy>
RecordBase<Policy>::~RecordBase() noexcept(false) {
    const CallSite site = at(Policy::unit, Level::flow, Policy::texts.baseDestructorName);
    const Traced traced(site);
    traceVariable(here(site), "cacheModified", cacheModified ? 1U : 0U);
    if (cacheModified) {
        rewrite(site);
    }
}

template <class Policy>
void RecordBase<Policy>::skipTo(std::size_t index) {
    const auto& table = Policy::cache().table;
    const auto inUse = [](const Unit& unit) { return unit.inUse; };
    const auto from = table.begin() + static_cast<std::ptrdiff_t>(std::min(index, table.size()));
    const auto found = std::find_if(from, table.end(), inUse);
    cursor = found == table.end() ? end : static_cast<std::size_t>(found - table.begin());
}

template <class Policy>
void RecordBase<Policy>::rewrite(const CallSite& site) {
    try {
        Policy::cache().flushCache();
        cacheModified = false;
    } catch (const std::exception& failure) {
        if (std::uncaught_exceptions() == exceptionsBefore) {
            throw;
        }
        traceMessage(at(*site.unit, Level::error, site.function), failure.what());
    }
}

template <class Policy>
RecordBase<Policy>::operator bool() {
    const Traced traced(at(Policy::unit));
    if (cursor != end) {
        skipTo(cursor);
    }
    return cursor != end;
}

template <class Policy>
void RecordBase<Policy>::operator++() {
    const Traced traced(at(Policy::unit));
    if (cursor != end) {
        skipTo(cursor + 1);
    }
}

template <class Policy>
void RecordBase<Policy>::select(const std::string& instanceId) {
    const Traced traced(at(Policy::unit, Level::flow, Policy::texts.selectName), label::instanceId, instanceId);
    const auto& table = Policy::cache().table;
    while (cursor != end && !(table[cursor].inUse && table[cursor].InstanceID == instanceId)) {
        skipTo(cursor + 1);
    }
}

template <class Policy>
bool RecordBase<Policy>::create(const std::string& instanceId) {
    const CallSite site = at(Policy::unit, Level::flow, Policy::texts.createName);
    const Traced traced(site, label::instanceId, instanceId);
    auto& cache = Policy::cache();
    const auto taken = [&](const Unit& unit) { return unit.inUse && unit.InstanceID == instanceId; };
    if (std::any_of(cache.table.begin(), cache.table.end(), taken)) {
        fail<InstrumentationException>(here(site), Policy::texts.identifierExists);
    }
    const bool stoodOnEntry = cursor != end;
    cache.table.push_back(Unit(instanceId));
    ++cache.count();
    cacheModified = true;
    cursor = 0;
    if (stoodOnEntry) {
        select(instanceId);
    }
    return true;
}

template <class Policy>
void RecordBase<Policy>::remove() {
    const CallSite site = at(Policy::unit, Level::flow, Policy::texts.removeName);
    const Traced traced(site);
    requireCurrent(here(site));
    auto& cache = Policy::cache();
    // A record that this cursor, which does not move, has deleted already is not counted down again.
    cache.count() -= cache.table[cursor].inUse ? 1U : 0U;
    cache.table[cursor].inUse = false;
    traceVariable(here(site), Policy::texts.countName, cache.count());
    cacheModified = true;
}

template <class Policy>
void RecordBase<Policy>::requireCurrent(const CallSite& site) const {
    if (cursor == end) {
        fail<InstrumentationException>(site, Policy::texts.notAvailable);
    }
}

/** The member behind a property, null when the property is of another type or, for writing, read-only. */
template <class Policy>
template <class Value>
Value RecordBase<Policy>::Unit::*RecordBase<Policy>::memberOf(Property property, bool forWriting) {
    for (const auto& field : Policy::fields) {
        if (field.property == property) {
            const auto* member = std::get_if<Value Unit::*>(&field.member);
            return member != nullptr && (!forWriting || writable(field)) ? *member : nullptr;
        }
    }
    return nullptr;
}

template <class Policy>
template <class Value>
bool RecordBase<Policy>::get(const CallSite& site, Property property, Value& value) const {
    const Traced traced(site, label::property, property, label::value, value);
    requireCurrent(site);
    const auto member = memberOf<Value>(property, false);
    if (member == nullptr) {
        fail<InstrumentationException>(site, wrongTypeOrProperty);
    }
    value = Policy::cache().table[cursor].*member;
    return true;
}

template <class Policy>
template <class Value>
void RecordBase<Policy>::set(const CallSite& site, Property property, const Value& value, const char* wrongType) {
    const Traced traced(site, label::property, property, label::value, value);
    requireCurrent(site);
    const auto member = memberOf<Value>(property, true);
    if (member == nullptr) {
        fail<InstrumentationException>(site, wrongType);
    }
    Policy::cache().table[cursor].*member = value;
    cacheModified = true;
}

template <class Policy>
bool RecordBase<Policy>::getProperty(Property property, std::string& value) const {
    return get(at(Policy::unit), property, value);
}

template <class Policy>
bool RecordBase<Policy>::getProperty(Property property, unsigned int& value) const {
    return get(at(Policy::unit), property, value);
}

template <class Policy>
void RecordBase<Policy>::setProperty(Property property, std::string value) {
    set(at(Policy::unit), property, value, wrongTypeOrReadOnly);
}

template <class Policy>
void RecordBase<Policy>::setProperty(Property property, unsigned int value) {
    set(at(Policy::unit), property, value, wrongTypeOrPropertyOfNumber);
}

}  // namespace KO::LeaseWarrantyProvider
