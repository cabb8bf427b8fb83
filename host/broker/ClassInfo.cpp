#include "broker/ClassInfo.h"

#include <unordered_map>
#include <utility>

#include "cim/Names.h"
#include "schema/Schema.h"

namespace cimhost {
namespace {

std::shared_ptr<const ClassInfo> infoOf(const Schema& schema, const Class& known) {
    auto info = std::make_shared<ClassInfo>();
    info->name = known.name;
    for (const Property& property : known.properties) {
        info->properties.push_back({Name::declared(property.name), property.type, property.isArray, property.isKey(),
                                    property.referenceClass});
    }
    for (const Class* super = schema.findClass(known.superclass); super != nullptr;
         super = schema.findClass(super->superclass)) {
        info->superclasses.push_back(super->name);
    }
    return info;
}

}  // namespace

ClassInfoLookup classInfos(const Schema& schema) {
    std::unordered_map<std::string, std::shared_ptr<const ClassInfo>, cim::NameHash, cim::NameEqual> infos;
    for (const Class* known : schema.classes()) {
        infos.emplace(known->name, infoOf(schema, *known));
    }
    return [infos = std::move(infos)](const std::string& name) {
        const auto found = infos.find(name);
        return found == infos.end() ? nullptr : found->second;
    };
}

}  // namespace cimhost
