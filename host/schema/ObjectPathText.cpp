#include "schema/ObjectPathText.h"

#include "cim/Names.h"
#include "schema/Errors.h"
#include "schema/Literal.h"
#include "schema/MofWriter.h"
#include "schema/ObjectPathGrammar.h"
#include "schema/StringLiteral.h"

namespace cimhost {
namespace {

namespace path = grammar::path;
namespace peg = tao::pegtl;
using grammar::children;
using grammar::findChild;
using grammar::Node;

Literal readKeyValue(const Node& node) {
    if (const Node* content = findChild<path::StringPart>(node)) {
        return {unescaped(content->string_view()), node.string()};
    }
    return grammar::readLiteral(*node.children.front());
}

/** The property of a key; null if the class is unknown. @throws PathError if the class does not have the key */
const Property* findKey(const Class* known, std::string_view name) {
    if (known == nullptr) {
        return nullptr;
    }
    const Property* property = known->findProperty(name);
    if (property != nullptr && property->isKey()) {
        return property;
    }
    std::string keys;
    for (const Property* key : known->keys()) {
        keys += (keys.empty() ? "" : ", ") + key->name;
    }
    throw PathError("class " + known->name + " has no key " + std::string(name) +
                    (keys.empty() ? "; it has no keys" : "; its keys are " + keys));
}

Value keyValue(const Literal& literal, const std::string& name, const Property* key, const Schema& schema,
               const std::string& defaultNameSpace) {
    if (std::holds_alternative<std::monostate>(literal.value)) {
        throw PathError("key " + name + " cannot be null");
    }
    if (key == nullptr) {
        const CMPIType type = literalType(literal);
        return Value::of(type, typedScalar(literal, type));
    }
    try {
        return Value::of(key->type, typedElement(literal, *key, schema, defaultNameSpace));
    } catch (const std::runtime_error& error) {
        throw PathError("key " + name + ": " + error.what());
    }
}

void addKey(ObjectPath& result, const Node& node, const Class* known, const Schema& schema,
            const std::string& defaultNameSpace) {
    const std::string name = findChild<path::KeyName>(node)->string();
    if (cim::findNamed(result.keys, name) != nullptr) {
        throw PathError("key " + name + " is given twice");
    }
    const Literal literal = readKeyValue(*findChild<path::KeyValue>(node));
    result.keys.emplace_back(name, keyValue(literal, name, findKey(known, name), schema, defaultNameSpace));
}

ObjectPath buildPath(const Node& root, const Schema& schema, const std::string& defaultNameSpace) {
    ObjectPath result;
    const Node* host = findChild<path::Host>(root);
    const Node* nameSpace = findChild<path::NameSpace>(root);
    result.host = host != nullptr ? host->string() : "";
    result.nameSpace = nameSpace != nullptr ? nameSpace->string() : defaultNameSpace;
    result.className = findChild<path::ClassName>(root)->string();
    const Class* known = schema.findClass(result.className);
    for (const Node* key : children<path::Key>(root)) {
        addKey(result, *key, known, schema, defaultNameSpace);
    }
    return result;
}

}  // namespace

ObjectPath parseObjectPath(std::string_view uri, const Schema& schema, const std::string& defaultNameSpace) {
    const std::string intro = "object path " + std::string(uri) + ": ";
    try {
        peg::memory_input<> input(uri.data(), uri.size(), "");
        const auto root = peg::parse_tree::parse<path::Path, Node, path::Selected, peg::nothing, path::Control>(input);
        return buildPath(*root, schema, defaultNameSpace);
    } catch (const peg::parse_error& error) {
        throw PathError(intro + "character " + std::to_string(error.positions().front().byte + 1) + ": " +
                        std::string(error.message()));
    } catch (const ValueError& error) {
        throw PathError(intro + error.what());
    } catch (const PathError& error) {
        throw PathError(intro + error.what());
    }
}

std::string formatObjectPath(const ObjectPath& path) {
    std::string uri;
    if (!path.host.empty()) {
        uri = "//" + path.host + "/";
    }
    if (!path.nameSpace.empty()) {
        uri += path.nameSpace + ":";
    }
    uri += path.className;
    char separator = '.';
    for (const NamedValue& key : path.keys) {
        uri += separator + key.name.string() + "=" + formatMof(key.value);
        separator = ',';
    }
    return uri;
}

}  // namespace cimhost
