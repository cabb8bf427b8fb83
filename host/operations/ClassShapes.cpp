#include "operations/ClassShapes.h"

namespace cimhost {
namespace {

std::shared_ptr<const ClassShape> shapeOf(const Schema& schema, const Class& known) {
    auto shape = std::make_shared<ClassShape>();
    shape->name = known.name;
    for (const Property& property : known.properties) {
        shape->properties.push_back(
            {property.name, property.type, property.isArray, property.isKey(), property.referenceClass});
    }
    for (const Class* super = schema.findClass(known.superclass); super != nullptr;
         super = schema.findClass(super->superclass)) {
        shape->superclasses.push_back(super->name);
    }
    return shape;
}

}  // namespace

ClassShapeLookup classShapes(const Schema& schema) {
    std::map<std::string, std::shared_ptr<const ClassShape>, NameLess> shapes;
    for (const Class* known : schema.classes()) {
        shapes.emplace(known->name, shapeOf(schema, *known));
    }
    return [shapes = std::move(shapes)](const std::string& name) {
        const auto found = shapes.find(name);
        return found == shapes.end() ? nullptr : found->second;
    };
}

}  // namespace cimhost
