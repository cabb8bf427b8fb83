#include "model/Value.h"

#include <algorithm>
#include <iterator>
#include <mutex>
#include <ostream>
#include <set>
#include <utility>

#include "cim/Names.h"

namespace cimhost {
namespace {

/** The CMPI types of the alternatives of Scalar, in the order of the alternatives. */
constexpr CMPIType types[] = {CMPI_null,   CMPI_boolean, CMPI_char16,   CMPI_uint8,  CMPI_uint16,  CMPI_uint32,
                              CMPI_uint64, CMPI_sint8,   CMPI_sint16,   CMPI_sint32, CMPI_sint64,  CMPI_real32,
                              CMPI_real64, CMPI_string,  CMPI_dateTime, CMPI_ref,    CMPI_instance};
static_assert(std::size(types) == std::variant_size_v<Scalar>);

struct TypeRow {
    CMPIType type;
    std::string_view name;
    bool intrinsic;
};

constexpr TypeRow typeRows[] = {
    {CMPI_boolean, "boolean", true},    {CMPI_char16, "char16", true},     {CMPI_uint8, "uint8", true},
    {CMPI_uint16, "uint16", true},      {CMPI_uint32, "uint32", true},     {CMPI_uint64, "uint64", true},
    {CMPI_sint8, "sint8", true},        {CMPI_sint16, "sint16", true},     {CMPI_sint32, "sint32", true},
    {CMPI_sint64, "sint64", true},      {CMPI_real32, "real32", true},     {CMPI_real64, "real64", true},
    {CMPI_string, "string", true},      {CMPI_dateTime, "datetime", true}, {CMPI_ref, "reference", false},
    {CMPI_instance, "instance", false}, {CMPI_chars, "string", false},     {CMPI_null, "null", false},
};

template <typename Predicate>
const TypeRow* findType(Predicate matches) {
    const auto* row = std::find_if(std::begin(typeRows), std::end(typeRows), matches);
    return row == std::end(typeRows) ? nullptr : row;
}

const TypeRow* findType(CMPIType type) {
    const int element = type & ~CMPI_ARRAY;
    return findType([&](const TypeRow& row) { return row.type == element; });
}

}  // namespace

CMPIType typeOf(const Scalar& scalar) {
    return types[scalar.index()];
}

std::string_view typeName(CMPIType type) {
    const TypeRow* row = findType(type);
    return row != nullptr ? row->name : "unknown";
}

std::optional<CMPIType> intrinsicType(std::string_view name) {
    const TypeRow* row =
        findType([&](const TypeRow& each) { return each.intrinsic && cim::sameName(each.name, name); });
    return row != nullptr ? std::optional(row->type) : std::nullopt;
}

Value Value::of(Scalar scalar) {
    const CMPIType type = typeOf(scalar);
    return of(type, std::move(scalar));
}

Value Value::of(CMPIType type, Scalar scalar) {
    const bool isNull = std::holds_alternative<std::monostate>(scalar);
    return {type, false, isNull, false, std::move(scalar), {}};
}

Value Value::array(CMPIType type, std::vector<Scalar> items) {
    return {type, true, false, false, {}, std::move(items)};
}

Value Value::null(CMPIType type, bool isArray) {
    return {type, isArray, true};
}

Value Value::stringWithoutCharacters() {
    return {CMPI_string, false, false, true};
}

Value Value::nullStringObject() {
    return {CMPI_string, false, true, true};
}

Name Name::declared(const std::string& name) {
    static std::mutex mutex;
    static auto& names = *new std::set<std::string>;  // never destroyed: names may be used until the process ends
    const std::lock_guard<std::mutex> lock(mutex);
    Name result;
    result.shared = {std::shared_ptr<void>(), &*names.insert(name).first};  // not reference-counted: the set owns it
    return result;
}

std::ostream& operator<<(std::ostream& stream, const Name& name) {
    return stream << name.string();
}

}  // namespace cimhost
