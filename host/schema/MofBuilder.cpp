#include "schema/MofBuilder.h"

#include <map>
#include <stdexcept>

#include "cim/Names.h"
#include "schema/Errors.h"
#include "schema/MofGrammar.h"
#include "schema/StringLiteral.h"

namespace cimhost {
namespace {

namespace mof = grammar::mof;
using cim::findNamed;
using grammar::children;
using grammar::findChild;
using grammar::Node;

[[noreturn]] void fail(const Node& node, const std::string& message) {
    throw errorAt(node.begin(), message);
}

/** Runs the action. Rethrows its errors as LoadError with the position of the node. */
template <typename Action>
auto at(const Node& node, Action action) {
    try {
        return action();
    } catch (const LoadError&) {
        throw;
    } catch (const std::runtime_error& error) {
        fail(node, error.what());
    } catch (const std::invalid_argument& error) {
        fail(node, error.what());
    }
}

CMPIType readType(const Node& node) {
    const std::optional<CMPIType> type = intrinsicType(node.string_view());
    if (!type) {
        fail(node, node.string() +
                       " is not a data type: expected boolean, string, datetime, char16, uint8 to uint64, "
                       "sint8 to sint64, real32, real64, or a class name followed by REF");
    }
    return *type;
}

Scope readScope(const Node& clause) {
    Scope scope;
    for (const Node* element : children<mof::MetaElement>(clause)) {
        for (std::size_t i = 0; i < scope.size(); ++i) {
            const bool isNamed = cim::sameName(element->string_view(), scopeNames[i]);
            scope[i] = scope[i] || isNamed || cim::sameName(element->string_view(), "any");
        }
    }
    return scope;
}

void applyFlavor(Flavor& flavor, const Node& node) {
    struct Row {
        const char* name;
        bool Flavor::*member;
        bool value;
    };
    constexpr Row rows[] = {
        {"EnableOverride", &Flavor::overridable, true}, {"DisableOverride", &Flavor::overridable, false},
        {"ToSubclass", &Flavor::toSubclass, true},      {"ToInstance", &Flavor::toSubclass, true},
        {"Restricted", &Flavor::toSubclass, false},     {"Translatable", &Flavor::translatable, true}};
    if (const Row* row = findNamed(rows, node.string_view())) {
        flavor.*row->member = row->value;
        return;
    }
    fail(node, node.string() +
                   " is not a flavor: expected EnableOverride, DisableOverride, ToSubclass, Restricted or "
                   "Translatable");
}

/** The array initializer or constant of a node. */
const Node* initializerOf(const Node& node) {
    const Node* array = findChild<mof::ArrayInitializer>(node);
    return array != nullptr ? array : findChild<mof::Constant>(node);
}

/** Adds the default values of the class to an instance, and the keys to its path. */
void complete(Instance& instance, const Class& declared, const Node& node) {
    for (const Property& property : declared.properties) {
        if (!property.defaultValue.isNull && findNamed(instance.properties, property.name) == nullptr) {
            instance.properties.emplace_back(property.name, property.defaultValue);
        }
    }
    for (const Property* key : declared.keys()) {
        const NamedValue* value = findNamed(instance.properties, key->name);
        if (value == nullptr || value->value.isNull) {
            fail(node, "the key " + key->name + " has no value");
        }
        instance.path.keys.push_back(*value);
    }
}

/** Adds the classes, qualifier declarations and instances of a parse tree to a schema. */
class MofBuilder {
public:
    /** @param onInclude called for each #pragma include, in order */
    MofBuilder(Schema& target, std::function<void(const std::string& file)> onInclude)
        : schema(target), include(std::move(onInclude)) {}

    /** @throws LoadError with file, line and column of the first error */
    void build(const Node& root) {
        for (const auto& child : root.children) {
            buildDeclaration(*child);
        }
    }

private:
    void buildDeclaration(const Node& node) {
        const Node* declaration = &node;
        const Node* qualifiers = nullptr;
        if (node.is_type<mof::QualifiedDeclaration>()) {
            qualifiers = node.children.front().get();
            declaration = node.children.back().get();
        }
        if (declaration->is_type<mof::Pragma>()) {
            buildPragma(*declaration);
        } else if (declaration->is_type<mof::QualifierDeclaration>()) {
            buildQualifierDeclaration(*declaration);
        } else if (declaration->is_type<mof::ClassDeclaration>()) {
            buildClass(*declaration, qualifiers);
        } else {
            buildInstance(*declaration);
        }
    }

    void buildPragma(const Node& pragma) {
        if (cim::sameName(findChild<mof::PragmaName>(pragma)->string_view(), "include")) {
            at(pragma, [&] { include(std::get<std::string>(constantLiteral(pragma).value)); });
        }
    }

    void buildQualifierDeclaration(const Node& node) {
        QualifierDeclaration declaration;
        declaration.name = findChild<mof::QualifierName>(node)->string();
        declaration.type = readType(*findChild<mof::DataType>(node));
        declaration.isArray = findChild<mof::ArrayMark>(node) != nullptr;
        declaration.defaultValue = Value::null(declaration.type, declaration.isArray);
        if (const Node* value = findChild<mof::DefaultValue>(node)) {
            const Property type{declaration.name, declaration.type, declaration.isArray};
            declaration.defaultValue = readValue(*initializerOf(*value), type);
        }
        declaration.scope = readScope(*findChild<mof::ScopeClause>(node));
        if (const Node* clause = findChild<mof::FlavorClause>(node)) {
            for (const Node* flavor : children<mof::FlavorName>(*clause)) {
                applyFlavor(declaration.flavor, *flavor);
            }
        }
        at(node, [&] { schema.add(std::move(declaration)); });
    }

    void buildClass(const Node& node, const Node* qualifiers) {
        Class declared;
        declared.name = findChild<mof::ClassName>(node)->string();
        if (const Node* super = findChild<mof::SuperclassName>(node)) {
            declared.superclass = super->string();
        }
        declared.qualifiers = readQualifiers(qualifiers);
        for (const Node* feature : children<mof::Feature>(node)) {
            buildFeature(declared, *feature);
        }
        at(node, [&] { schema.add(std::move(declared)); });
    }

    void buildFeature(Class& declared, const Node& feature) const {
        const std::string name = findChild<mof::FeatureName>(feature)->string();
        if (const Node* parameters = findChild<mof::ParameterList>(feature)) {
            Method method{name};
            method.type = intrinsicType(findChild<mof::DataType>(feature)->string_view()).value_or(CMPI_null);
            method.qualifiers = readQualifiers(findChild<mof::QualifierList>(feature));
            for (const Node* parameter : children<mof::Parameter>(*parameters)) {
                method.parameters.push_back(
                    readTypedName(findChild<mof::ParameterName>(*parameter)->string(), *parameter));
            }
            declared.methods.push_back(std::move(method));
            return;
        }
        Property property = readTypedName(name, feature);
        property.defaultValue = Value::null(property.type, property.isArray);
        if (const Node* value = findChild<mof::DefaultValue>(feature)) {
            property.defaultValue = readValue(*initializerOf(*value), property);
        }
        declared.properties.push_back(std::move(property));
    }

    /** Name, type and qualifiers of a property or a parameter. */
    Property readTypedName(const std::string& name, const Node& node) const {
        Property property{name};
        const Node& type = *findChild<mof::DataType>(node);
        if (findChild<mof::ReferenceMark>(node) != nullptr) {
            property.type = CMPI_ref;
            property.referenceClass = type.string();
        } else {
            property.type = readType(type);
        }
        property.isArray = findChild<mof::ArrayMark>(node) != nullptr;
        property.qualifiers = readQualifiers(findChild<mof::QualifierList>(node));
        return property;
    }

    std::vector<Qualifier> readQualifiers(const Node* list) const {
        std::vector<Qualifier> qualifiers;
        if (list == nullptr) {
            return qualifiers;
        }
        for (const Node* node : children<mof::Qualifier>(*list)) {
            Qualifier qualifier = readQualifier(*node);
            if (findNamed(qualifiers, qualifier.name) != nullptr) {
                fail(*node, "qualifier " + qualifier.name + " is given twice");
            }
            qualifiers.push_back(std::move(qualifier));
        }
        return qualifiers;
    }

    Qualifier readQualifier(const Node& node) const {
        const std::string name = findChild<mof::QualifierName>(node)->string();
        const QualifierDeclaration* declaration = schema.findQualifier(name);
        if (declaration == nullptr) {
            fail(node, "qualifier " + name + " is not declared; declare it (Qualifier " + name +
                           " : TYPE, Scope(...);) or include the file that does");
        }
        Qualifier qualifier{declaration->name, declaration->defaultValue, declaration->flavor};
        if (const Node* initializer = initializerOf(node)) {
            qualifier.value = readValue(*initializer, {name, declaration->type, declaration->isArray});
        } else if (declaration->type == CMPI_boolean && !declaration->isArray) {
            qualifier.value = Value::of(CMPI_boolean, true);
        }
        for (const Node* flavor : children<mof::FlavorName>(node)) {
            applyFlavor(qualifier.flavor, *flavor);
        }
        return qualifier;
    }

    Value readValue(const Node& initializer, const Property& type) const {
        if (initializer.is_type<mof::Constant>()) {
            const Scalar scalar = readElement(initializer, type);
            const bool isNull = std::holds_alternative<std::monostate>(scalar);
            if (type.isArray && !isNull) {
                fail(initializer, type.name + " is an array: expected its values in braces");
            }
            Value value = Value::of(type.type, scalar);
            value.isArray = type.isArray;
            return value;
        }
        if (!type.isArray) {
            fail(initializer, type.name + " is not an array: expected one value without braces");
        }
        std::vector<Scalar> elements;
        for (const Node* constant : children<mof::Constant>(initializer)) {
            elements.push_back(readElement(*constant, type));
        }
        return Value::array(type.type, std::move(elements));
    }

    Scalar readElement(const Node& constant, const Property& type) const {
        if (const Node* alias = findChild<mof::Alias>(constant)) {
            const auto known = aliases.find(alias->string_view());
            if (known == aliases.end()) {
                fail(*alias, alias->string() + " is not an alias of an instance declared before");
            }
            if (type.type != CMPI_ref) {
                fail(*alias, type.name + " is not a reference, so its value cannot be an alias");
            }
            return std::make_shared<const ObjectPath>(known->second);
        }
        return at(constant, [&] { return typedElement(constantLiteral(constant), type, schema, ""); });
    }

    void buildInstance(const Node& node) {
        const Node& className = *findChild<mof::ClassName>(node);
        const Class* declared = schema.findClass(className.string_view());
        if (declared == nullptr) {
            fail(className, "class " + className.string() + " is not declared; declare or include it first");
        }
        Instance instance;
        instance.path.className = declared->name;
        for (const Node* assignment : children<mof::Assignment>(node)) {
            NamedValue property = buildAssignment(*assignment, *declared);
            if (findNamed(instance.properties, property.name) != nullptr) {
                fail(*assignment, property.name.string() + " is given twice");
            }
            instance.properties.push_back(std::move(property));
        }
        complete(instance, *declared, node);
        if (const Node* clause = findChild<mof::AliasClause>(node)) {
            aliases.insert_or_assign(findChild<mof::Alias>(*clause)->string(), instance.path);
        }
        schema.add(std::move(instance));
    }

    NamedValue buildAssignment(const Node& assignment, const Class& declared) const {
        const Node& name = *findChild<mof::AssignedName>(assignment);
        const Property* property = declared.findProperty(name.string_view());
        if (property == nullptr) {
            fail(name, "class " + declared.name + " has no property " + name.string());
        }
        return {property->name, readValue(*initializerOf(assignment), *property)};
    }

    Schema& schema;
    std::function<void(const std::string& file)> include;
    std::map<std::string, ObjectPath, cim::NameLess> aliases{};
};

}  // namespace

LoadError errorAt(const tao::pegtl::position& position, const std::string& message) {
    return LoadError(position.source + ":" + std::to_string(position.line) + ":" + std::to_string(position.column) +
                     ": " + message);
}

Literal constantLiteral(const Node& constant) {
    const std::vector<const Node*> parts = children<mof::StringPart>(constant);
    if (!parts.empty()) {
        std::string value;
        for (const Node* part : parts) {
            value += unescaped(part->string_view());
        }
        std::string source = inQuotes(value);
        return {std::move(value), std::move(source)};
    }
    return grammar::readLiteral(*constant.children.front());
}

void buildMof(Schema& schema, const Node& root, std::function<void(const std::string& file)> onInclude) {
    MofBuilder(schema, std::move(onInclude)).build(root);
}

}  // namespace cimhost
