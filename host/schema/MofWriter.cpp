#include "schema/MofWriter.h"

#include <array>
#include <charconv>
#include <cmath>
#include <cstdio>

#include "schema/ObjectPathText.h"
#include "schema/Text.h"

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

std::string instanceText(const Instance& instance) {
    std::string text = "instance of " + instance.path.className + " {\n";
    for (const NamedValue& property : instance.properties) {
        text += "    " + property.name + " = " + formatMof(property.value) + ";\n";
    }
    return text + "};\n";
}

struct ScalarText {
    std::string operator()(std::monostate) const { return "NULL"; }
    std::string operator()(bool value) const { return value ? "TRUE" : "FALSE"; }
    std::string operator()(Char16 value) const { return characterText(value); }
    std::string operator()(float value) const { return realText(value); }
    std::string operator()(double value) const { return realText(value); }
    std::string operator()(const std::string& value) const { return inQuotes(value); }
    std::string operator()(const DateTime& value) const { return inQuotes(value.text); }
    std::string operator()(const std::shared_ptr<const ObjectPath>& value) const {
        return value ? inQuotes(formatObjectPath(*value)) : "NULL";
    }
    std::string operator()(const std::shared_ptr<const Instance>& value) const {
        return value ? inQuotes(instanceText(*value)) : "NULL";
    }
    template <typename Integer>
    std::string operator()(Integer value) const {
        return std::to_string(value);
    }
};

}  // namespace

std::string formatMof(const Value& value) {
    if (value.isNull || (!value.isArray && value.elements.empty())) {
        return "NULL";
    }
    if (!value.isArray) {
        return std::visit(ScalarText{}, value.elements.front());
    }
    std::string text = "{";
    for (const Scalar& element : value.elements) {
        text += (text.size() > 1 ? ", " : "") + std::visit(ScalarText{}, element);
    }
    return text + "}";
}

std::string formatMof(const Instance& instance) {
    return wellFormed(instanceText(instance));
}

}  // namespace cimhost
