#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "schema/LiteralGrammar.h"
#include "schema/Schema.h"

namespace cimhost {

/** The first child of this rule, or null. */
template <typename Rule>
const grammar::Node* findChild(const grammar::Node& node) {
    for (const auto& child : node.children) {
        if (child->is_type<Rule>()) {
            return child.get();
        }
    }
    return nullptr;
}

/** All children of this rule. */
template <typename Rule>
std::vector<const grammar::Node*> children(const grammar::Node& node) {
    std::vector<const grammar::Node*> found;
    for (const auto& child : node.children) {
        if (child->is_type<Rule>()) {
            found.push_back(child.get());
        }
    }
    return found;
}

/** The literal of a MOF constant. Adjacent strings are joined. An alias results in NULL. */
Literal constantLiteral(const grammar::Node& constant);

/**
 * Reads an array in MOF's form, {1, 2} or {"a", "b"}, whose elements have the property's type.
 * @throws ValueError if the source is not such a list; the errors of typedElement()
 */
Value parseArray(std::string_view source, const Property& property, const Schema& schema,
                 const std::string& defaultNameSpace);

}  // namespace cimhost
