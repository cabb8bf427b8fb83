#include "schema/PropertyValue.h"

#include "schema/Errors.h"
#include "schema/Literal.h"
#include "schema/MofBuilder.h"
#include "schema/MofMessages.h"
#include "schema/ObjectPathGrammar.h"
#include "schema/StringLiteral.h"

namespace cimhost {
namespace {

namespace mof = grammar::mof;
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

/** Reads an array in MOF's form, {1, 2} or {"a", "b"}. @throws ValueError if the source is not such a list */
Value parseArray(std::string_view source, const Property& property, const Schema& schema,
                 const std::string& defaultNameSpace) {
    peg::memory_input<> input(source.data(), source.size(), property.name);
    try {
        const auto root =
            peg::parse_tree::parse<mof::LoneArray, grammar::Node, mof::Selected, peg::nothing, mof::Control>(input);
        Value value = Value::array(property.type, {});
        for (const grammar::Node* constant : grammar::children<mof::Constant>(*root->children.front())) {
            value.items.push_back(typedElement(constantLiteral(*constant), property, schema, defaultNameSpace));
        }
        return value;
    } catch (const peg::parse_error& error) {
        throw ValueError("character " + std::to_string(error.positions().front().column) + ": " +
                         std::string(error.message()));
    }
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
