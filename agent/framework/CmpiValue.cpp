#include "framework/CmpiValue.h"

#include <charconv>
#include <system_error>

namespace KO {

namespace {

bool isPresent(const CMPIData& data, const CMPIStatus& status, CMPIType type) {
    return status.rc == CMPI_RC_OK && cim::hasValue(data) && data.type == type;
}

}  // namespace

std::optional<std::string> textOf(const CMPIData& data, const CMPIStatus& status) {
    const bool isString = isPresent(data, status, CMPI_string) || isPresent(data, status, CMPI_chars);
    return isString ? cim::charactersOf(data) : std::nullopt;
}

std::optional<std::string> dateTimeTextOf(const CMPIData& data, const CMPIStatus& status) {
    return isPresent(data, status, CMPI_dateTime) ? cim::charactersOf(data) : std::nullopt;
}

std::optional<unsigned int> numberOf(const CMPIData& data, const CMPIStatus& status) {
    const auto digits = isPresent(data, status, data.type) ? cim::digitsOf(data) : std::nullopt;
    unsigned int number = 0;
    const bool fits =
        digits && std::from_chars(digits->data(), digits->data() + digits->size(), number).ec == std::errc();
    return fits ? std::optional<unsigned int>(number) : std::nullopt;
}

std::optional<bool> flagOf(const CMPIData& data, const CMPIStatus& status) {
    return isPresent(data, status, CMPI_boolean) ? std::optional<bool>(data.value.boolean != 0) : std::nullopt;
}

std::optional<std::string> keyTextOf(const CMPIData& data, const CMPIStatus& status) {
    const bool isKeyType = data.type != CMPI_dateTime && isPresent(data, status, data.type);
    return isKeyType ? cim::charactersOf(data) : std::nullopt;
}

CMPIObjectPath* referenceOf(const CMPIData& data, const CMPIStatus& status) {
    return isPresent(data, status, CMPI_ref) ? data.value.ref : nullptr;
}

}  // namespace KO
