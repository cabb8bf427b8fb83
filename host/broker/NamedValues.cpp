#include "broker/NamedValues.h"

#include <utility>

#include "broker/Convert.h"
#include "broker/ErrorTranslation.h"

namespace cimhost {

void setNamed(std::vector<NamedValue>& values, std::string_view name, Value&& value) {
    if (NamedValue* found = findNamed(values, name)) {
        found->value = std::move(value);
    } else {
        values.emplace_back(std::string(name), std::move(value));
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
