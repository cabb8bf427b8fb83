#include "schema/CimType.h"

#include <algorithm>
#include <iterator>

#include "cim/Names.h"

namespace cimhost {
namespace {

struct TypeRow {
    CMPIType type;
    std::string_view name;
    bool intrinsic;
    bool integer;
};

constexpr TypeRow types[] = {
    {CMPI_boolean, "boolean", true, false}, {CMPI_char16, "char16", true, false},
    {CMPI_uint8, "uint8", true, true},      {CMPI_uint16, "uint16", true, true},
    {CMPI_uint32, "uint32", true, true},    {CMPI_uint64, "uint64", true, true},
    {CMPI_sint8, "sint8", true, true},      {CMPI_sint16, "sint16", true, true},
    {CMPI_sint32, "sint32", true, true},    {CMPI_sint64, "sint64", true, true},
    {CMPI_real32, "real32", true, false},   {CMPI_real64, "real64", true, false},
    {CMPI_string, "string", true, false},   {CMPI_dateTime, "datetime", true, false},
    {CMPI_ref, "reference", false, false},  {CMPI_instance, "instance", false, false},
    {CMPI_chars, "string", false, false},   {CMPI_null, "null", false, false},
};

template <typename Predicate>
const TypeRow* findType(Predicate matches) {
    const auto* row = std::find_if(std::begin(types), std::end(types), matches);
    return row == std::end(types) ? nullptr : row;
}

const TypeRow* findType(CMPIType type) {
    const int element = type & ~CMPI_ARRAY;
    return findType([&](const TypeRow& row) { return row.type == element; });
}

}  // namespace

std::string_view typeName(CMPIType type) {
    const TypeRow* row = findType(type);
    return row != nullptr ? row->name : "unknown";
}

std::optional<CMPIType> intrinsicType(std::string_view name) {
    const TypeRow* row =
        findType([&](const TypeRow& each) { return each.intrinsic && cim::sameName(each.name, name); });
    return row != nullptr ? std::optional(row->type) : std::nullopt;
}

bool isInteger(CMPIType type) {
    const TypeRow* row = findType(type);
    return row != nullptr && row->integer;
}

}  // namespace cimhost
