#include "broker/NamedValues.h"

#include <algorithm>

#include "broker/Convert.h"
#include "broker/ErrorTranslation.h"
#include "cim/Names.h"

namespace cimhost {

const NamedValue* findNamed(const std::vector<NamedValue>& values, std::string_view name) {
    const auto found = std::find_if(values.begin(), values.end(),
                                    [&](const NamedValue& each) { return cim::sameName(each.name, name); });
    return found == values.end() ? nullptr : &*found;
}

void setNamed(std::vector<NamedValue>& values, std::string name, Value value) {
    const auto found = std::find_if(values.begin(), values.end(),
                                    [&](const NamedValue& each) { return cim::sameName(each.name, name); });
    if (found == values.end()) {
        values.push_back({std::move(name), std::move(value)});
    } else {
        found->value = std::move(value);
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
