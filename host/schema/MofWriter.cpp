#include "schema/MofWriter.h"

#include <array>
#include <charconv>
#include <cmath>
#include <cstdio>
#include <string_view>

#include "cim/Utf8.h"
#include "schema/ObjectPathText.h"
#include "schema/StringLiteral.h"

namespace cimhost {
namespace {

/** The shortest number that is read back as the same value, with the decimal point that MOF requires. */
template <typename Real>
std::string formatReal(Real value) {
    if (!std::isfinite(value)) {
        return "NULL";  // MOF cannot express infinity or NaN
    }
    std::array<char, 64> digits{};
    const auto end = std::to_chars(digits.data(), digits.data() + digits.size(), value).ptr;
    std::string formatted(digits.data(), end);
    if (formatted.find('.') == std::string::npos) {
        formatted.insert(std::min(formatted.find('e'), formatted.size()), ".0");
    }
    return formatted;
}

std::string formatCharacter(Char16 character) {
    if (character.code >= 0x20 && character.code < 0x7F && character.code != '\'' && character.code != '\\') {
        return {'\'', static_cast<char>(character.code), '\''};
    }
    std::array<char, 16> literal{};
    std::snprintf(literal.data(), literal.size(), "'\\x%04X'", static_cast<unsigned>(character.code));
    return literal.data();
}

/** Some compilers accept literals of at most 1,023 bytes. A character is written with up to six. */
constexpr std::size_t longestLiteral = 1000;

/** The number of bytes of a string that fit into one literal. */
std::size_t bytesOfLiteral(std::string_view string) {
    std::size_t written = 0;
    for (std::size_t position = 0; position < string.size(); ++position) {
        if (written >= longestLiteral && !cim::continuesCharacter(string[position])) {
            return position;
        }
        written += inQuotes(string.substr(position, 1)).size() - 2;
    }
    return string.size();
}

/** Formats a string as literals, one per line, which compilers join. */
std::string inLiterals(std::string_view string) {
    const std::string valid = cim::replaceInvalidUtf8(string);
    std::string literals;
    std::string_view rest = valid;
    do {
        const std::size_t bytes = bytesOfLiteral(rest);
        literals += (literals.empty() ? "" : "\n        ") + inQuotes(rest.substr(0, bytes));
        rest.remove_prefix(bytes);
    } while (!rest.empty());
    return literals;
}

using Quote = std::string (*)(std::string_view);

std::string formatValue(const Value& value, Quote quote);

std::string formatInstance(const Instance& instance) {
    std::string mof = "instance of " + instance.path.className + " {\n";
    for (const NamedValue& property : instance.properties) {
        mof += "    " + property.name.string() + " = " + formatValue(property.value, &inLiterals) + ";\n";
    }
    return mof + "};\n";
}

struct ScalarFormat {
    Quote quote;

    std::string operator()(std::monostate) const { return "NULL"; }
    std::string operator()(bool value) const { return value ? "TRUE" : "FALSE"; }
    std::string operator()(Char16 value) const { return formatCharacter(value); }
    std::string operator()(float value) const { return formatReal(value); }
    std::string operator()(double value) const { return formatReal(value); }
    std::string operator()(const std::string& value) const { return quote(value); }
    std::string operator()(const DateTime& value) const { return quote(value.value); }
    std::string operator()(const std::shared_ptr<const ObjectPath>& value) const {
        return value ? quote(formatObjectPath(*value)) : "NULL";
    }
    std::string operator()(const std::shared_ptr<const Instance>& value) const {
        return value ? quote(formatInstance(*value)) : "NULL";
    }
    template <typename Integer>
    std::string operator()(Integer value) const {
        return std::to_string(value);
    }
};

std::string formatValue(const Value& value, Quote quote) {
    if (value.isNull) {
        return "NULL";
    }
    const ScalarFormat scalar{quote};
    if (!value.isArray) {
        return std::visit(scalar, value.single);
    }
    std::string list = "{";
    for (const Scalar& element : value.elements()) {
        list += (list.size() > 1 ? ", " : "") + std::visit(scalar, element);
    }
    return list + "}";
}

}  // namespace

std::string formatMof(const Value& value) {
    return formatValue(value, &inQuotes);
}

std::string formatMof(const Instance& instance) {
    return cim::replaceInvalidUtf8(formatInstance(instance));
}

}  // namespace cimhost
