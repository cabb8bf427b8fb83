#pragma once

#include <cmpidt.h>

#include <cstdint>
#include <memory>
#include <string>
#include <variant>
#include <vector>

namespace cimhost {

struct ObjectPath;
struct Instance;

/** A CIM datetime: the 25 characters of its text, a time or an interval. */
struct DateTime {
    std::string text;
};

/** One 16-bit character. */
struct Char16 {
    std::uint16_t code = 0;
};

/**
 * A single CIM value. std::monostate is the null value. References and embedded instances are
 * shared and never changed once they are part of a value.
 */
using Scalar = std::variant<std::monostate, bool, Char16, std::uint8_t, std::uint16_t, std::uint32_t, std::uint64_t,
                            std::int8_t, std::int16_t, std::int32_t, std::int64_t, float, double, std::string, DateTime,
                            std::shared_ptr<const ObjectPath>, std::shared_ptr<const Instance>>;

/**
 * A CIM value with its declared type, which a null value has too.
 * A hollow text has one element, null: a string object without characters, as some object managers pass to providers,
 * also in the place of null.
 */
struct Value {
    CMPIType type = CMPI_null;       ///< element type, without CMPI_ARRAY
    bool isArray = false;            ///< whether it is an array of that type
    bool isNull = true;              ///< null as a whole
    std::vector<Scalar> elements{};  ///< one element unless an array; none when null
};

/** A text that is there and has no characters, or is null and yet an object. */
inline Value hollowText(bool isNull) {
    return {CMPI_string, false, isNull, {std::monostate{}}};
}

inline bool isHollow(const Value& value) {
    return value.type == CMPI_string && !value.isArray && value.elements.size() == 1 &&
           std::holds_alternative<std::monostate>(value.elements.front());
}

/** A named value: a key of an object path or a property of an instance. */
struct NamedValue {
    std::string name;
    Value value;
};

/** Identity of a CIM instance, or of a class when it has no keys. */
struct ObjectPath {
    std::string host{};  ///< empty: this one
    std::string nameSpace{};
    std::string className{};
    std::vector<NamedValue> keys{};
};

/** A CIM instance: its path, and its properties in the order in which they were set. */
struct Instance {
    ObjectPath path{};
    std::vector<NamedValue> properties{};
};

}  // namespace cimhost
