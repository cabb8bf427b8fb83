#include "broker/NamedValues.h"

#include <array>
#include <utility>

#include "broker/Convert.h"
#include "broker/ErrorTranslation.h"

namespace cimhost {
namespace {

/**
 * The name of a new value at a position. The objects that a thread creates usually have the same names in the same
 * order. For each of the first positions, the thread keeps the last name, and its copies share the characters.
 */
Name nameAt(std::size_t position, std::string_view name) {
    thread_local std::array<Name, 32> kept;
    if (position >= kept.size()) {
        return std::string(name);
    }
    if (kept[position] != name) {
        kept[position] = std::string(name);
    }
    return kept[position];
}

}  // namespace

void setNamed(std::vector<NamedValue>& values, std::string_view name, Value&& value) {
    if (NamedValue* found = findNamed(values, name)) {
        found->value = std::move(value);
    } else {
        values.emplace_back(nameAt(values.size(), name), std::move(value));
    }
}

CMPIData namedData(const std::vector<NamedValue>& values, const char* name, Arena& arena) {
    const NamedValue* found = findNamed(values, argument(name));
    if (found == nullptr) {
        throw Failure(CMPI_RC_ERR_NO_SUCH_PROPERTY);
    }
    return dataFrom(found->value, arena);
}

CMPIData namedDataAt(const std::vector<NamedValue>& values, CMPICount index, CMPIString** name, Arena& arena) {
    if (index >= values.size()) {
        throw Failure(CMPI_RC_ERR_NO_SUCH_PROPERTY);
    }
    const NamedValue& found = values[index];
    const CMPIData data = dataFrom(found.value, arena);
    if (name != nullptr) {
        *name = arena.make<CMPIString>(found.name);
    }
    return data;
}

}  // namespace cimhost
