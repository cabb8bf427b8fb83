#include "lab/emulation/TypeCoercion.h"

#include <algorithm>
#include <limits>
#include <optional>
#include <type_traits>

#include "cim/DateTime.h"
#include "cim/Names.h"
#include "lab/emulation/Emulations.h"

namespace cimhost::lab {
namespace {

template <class Number>
std::optional<Scalar> within(bool isNegative, std::uint64_t size) {
    const auto largest = static_cast<std::uint64_t>(std::numeric_limits<Number>::max());
    if (isNegative) {
        const bool fits = std::is_signed_v<Number> && size <= largest + 1;
        return fits ? std::optional<Scalar>(static_cast<Number>(std::uint64_t{0} - size)) : std::nullopt;
    }
    return size <= largest ? std::optional<Scalar>(static_cast<Number>(size)) : std::nullopt;
}

struct IntegerType {
    CMPIType type;
    std::optional<Scalar> (*make)(bool isNegative, std::uint64_t size);
};

constexpr IntegerType integerTypes[] = {
    {CMPI_uint8, within<std::uint8_t>},   {CMPI_uint16, within<std::uint16_t>}, {CMPI_uint32, within<std::uint32_t>},
    {CMPI_uint64, within<std::uint64_t>}, {CMPI_sint8, within<std::int8_t>},    {CMPI_sint16, within<std::int16_t>},
    {CMPI_sint32, within<std::int32_t>},  {CMPI_sint64, within<std::int64_t>},
};

const IntegerType* integerType(CMPIType type) {
    const auto* const end = std::end(integerTypes);
    const auto* const found =
        std::find_if(std::begin(integerTypes), end, [&](const IntegerType& each) { return each.type == type; });
    return found == end ? nullptr : found;
}

bool isNumber(CMPIType type) {
    return integerType(type) != nullptr || type == CMPI_real32 || type == CMPI_real64;
}

/** The same integer with another type; none if the value is not an integer or does not fit. */
std::optional<Scalar> converted(const Scalar& value, const IntegerType& target) {
    return std::visit(
        [&](const auto& each) -> std::optional<Scalar> {
            using Each = std::decay_t<decltype(each)>;
            if constexpr (std::is_integral_v<Each> && !std::is_same_v<Each, bool>) {
                const auto size = static_cast<std::uint64_t>(each);
                const bool isNegative = std::is_signed_v<Each> && each < Each{0};
                return target.make(isNegative, isNegative ? std::uint64_t{0} - size : size);
            } else {
                return std::nullopt;
            }
        },
        value);
}

Status refused(const std::string& name, const char* why) {
    return {CMPI_RC_ERR_TYPE_MISMATCH, "The property " + name + " " + why};
}

/** Converts the value to the property's type. */
Status convert(NamedValue& sent, const PropertyInfo& property) {
    const IntegerType* target = integerType(property.type);
    const bool isConvertible = target != nullptr && !sent.value.isArray && !property.isArray;
    if (!isConvertible || sent.value.elements().size() != 1) {
        return refused(sent.name, "has another type.");
    }
    std::optional<Scalar> number = converted(sent.value.single, *target);
    if (!number) {
        return refused(sent.name, "has a value that does not fit its type.");
    }
    sent.value = Value::of(property.type, std::move(*number));
    return {};
}

bool hasInvalidDateTime(const Value& value) {
    return std::any_of(value.elements().begin(), value.elements().end(), [](const Scalar& each) {
        const auto* date = std::get_if<DateTime>(&each);
        return date != nullptr && !cim::isDateTime(date->value);
    });
}

Status refuseStringForNumber(NamedValue& sent, const PropertyInfo& property) {
    return sent.value.type == CMPI_string && isNumber(property.type)
               ? crashed("a text was sent for the number " + sent.name.string() + ".")
               : Status{};
}

Status coerce(NamedValue& sent, const PropertyInfo& property) {
    const Value& value = sent.value;
    if (hasInvalidDateTime(value)) {
        return {CMPI_RC_ERR_INVALID_PARAMETER,
                "The property " + sent.name.string() + " has a datetime that does not exist."};
    }
    const bool isOther = value.type != property.type || value.isArray != property.isArray;
    return isOther ? convert(sent, property) : Status{};
}

/** Checks each property that is not null and that the class has; stops at the first failure. */
Status checkEach(Request& request, const Broker& broker, Status (*check)(NamedValue&, const PropertyInfo&)) {
    const auto known = broker.classInfo(request.path.className);
    const auto& properties = known == nullptr ? std::vector<PropertyInfo>{} : known->properties;
    for (NamedValue& sent : request.instance.properties) {
        const auto property = std::find_if(properties.begin(), properties.end(), [&](const PropertyInfo& each) {
            return cim::sameName(each.name, sent.name);
        });
        const Status status = property == properties.end() || sent.value.isNull ? Status{} : check(sent, *property);
        if (!status.ok()) {
            return status;
        }
    }
    return {};
}

}  // namespace

Status refuseStringsForNumbers(Request& request, const Broker& broker) {
    return checkEach(request, broker, refuseStringForNumber);
}

Status coerceToClass(Request& request, const Broker& broker) {
    return checkEach(request, broker, coerce);
}

}  // namespace cimhost::lab
