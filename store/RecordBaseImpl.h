#pragma once

// Definitions of RecordBase, RecordCache and RecordTrace. Included only by the source file of each store, so that its
// code and trace buffers belong to that translation unit.

#include <algorithm>
#include <exception>
#include <new>

#include "KO/Exceptions.h"
#include "RecordBase.h"
#include "RecordTable.h"

namespace KO::LeaseWarrantyProvider {

namespace {
constexpr const char* wrongTypeOrProperty = "Incorrect Type or Property";
constexpr const char* wrongTypeOrPropertyOfNumber = "Incorrect Type or Property.";
constexpr const char* wrongTypeOrReadOnly = "Incorrect Type or Property or Property is read-Only.";
constexpr const char* recordsExceedMemory = "The records of the file do not fit into memory.";
}  // namespace

template <class Traits>
RecordTrace<Traits>::RecordTrace() {
    const Traced traced(at(Traits::traceSource, Level::flow, Traits::names.unitName));
}

template <class Traits>
RecordTrace<Traits>::RecordTrace(const std::string& instanceId) {
    const Traced traced(at(Traits::traceSource, Level::flow, Traits::names.unitName), label::instanceId, instanceId);
}

template <class Traits>
RecordTrace<Traits>::RecordTrace(const RecordTrace& instance) {
    const Traced traced(at(Traits::traceSource, Level::flow, Traits::names.unitName), label::instance, &instance);
}

template <class Traits>
RecordTrace<Traits>& RecordTrace<Traits>::operator=(const RecordTrace& instance) {
    const Traced traced(at(Traits::traceSource), label::instance, &instance);
    return *this;
}

template <class Traits>
RecordCache<Traits>::RecordCache() noexcept {
    const Traced traced(at(Traits::traceSource, Level::flow, Traits::names.cacheName));
    try {
        loadRecords(dataFilePath(Traits::names.fileName), this->count(), table, Traits::fields);
        index.update(table);
    } catch (const std::bad_alloc&) {
        abandonLoading(at(Traits::traceSource, Level::error, Traits::names.cacheName), recordsExceedMemory);
    } catch (const std::exception& failure) {
        abandonLoading(at(Traits::traceSource, Level::error, Traits::names.cacheName), failure.what());
    }
}

template <class Traits>
void RecordCache<Traits>::abandonLoading(const CallSite& site, const char* reason) noexcept {
    this->count() = 0;
    std::vector<typename Traits::Unit>().swap(table);
    traceMessage(site, reason);
}

template <class Traits>
RecordCache<Traits>::~RecordCache() {
    const Traced traced(at(Traits::traceSource, Level::flow, Traits::names.cacheDestructorName));
}

template <class Traits>
void RecordCache<Traits>::flushCache() {
    const Traced traced(at(Traits::traceSource));
    traceVariable(at(Traits::traceSource), Traits::names.countName, this->count());
    if (!writeRecords(dataFilePath(Traits::names.fileName), this->count(), table)) {
        fail<InstrumentationException>(at(Traits::traceSource), Traits::names.fileCannotBeOpened);
    }
}

template <class Traits>
RecordBase<Traits>::RecordBase() {
    const Traced traced(at(Traits::traceSource, Level::flow, Traits::names.baseName));
    traceVariable(at(Traits::traceSource, Level::flow, Traits::names.baseName), Traits::names.countName, cache.count());
    if (cache.count() == 0) {
        return;
    }
    skipTo(0);
    if (cursor == end) {
        fail<InstrumentationException>(at(Traits::traceSource, Level::flow, Traits::names.baseName),
                                       Traits::names.noRecords);
    }
}

template <class Traits>
RecordBase<Traits>::~RecordBase() noexcept(false) {
    const CallSite site = at(Traits::traceSource, Level::flow, Traits::names.baseDestructorName);
    const Traced traced(site);
    traceVariable(here(site), "cacheModified", cacheModified ? 1U : 0U);
    if (cacheModified) {
        rewrite(site);
    }
}

template <class Traits>
void RecordBase<Traits>::skipTo(std::size_t index) {
    const auto& table = cache.table;
    const auto inUse = [](const Unit& unit) { return unit.inUse; };
    const auto from = table.begin() + static_cast<std::ptrdiff_t>(std::min(index, table.size()));
    const auto found = std::find_if(from, table.end(), inUse);
    cursor = found == table.end() ? end : static_cast<std::size_t>(found - table.begin());
}

template <class Traits>
void RecordBase<Traits>::rewrite(const CallSite& site) {
    try {
        cache.flushCache();
        cacheModified = false;
    } catch (const std::exception& failure) {
        if (std::uncaught_exceptions() == exceptionsBefore) {
            throw;
        }
        traceMessage(at(*site.source, Level::error, site.function), failure.what());
    }
}

template <class Traits>
RecordBase<Traits>::operator bool() {
    const Traced traced(at(Traits::traceSource));
    if (cursor != end) {
        skipTo(cursor);
    }
    return cursor != end;
}

template <class Traits>
void RecordBase<Traits>::operator++() {
    const Traced traced(at(Traits::traceSource));
    if (cursor != end) {
        skipTo(cursor + 1);
    }
}

template <class Traits>
void RecordBase<Traits>::select(const std::string& instanceId) {
    const Traced traced(at(Traits::traceSource, Level::flow, Traits::names.selectName), label::instanceId, instanceId);
    skipTo(instanceId);
}

template <class Traits>
void RecordBase<Traits>::skipTo(const std::string& instanceId) {
    if (cursor != end) {
        cursor = cache.index.find(cache.table, instanceId, cursor);
    }
}

template <class Traits>
bool RecordBase<Traits>::isTraced() const {
    return isWanted(at(Traits::traceSource));
}

template <class Traits>
bool RecordBase<Traits>::create(const std::string& instanceId) {
    const CallSite site = at(Traits::traceSource, Level::flow, Traits::names.createName);
    const Traced traced(site, label::instanceId, instanceId);
    if (cache.index.find(cache.table, instanceId, 0) != cache.index.none) {
        fail<InstrumentationException>(here(site), Traits::names.identifierExists);
    }
    const bool wasAtRecord = cursor != end;
    cache.table.push_back(Unit(instanceId));
    cache.index.update(cache.table);
    ++cache.count();
    cacheModified = true;
    cursor = 0;
    if (wasAtRecord) {
        select(instanceId);
    }
    return true;
}

template <class Traits>
void RecordBase<Traits>::remove() {
    const CallSite site = at(Traits::traceSource, Level::flow, Traits::names.removeName);
    const Traced traced(site);
    requireCurrent(here(site));
    // The cursor stays at a deleted record; do not decrement the count for it again.
    cache.count() -= cache.table[cursor].inUse ? 1U : 0U;
    cache.table[cursor].inUse = false;
    traceVariable(here(site), Traits::names.countName, cache.count());
    cacheModified = true;
}

template <class Traits>
void RecordBase<Traits>::requireCurrent(const CallSite& site) const {
    if (cursor == end) {
        fail<InstrumentationException>(site, Traits::names.notAvailable);
    }
}

/** Returns the member of a property; null if the property has another type or, for writing, is read-only. */
template <class Traits>
template <class Value>
Value RecordBase<Traits>::Unit::*RecordBase<Traits>::memberOf(Property property, bool forWriting) {
    for (const auto& field : Traits::fields) {
        if (field.property == property) {
            const auto* member = std::get_if<Value Unit::*>(&field.member);
            return member != nullptr && (!forWriting || writable(field)) ? *member : nullptr;
        }
    }
    return nullptr;
}

template <class Traits>
template <class Value>
bool RecordBase<Traits>::get(const CallSite& site, Property property, Value& value) const {
    const Traced traced(site, label::property, property, label::value, value);
    requireCurrent(site);
    const auto member = memberOf<Value>(property, false);
    if (member == nullptr) {
        fail<InstrumentationException>(site, wrongTypeOrProperty);
    }
    value = cache.table[cursor].*member;
    return true;
}

template <class Traits>
template <class Value>
void RecordBase<Traits>::set(const CallSite& site, Property property, const Value& value, const char* wrongType) {
    const Traced traced(site, label::property, property, label::value, value);
    requireCurrent(site);
    const auto member = memberOf<Value>(property, true);
    if (member == nullptr) {
        fail<InstrumentationException>(site, wrongType);
    }
    cache.table[cursor].*member = value;
    cacheModified = true;
}

template <class Traits>
bool RecordBase<Traits>::getProperty(Property property, std::string& value) const {
    return get(at(Traits::traceSource), property, value);
}

template <class Traits>
bool RecordBase<Traits>::getProperty(Property property, unsigned int& value) const {
    return get(at(Traits::traceSource), property, value);
}

template <class Traits>
void RecordBase<Traits>::setProperty(Property property, std::string value) {
    set(at(Traits::traceSource), property, value, wrongTypeOrReadOnly);
}

template <class Traits>
void RecordBase<Traits>::setProperty(Property property, unsigned int value) {
    set(at(Traits::traceSource), property, value, wrongTypeOrPropertyOfNumber);
}

}  // namespace KO::LeaseWarrantyProvider
