#include "schema/LiteralGrammar.h"

#include <charconv>
#include <limits>
#include <locale>
#include <sstream>

#include "schema/Errors.h"
#include "schema/StringLiteral.h"

namespace cimhost::grammar {
namespace {

/** @param prefix, suffix number of characters before and after the digits, without the sign */
Literal readInteger(std::string_view source, std::size_t prefix, std::size_t suffix, int base) {
    IntegerLiteral integer;
    std::string_view digits = source;
    if (digits.front() == '+' || digits.front() == '-') {
        integer.negative = digits.front() == '-';
        digits.remove_prefix(1);
    }
    digits = digits.substr(prefix, digits.size() - prefix - suffix);
    const auto result = std::from_chars(digits.data(), digits.data() + digits.size(), integer.magnitude, base);
    integer.tooLarge = result.ec == std::errc::result_out_of_range;
    integer.negative = integer.negative && (integer.tooLarge || integer.magnitude != 0);
    return {integer, std::string(source)};
}

Literal readReal(std::string_view source) {
    std::istringstream stream{std::string(source)};
    stream.imbue(std::locale::classic());
    double value = 0;
    stream >> value;
    if (stream.fail() && value != 0) {
        value = std::numeric_limits<double>::infinity();  // overflow; typedScalar() rejects it
    }
    return {value, std::string(source)};
}

Literal readCharacter(std::string_view content) {
    const std::string source = "'" + std::string(content) + "'";
    if (content.size() > 2 && content[0] == '\\') {  // a \x escape is a code unit, possibly a surrogate
        std::uint16_t unit = 0;
        std::from_chars(content.data() + 2, content.data() + content.size(), unit, 16);
        return {Char16{unit}, source};
    }
    const std::optional<std::uint16_t> code = singleCharacter(unescaped(content));
    if (!code) {
        throw ValueError(source + " is not a char16: it must be one character of 16 bits");
    }
    return {Char16{*code}, source};
}

}  // namespace

Literal readLiteral(const Node& node) {
    const std::string_view source = node.string_view();
    if (node.is_type<TrueLiteral>() || node.is_type<FalseLiteral>()) {
        return {node.is_type<TrueLiteral>(), std::string(source)};
    }
    if (node.is_type<DecimalLiteral>()) {
        return readInteger(source, 0, 0, 10);
    }
    if (node.is_type<HexLiteral>()) {
        return readInteger(source, 2, 0, 16);
    }
    if (node.is_type<OctalLiteral>()) {
        return readInteger(source, 1, 0, 8);
    }
    if (node.is_type<BinaryLiteral>()) {
        return readInteger(source, 0, 1, 2);
    }
    if (node.is_type<RealLiteral>()) {
        return readReal(source);
    }
    if (node.is_type<CharacterContent>()) {
        return readCharacter(source);
    }
    return {std::monostate{}, std::string(source)};
}

}  // namespace cimhost::grammar
