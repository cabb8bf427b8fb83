#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "schema/LiteralGrammar.h"
#include "schema/Schema.h"

namespace cimhost {

/** The first child of that rule, or null. */
template <typename Rule>
const grammar::Node* findChild(const grammar::Node& node) {
    for (const auto& child : node.children) {
        if (child->is_type<Rule>()) {
            return child.get();
        }
    }
    return nullptr;
}

/** All children of that rule. */
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

/** The constant of a MOF constant's node; its string parts are joined. An alias is read as if it were NULL. */
Literal constantLiteral(const grammar::Node& constant);

/**
 * An array value from text in MOF's form, {1, 2} or {"a", "b"}, its elements typed as the property's.
 * ValueError when the text is no such list; the errors of typedElement.
 */
Value parseArray(std::string_view text, const Property& property, const Schema& schema,
                 const std::string& defaultNameSpace);

}  // namespace cimhost
