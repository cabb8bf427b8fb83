#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <variant>

#include "model/Value.h"
#include "schema/Schema.h"

namespace cimhost {

/** An integer literal whose type is not known yet. */
struct IntegerLiteral {
    bool negative = false;
    std::uint64_t magnitude = 0;
    bool tooLarge = false;  ///< the magnitude has more than 64 bits
};

/** A literal of MOF or an object path whose type is not known yet. std::monostate is NULL. */
struct Literal {
    std::variant<std::monostate, bool, IntegerLiteral, double, Char16, std::string> value{};
    std::string source{};  ///< as written, for messages
};

/**
 * Converts a literal to a type that is neither a reference nor an instance. NULL becomes std::monostate.
 * @throws ValueError if the literal is of another kind or out of range
 */
Scalar typedScalar(const Literal& literal, CMPIType type);

/**
 * Converts a literal to an element of a property's value. The literal of a reference is a string with its path.
 *
 * @param defaultNameSpace the namespace of a reference that does not name one
 * @throws ValueError, PathError if the literal does not match the property's type or the class of the reference
 */
Scalar typedElement(const Literal& literal, const Property& property, const Schema& schema,
                    const std::string& defaultNameSpace);

/** The type of a literal without a declared type: string, boolean, uint64 (sint64 if negative), real64, char16. */
CMPIType literalType(const Literal& literal);

/**
 * Reads a property value from a command line. Strings, datetimes, references and char16 have no quotation marks,
 * values of other types are literals, and arrays are lists in braces, {"a", "b"}. An empty source is valid only for a
 * string. The value cannot be null.
 * @throws ValueError, PathError with a message that begins with the property's name
 */
Value parsePropertyValue(std::string_view source, const Property& property, const Schema& schema,
                         const std::string& defaultNameSpace);

}  // namespace cimhost
