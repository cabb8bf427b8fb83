#include "schema/TypedElement.h"

#include "schema/Errors.h"
#include "schema/ObjectPathText.h"

namespace cimhost {
namespace {

Scalar reference(const Literal& literal, const Property& property, const Schema& schema,
                 const std::string& defaultNameSpace) {
    const auto* uri = std::get_if<std::string>(&literal.value);
    if (uri == nullptr) {
        throw ValueError(literal.source + " is not a reference: write the path of a " + property.referenceClass +
                         " in quotation marks, such as \"" + property.referenceClass + ".Key=\\\"x\\\"\"");
    }
    auto path = std::make_shared<ObjectPath>(parseObjectPath(*uri, schema, defaultNameSpace));
    const bool known = schema.findClass(path->className) != nullptr && schema.findClass(property.referenceClass);
    if (known && !schema.isA(path->className, property.referenceClass)) {
        throw ValueError(property.name + " must refer to a " + property.referenceClass + ", not to a " +
                         path->className);
    }
    return std::shared_ptr<const ObjectPath>(std::move(path));
}

}  // namespace

Scalar typedElement(const Literal& literal, const Property& property, const Schema& schema,
                    const std::string& defaultNameSpace) {
    if (property.type == CMPI_ref && !std::holds_alternative<std::monostate>(literal.value)) {
        return reference(literal, property, schema, defaultNameSpace);
    }
    return typedScalar(literal, property.type);
}

}  // namespace cimhost
