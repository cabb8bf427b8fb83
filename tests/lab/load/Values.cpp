#include "lab/load/Values.h"

#include <algorithm>
#include <cstdio>
#include <iterator>
#include <limits>

#include "schema/MofWriter.h"

namespace cimhost::lab {
namespace {

std::string makeDateTime(Random& random) {
    char dateTime[26];
    std::snprintf(dateTime, sizeof dateTime, "20%02u%02u%02u%02u%02u%02u.000000+000",
                  static_cast<unsigned>(random.below(100)), static_cast<unsigned>(random.below(12) + 1),
                  static_cast<unsigned>(random.below(28) + 1), static_cast<unsigned>(random.below(24)),
                  static_cast<unsigned>(random.below(60)), static_cast<unsigned>(random.below(60)));
    return dateTime;
}

template <class Number>
Scalar number(Random& random) {
    return static_cast<Number>(random.below(static_cast<std::uint64_t>(std::numeric_limits<Number>::max())));
}

/** Multiples of 0.25, which are exact in binary and decimal. */
template <class Number>
Scalar fraction(Random& random) {
    return static_cast<Number>(random.below(4000)) / 4;
}

struct Maker {
    CMPIType type;
    Scalar (*make)(Random& random);
};

constexpr Maker makers[] = {
    {CMPI_string, [](Random& random) -> Scalar { return "some text " + std::to_string(random.below(1'000'000)); }},
    {CMPI_dateTime, [](Random& random) -> Scalar { return DateTime{makeDateTime(random)}; }},
    {CMPI_boolean, [](Random& random) -> Scalar { return random.coin(); }},
    {CMPI_char16, [](Random& random) -> Scalar { return Char16{static_cast<std::uint16_t>('a' + random.below(26))}; }},
    {CMPI_uint8, number<std::uint8_t>},
    {CMPI_uint16, number<std::uint16_t>},
    {CMPI_uint32, number<std::uint32_t>},
    {CMPI_uint64, number<std::uint64_t>},
    {CMPI_sint8, number<std::int8_t>},
    {CMPI_sint16, number<std::int16_t>},
    {CMPI_sint32, number<std::int32_t>},
    {CMPI_sint64, number<std::int64_t>},
    {CMPI_real32, fraction<float>},
    {CMPI_real64, fraction<double>},
};

const Maker* makerFor(const Property& property) {
    const auto* const found = std::find_if(std::begin(makers), std::end(makers),
                                           [&](const Maker& each) { return each.type == property.type; });
    return property.isArray || found == std::end(makers) ? nullptr : found;
}

}  // namespace

bool canMakeValue(const Property& property) {
    return makerFor(property) != nullptr;
}

Value makeValue(const Property& property, Random& random) {
    return Value::of(property.type, makerFor(property)->make(random));
}

bool sameValue(const Value& left, const Value& right) {
    return left.type == right.type && left.isArray == right.isArray && left.isNull == right.isNull &&
           formatMof(left) == formatMof(right);
}

}  // namespace cimhost::lab
