#pragma once

#include <array>
#include <charconv>
#include <cmath>
#include <memory>
#include <string>
#include <string_view>
#include <type_traits>
#include <variant>

#include "cim/Utf8.h"
#include "cimxml/XmlWriter.h"
#include "model/Value.h"

namespace cimhost::cimxml {

/** Appends the characters of a simple value. Appends nothing for null, references and embedded instances. */
struct CharacterWriter {
    std::string& xml;

    void operator()(std::monostate) const {}
    void operator()(bool value) const { xml += value ? "TRUE" : "FALSE"; }
    void operator()(Char16 character) const { appendEscaped(xml, utf8Of(character)); }
    void operator()(const std::string& string) const { appendEscaped(xml, string); }
    void operator()(const DateTime& dateTime) const { appendEscaped(xml, dateTime.value); }
    void operator()(const std::shared_ptr<const ObjectPath>&) const {}
    void operator()(const std::shared_ptr<const Instance>&) const {}
    template <class Number>
    void operator()(Number number) const {
        if constexpr (std::is_floating_point_v<Number>) {
            if (!std::isfinite(number)) {
                xml += std::isnan(number) ? "NaN" : number < 0 ? "-INF" : "INF";
                return;
            }
        }
        std::array<char, 64> digits{};
        const auto written = std::to_chars(digits.data(), digits.data() + digits.size(), number);
        const std::string_view all(digits.data(), static_cast<std::size_t>(written.ptr - digits.data()));
        if constexpr (std::is_floating_point_v<Number>) {
            xml += withDecimalPoint(all);
        } else {
            xml += all;
        }
    }

    /** A real number has a decimal point in CIM-XML, even if its mantissa is an integer. */
    static std::string withDecimalPoint(std::string_view digits) {
        const std::string_view mantissa = digits.substr(0, digits.find('e'));
        const bool needsPoint = mantissa.find('.') == std::string_view::npos;
        return std::string(mantissa) + (needsPoint ? ".0" : "") + std::string(digits.substr(mantissa.size()));
    }

    static std::string utf8Of(Char16 character) {
        std::string string;
        cim::appendUtf8(string, cim::isCodePoint(character.code) ? character.code : 0xFFFD);
        return string;
    }
};

}  // namespace cimhost::cimxml
