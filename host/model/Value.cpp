#include "model/Value.h"

#include <iterator>
#include <utility>

namespace cimhost {
namespace {

/** By the index of the alternative in Scalar. */
constexpr CMPIType types[] = {CMPI_null,   CMPI_boolean, CMPI_char16,   CMPI_uint8,  CMPI_uint16,  CMPI_uint32,
                              CMPI_uint64, CMPI_sint8,   CMPI_sint16,   CMPI_sint32, CMPI_sint64,  CMPI_real32,
                              CMPI_real64, CMPI_string,  CMPI_dateTime, CMPI_ref,    CMPI_instance};
static_assert(std::size(types) == std::variant_size_v<Scalar>);

}  // namespace

CMPIType typeOf(const Scalar& scalar) {
    return types[scalar.index()];
}

Value Value::of(Scalar scalar) {
    const CMPIType type = typeOf(scalar);
    return of(type, std::move(scalar));
}

Value Value::of(CMPIType type, Scalar scalar) {
    if (std::holds_alternative<std::monostate>(scalar)) {
        return null(type);
    }
    Value value{type, false, false, {}};
    value.elements.push_back(std::move(scalar));  // An initializer list would copy it.
    return value;
}

Value Value::array(CMPIType type, std::vector<Scalar> elements) {
    return {type, true, false, std::move(elements)};
}

Value Value::null(CMPIType type, bool isArray) {
    return {type, isArray, true, {}};
}

Value Value::stringWithoutCharacters() {
    return {CMPI_string, false, false, {std::monostate{}}};
}

Value Value::nullStringObject() {
    return {CMPI_string, false, true, {std::monostate{}}};
}

bool Value::isStringWithoutCharacters() const {
    return type == CMPI_string && !isArray && elements.size() == 1 &&
           std::holds_alternative<std::monostate>(elements.front());
}

}  // namespace cimhost
