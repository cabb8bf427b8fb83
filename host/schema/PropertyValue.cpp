#include "schema/PropertyValue.h"

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

/** The literal of a value without quotation marks. */
Literal plainLiteral(std::string_view source, const Property& property) {
    if (property.type == CMPI_char16) {
        if (const std::optional<std::uint16_t> code = singleCharacter(source)) {
            return {Char16{*code}, std::string(source)};
        }
    }
    return {std::string(source), std::string(source)};
}

bool isPlain(CMPIType type, std::string_view source) {
    return type == CMPI_string || type == CMPI_dateTime || type == CMPI_ref ||
           (type == CMPI_char16 && (source.empty() || source.front() != '\'' || source.size() == 1));
}

Literal readLiteral(std::string_view source) {
    peg::memory_input<> input(source.data(), source.size(), "");
    const auto root = peg::parse_tree::parse<path::LoneConstant, grammar::Node, path::Selected>(input);
    if (root == nullptr) {
        return {std::string(source), source.empty() ? "an empty string" : std::string(source)};
    }
    return grammar::readLiteral(*root->children.front());
}

Value parseValue(std::string_view source, const Property& property, const Schema& schema,
                 const std::string& defaultNameSpace) {
    if (property.isArray) {
        return parseArray(source, property, schema, defaultNameSpace);
    }
    const Literal literal = isPlain(property.type, source) ? plainLiteral(source, property) : readLiteral(source);
    const Scalar element = typedElement(literal, property, schema, defaultNameSpace);
    if (std::holds_alternative<std::monostate>(element)) {
        throw ValueError("null is not a " + std::string(typeName(property.type)));
    }
    return Value::of(property.type, element);
}

}  // namespace

Value parsePropertyValue(std::string_view source, const Property& property, const Schema& schema,
                         const std::string& defaultNameSpace) {
    try {
        return parseValue(source, property, schema, defaultNameSpace);
    } catch (const ValueError& error) {
        throw ValueError(property.name + ": " + error.what());
    } catch (const PathError& error) {
        throw PathError(property.name + ": " + error.what());
    }
}

}  // namespace cimhost
