#include "lab/load/LoadClass.h"

#include "broker/NamedValues.h"
#include "lab/load/Mix.h"
#include "lab/load/Values.h"

namespace cimhost::lab {

ObjectPath LoadClass::instancePath(const std::string& id) const {
    ObjectPath instance = path;
    instance.keys = {{key, Value::of(id)}};
    return instance;
}

std::optional<std::string> LoadClass::idIn(const std::vector<NamedValue>& values) const {
    const NamedValue* found = findNamed(values, key);
    const bool isText = found != nullptr && !found->value.isNull && !found->value.isArray &&
                        !found->value.elements().empty() && std::holds_alternative<std::string>(found->value.single);
    return isText ? std::optional(std::get<std::string>(found->value.single)) : std::nullopt;
}

LoadClass loadClass(const Schema& schema, const ObjectPath& path) {
    const Class* known = schema.findClass(path.className);
    if (known == nullptr) {
        throw PlanError("class " + path.className + " is not in the schema");
    }
    const std::vector<const Property*> keys = known->keys();
    if (keys.size() != 1 || keys.front()->type != CMPI_string) {
        throw PlanError("class " + known->name + " has other keys than one string, so clients cannot name instances");
    }
    LoadClass result{path, keys.front()->name, {}};
    for (const Property& property : known->properties) {
        if (property.isWritable() && !property.isKey() && canMakeValue(property)) {
            result.modifiable.push_back(&property);
        }
    }
    return result;
}

}  // namespace cimhost::lab
