#include "schema/MofValues.h"

#include "schema/Errors.h"
#include "schema/MofMessages.h"
#include "schema/StringLiteral.h"
#include "schema/TypedElement.h"

namespace cimhost {

namespace mof = grammar::mof;
namespace peg = tao::pegtl;

Literal constantLiteral(const grammar::Node& constant) {
    const std::vector<const grammar::Node*> parts = children<mof::StringPart>(constant);
    if (!parts.empty()) {
        std::string value;
        for (const grammar::Node* part : parts) {
            value += unescaped(part->string_view());
        }
        std::string source = inQuotes(value);
        return {std::move(value), std::move(source)};
    }
    return grammar::readLiteral(*constant.children.front());
}

Value parseArray(std::string_view source, const Property& property, const Schema& schema,
                 const std::string& defaultNameSpace) {
    peg::memory_input<> input(source.data(), source.size(), property.name);
    try {
        const auto root =
            peg::parse_tree::parse<mof::LoneArray, grammar::Node, mof::Selected, peg::nothing, mof::Control>(input);
        Value value = Value::array(property.type, {});
        for (const grammar::Node* constant : children<mof::Constant>(*root->children.front())) {
            value.elements.push_back(typedElement(constantLiteral(*constant), property, schema, defaultNameSpace));
        }
        return value;
    } catch (const peg::parse_error& error) {
        throw ValueError("character " + std::to_string(error.positions().front().column) + ": " +
                         std::string(error.message()));
    }
}

}  // namespace cimhost
