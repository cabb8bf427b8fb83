#include "schema/PropertyText.h"

#include "schema/CimType.h"
#include "schema/Errors.h"
#include "schema/MofValues.h"
#include "schema/ObjectPathGrammar.h"
#include "schema/StringLiteral.h"
#include "schema/TypedElement.h"

namespace cimhost {
namespace {

namespace path = grammar::path;
namespace peg = tao::pegtl;

/** The text as the literal that it is where the property's type takes plain text. */
Literal plainText(std::string_view text, const Property& property) {
    if (property.type == CMPI_char16) {
        if (const std::optional<std::uint16_t> code = singleCharacter(text)) {
            return {Char16{*code}, std::string(text)};
        }
    }
    return {std::string(text), std::string(text)};
}

bool takesPlainText(CMPIType type, std::string_view text) {
    return type == CMPI_string || type == CMPI_dateTime || type == CMPI_ref ||
           (type == CMPI_char16 && (text.empty() || text.front() != '\'' || text.size() == 1));
}

Literal readConstant(std::string_view text) {
    peg::memory_input<> input(text.data(), text.size(), "");
    const auto root = peg::parse_tree::parse<path::LoneConstant, grammar::Node, path::Selected>(input);
    if (root == nullptr) {
        return {std::string(text), text.empty() ? "an empty text" : std::string(text)};
    }
    return grammar::readLiteral(*root->children.front());
}

Value parseText(std::string_view text, const Property& property, const Schema& schema,
                const std::string& defaultNameSpace) {
    if (property.isArray) {
        return parseArray(text, property, schema, defaultNameSpace);
    }
    const Literal literal = takesPlainText(property.type, text) ? plainText(text, property) : readConstant(text);
    const Scalar element = typedElement(literal, property, schema, defaultNameSpace);
    if (std::holds_alternative<std::monostate>(element)) {
        throw ValueError("null is no " + std::string(typeName(property.type)));
    }
    return Value::of(property.type, element);
}

}  // namespace

Value parsePropertyText(std::string_view text, const Property& property, const Schema& schema,
                        const std::string& defaultNameSpace) {
    try {
        return parseText(text, property, schema, defaultNameSpace);
    } catch (const ValueError& error) {
        throw ValueError(property.name + ": " + error.what());
    } catch (const PathError& error) {
        throw PathError(property.name + ": " + error.what());
    }
}

}  // namespace cimhost
