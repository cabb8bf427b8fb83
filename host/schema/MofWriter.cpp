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

/** The shortest digits that read back as the same number, with the decimal point that MOF asks for. */
template <typename Real>
std::string realText(Real value) {
    if (!std::isfinite(value)) {
        return "NULL";  // MOF has no word for infinity and for no number
    }
    std::array<char, 64> digits{};
    const auto end = std::to_chars(digits.data(), digits.data() + digits.size(), value).ptr;
    std::string text(digits.data(), end);
    if (text.find('.') == std::string::npos) {
        text.insert(std::min(text.find('e'), text.size()), ".0");
    }
    return text;
}

std::string characterText(Char16 character) {
    if (character.code >= 0x20 && character.code < 0x7F && character.code != '\'' && character.code != '\\') {
        return {'\'', static_cast<char>(character.code), '\''};
    }
    std::array<char, 16> text{};
    std::snprintf(text.data(), text.size(), "'\\x%04X'", static_cast<unsigned>(character.code));
    return text.data();
}

/** Compilers have room for a literal of 1,023 bytes. A character takes up to six. */
constexpr std::size_t longestLiteral = 1000;

bool beginsCharacter(char byte) {
    return (static_cast<unsigned char>(byte) & 0xC0U) != 0x80U;
}

/** How many bytes of a text have room in a literal. */
std::size_t bytesOfLiteral(std::string_view text) {
    std::size_t written = 0;
    for (std::size_t at = 0; at < text.size(); ++at) {
        if (written >= longestLiteral && beginsCharacter(text[at])) {
            return at;
        }
        written += quoted(text.substr(at, 1)).size() - 2;
    }
    return text.size();
}

/** A text as literals one below the other, which a compiler puts together. */
std::string inLiterals(std::string_view text) {
    const std::string whole = cim::replaceInvalidUtf8(text);
    std::string literals;
    std::string_view rest = whole;
    do {
        const std::size_t bytes = bytesOfLiteral(rest);
        literals += (literals.empty() ? "" : "\n        ") + quoted(rest.substr(0, bytes));
        rest.remove_prefix(bytes);
    } while (!rest.empty());
    return literals;
}

using Quote = std::string (*)(std::string_view);

std::string valueText(const Value& value, Quote quote);

std::string instanceText(const Instance& instance) {
    std::string text = "instance of " + instance.path.className + " {\n";
    for (const NamedValue& property : instance.properties) {
        text += "    " + property.name + " = " + valueText(property.value, &inLiterals) + ";\n";
    }
    return text + "};\n";
}

struct ScalarText {
    Quote quote;

    std::string operator()(std::monostate) const { return "NULL"; }
    std::string operator()(bool value) const { return value ? "TRUE" : "FALSE"; }
    std::string operator()(Char16 value) const { return characterText(value); }
    std::string operator()(float value) const { return realText(value); }
    std::string operator()(double value) const { return realText(value); }
    std::string operator()(const std::string& value) const { return quote(value); }
    std::string operator()(const DateTime& value) const { return quote(value.value); }
    std::string operator()(const std::shared_ptr<const ObjectPath>& value) const {
        return value ? quote(formatObjectPath(*value)) : "NULL";
    }
    std::string operator()(const std::shared_ptr<const Instance>& value) const {
        return value ? quote(instanceText(*value)) : "NULL";
    }
    template <typename Integer>
    std::string operator()(Integer value) const {
        return std::to_string(value);
    }
};

std::string valueText(const Value& value, Quote quote) {
    if (value.isNull || (!value.isArray && value.elements.empty())) {
        return "NULL";
    }
    const ScalarText scalar{quote};
    if (!value.isArray) {
        return std::visit(scalar, value.elements.front());
    }
    std::string text = "{";
    for (const Scalar& element : value.elements) {
        text += (text.size() > 1 ? ", " : "") + std::visit(scalar, element);
    }
    return text + "}";
}

}  // namespace

std::string formatMof(const Value& value) {
    return valueText(value, &quoted);
}

std::string formatMof(const Instance& instance) {
    return cim::replaceInvalidUtf8(instanceText(instance));
}

}  // namespace cimhost
