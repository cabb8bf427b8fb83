#include "framework/CmpiValue.h"

#include <limits>

namespace KO {

namespace {

bool isPresent(const CMPIData& data, const CMPIStatus& status, CMPIType type) {
    return status.rc == CMPI_RC_OK && cim::hasValue(data) && data.type == type;
}

struct Integer {
    CMPIUint64 distance;  ///< from zero
    bool negative;

    std::string text() const { return (negative ? "-" : "") + std::to_string(distance); }
};

Integer integer(long long number) {
    const auto bits = static_cast<CMPIUint64>(number);
    return number < 0 ? Integer{0 - bits, true} : Integer{bits, false};
}

std::optional<Integer> integerOf(const CMPIData& data, const CMPIStatus& status) {
    if (!isPresent(data, status, data.type)) {
        return std::nullopt;
    }
    switch (data.type) {
        case CMPI_uint8:
            return Integer{data.value.uint8, false};
        case CMPI_uint16:
            return Integer{data.value.uint16, false};
        case CMPI_uint32:
            return Integer{data.value.uint32, false};
        case CMPI_uint64:
            return Integer{data.value.uint64, false};
        case CMPI_sint8:
            return integer(data.value.sint8);
        case CMPI_sint16:
            return integer(data.value.sint16);
        case CMPI_sint32:
            return integer(data.value.sint32);
        case CMPI_sint64:
            return integer(data.value.sint64);
        default:
            return std::nullopt;
    }
}

}  // namespace

std::optional<std::string> textOf(const CMPIData& data, const CMPIStatus& status) {
    if (isPresent(data, status, CMPI_chars) && data.value.chars != nullptr) {
        return data.value.chars;
    }
    return isPresent(data, status, CMPI_string) ? cim::charactersOf(data.value.string) : std::nullopt;
}

std::optional<std::string> dateTimeTextOf(const CMPIData& data, const CMPIStatus& status) {
    if (!isPresent(data, status, CMPI_dateTime)) {
        return std::nullopt;
    }
    return cim::charactersOf(cim::ask<&CMPIDateTimeFT::getStringFormat>(data.value.dateTime).value);
}

std::optional<unsigned int> numberOf(const CMPIData& data, const CMPIStatus& status) {
    const std::optional<Integer> number = integerOf(data, status);
    if (!number || number->negative || number->distance > std::numeric_limits<unsigned int>::max()) {
        return std::nullopt;
    }
    return static_cast<unsigned int>(number->distance);
}

std::optional<bool> flagOf(const CMPIData& data, const CMPIStatus& status) {
    return isPresent(data, status, CMPI_boolean) ? std::optional<bool>(data.value.boolean != 0) : std::nullopt;
}

std::optional<std::string> keyTextOf(const CMPIData& data, const CMPIStatus& status) {
    if (const std::optional<Integer> number = integerOf(data, status)) {
        return number->text();
    }
    if (const std::optional<bool> flag = flagOf(data, status)) {
        return *flag ? "true" : "false";
    }
    return textOf(data, status);
}

CMPIObjectPath* referenceOf(const CMPIData& data, const CMPIStatus& status) {
    return isPresent(data, status, CMPI_ref) ? data.value.ref : nullptr;
}

}  // namespace KO
