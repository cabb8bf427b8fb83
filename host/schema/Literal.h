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
 * Converts a literal to a type other than a reference or an instance; std::monostate for NULL.
 * @throws ValueError if the literal is of another kind or out of range
 */
Scalar typedScalar(const Literal& literal, CMPIType type);

/**
 * Converts a literal to an element of a property's value. The literal of a reference is a string with its path.
 *
 * @param defaultNameSpace of a reference without a namespace
 * @throws ValueError, PathError if it does not match the property's type or the class of the reference
 */
Scalar typedElement(const Literal& literal, const Property& property, const Schema& schema,
                    const std::string& defaultNameSpace);

/** The type of a literal that no class declares: string, boolean, uint64 or (negative) sint64, real64, char16. */
CMPIType literalType(const Literal& literal);

/**
 * Reads a property value from a command line: without quotation marks for strings, datetimes, references and char16; as
 * a literal for other types; as a list in braces, {"a", "b"}, for arrays. Nothing is the empty string and not valid for
 * other types; null cannot be written.
 * @throws ValueError, PathError with the property's name
 */
Value parsePropertyValue(std::string_view source, const Property& property, const Schema& schema,
                         const std::string& defaultNameSpace);

}  // namespace cimhost
