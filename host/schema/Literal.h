#pragma once

#include <cstdint>
#include <string>
#include <variant>

#include "model/Value.h"

namespace cimhost {

/** An integer as written, before it is known which type it must fit. */
struct IntegerLiteral {
    bool negative = false;
    std::uint64_t magnitude = 0;
    bool tooLarge = false;  ///< the magnitude has more than 64 bits
};

/** A constant as MOF and object paths write it, before its type is known. std::monostate is NULL. */
struct Literal {
    std::variant<std::monostate, bool, IntegerLiteral, double, Char16, std::string> value{};
    std::string text{};  ///< as written, for messages
};

/**
 * The literal as a value of the type; std::monostate for NULL. References and embedded instances are not made here.
 * ValueError when the literal is of another kind or out of the type's range.
 */
Scalar typedScalar(const Literal& literal, CMPIType type);

/** The type that a literal has where no class says it: string, boolean, uint64 or sint64, real64, char16. */
CMPIType literalType(const Literal& literal);

}  // namespace cimhost
