#include <algorithm>
#include <string_view>

#include "broker/Convert.h"
#include "broker/Encapsulation.h"
#include "broker/FunctionTables.h"
#include "broker/NamedValues.h"
#include "cim/Names.h"

namespace cimhost {
namespace {

bool isKey(const InstanceContent& instance, std::string_view name) {
    const PropertyInfo* property = instance.classInfo ? findNamed(instance.classInfo->properties, name) : nullptr;
    return property != nullptr ? property->isKey : findNamed(instance.value->path.keys, name) != nullptr;
}

/** Whether the property filter accepts a property. Unless it filters keys, it accepts them all. */
bool accepts(const InstanceContent& instance, std::string_view name) {
    const PropertyList& list = instance.accepted;
    return !list || (!instance.filtersKeys && isKey(instance, name)) ||
           std::any_of(list->begin(), list->end(), [&](const std::string& each) { return cim::sameName(each, name); });
}

/** The declaration of a property. Checks the next unset one first, since providers usually follow the class's order. */
const PropertyInfo& declarationOf(const InstanceContent& target, std::string_view name) {
    const auto& properties = target.classInfo->properties;
    if (target.unset < properties.size() && cim::sameName(properties[target.unset].name, name)) {
        return properties[target.unset];
    }
    const PropertyInfo* property = findNamed(properties, name);
    if (property == nullptr) {
        throw Failure(CMPI_RC_ERR_NO_SUCH_PROPERTY,
                      target.classInfo->name + " has no property " + std::string(name) + ".");
    }
    return *property;
}

/** @throws Failure if the type of the value is not that of the property */
void checkType(const InstanceContent& target, const PropertyInfo& property, const Value& value) {
    const bool isUntypedNull = value.isNull && value.type == CMPI_null;
    if (!isUntypedNull && (value.type != property.type || value.isArray != property.isArray)) {
        throw Failure(CMPI_RC_ERR_TYPE_MISMATCH,
                      target.classInfo->name + "." + property.name.string() + " has another type.");
    }
}

/** Removes a property that the broker added, since the order is that in which the provider sets properties. */
void removeInitial(InstanceContent& target, std::vector<NamedValue>& values, std::string_view name) {
    const auto end = values.begin() + static_cast<std::ptrdiff_t>(target.initialCount);
    const auto found =
        std::find_if(values.begin(), end, [&](const NamedValue& each) { return cim::sameName(each.name, name); });
    if (found != end) {
        values.erase(found);
        --target.initialCount;
    }
}

/** Sets a property of an instance whose class is unknown. */
void setUnchecked(InstanceContent& target, std::string_view name, Value&& value) {
    if (accepts(target, name)) {
        setNamed(target.value.writable().properties, name, std::move(value));
    }
}

/** Sets a property of a known class. @throws Failure if the class does not declare it, or with another type */
void setDeclared(InstanceContent& target, std::string_view name, Value&& value) {
    const PropertyInfo& property = declarationOf(target, name);
    checkType(target, property, value);
    if (!accepts(target, name)) {
        return;
    }
    const auto position = static_cast<std::size_t>(&property - target.classInfo->properties.data());
    std::vector<NamedValue>& values = target.value.writable().properties;
    if (property.isKey) {
        removeInitial(target, values, name);
    }
    if (position < target.unset) {
        return setNamed(values, name, std::move(value));
    }
    values.emplace_back(property.name == name ? property.name : Name(std::string(name)), std::move(value));
    target.unset = position + 1;
}

CMPIStatus setProperty(const CMPIInstance* instance, const char* name, const CMPIValue* value, CMPIType type) {
    return guarded([&] {
        InstanceContent& target = content(instance);
        const std::string_view property = argument(name);
        if (property.empty()) {
            throw Failure(CMPI_RC_ERR_INVALID_PARAMETER);
        }
        Value converted = valueFrom(value, type);
        if (target.classInfo == nullptr) {
            setUnchecked(target, property, std::move(converted));
        } else {
            setDeclared(target, property, std::move(converted));
        }
    });
}

CMPIStatus setPropertyWithOrigin(const CMPIInstance* instance, const char* name, const CMPIValue* value,
                                 const CMPIType type, const char*) {
    return setProperty(instance, name, value, type);  // the class declares the origin
}

CMPIData asProperty(CMPIData data, const InstanceContent& instance, std::string_view name) {
    if (isKey(instance, name)) {
        data.state = static_cast<CMPIValueState>(data.state | CMPI_keyValue);
    }
    return data;
}

CMPIData getProperty(const CMPIInstance* instance, const char* name, CMPIStatus* rc) {
    return guarded(rc, badData(), [&] {
        const auto& object = self(instance);
        const CMPIData data = namedData(object.content->value->properties, name, arenaFor(object));
        return asProperty(data, *object.content, name);
    });
}

CMPIData getPropertyAt(const CMPIInstance* instance, CMPICount index, CMPIString** name, CMPIStatus* rc) {
    return guarded(rc, badData(), [&] {
        const auto& object = self(instance);
        const auto& properties = object.content->value->properties;
        const CMPIData data = namedDataAt(properties, index, name, arenaFor(object));
        return asProperty(data, *object.content, properties[index].name);
    });
}

CMPICount getPropertyCount(const CMPIInstance* instance, CMPIStatus* rc) {
    return guarded<CMPICount>(rc, 0,
                              [&] { return static_cast<CMPICount>(content(instance).value->properties.size()); });
}

CMPIObjectPath* getObjectPath(const CMPIInstance* instance, CMPIStatus* rc) {
    return guarded<CMPIObjectPath*>(rc, nullptr, [&] {
        const auto& object = self(instance);
        return arenaFor(object).make<CMPIObjectPath>(object.content->value->path);
    });
}

CMPIStatus setObjectPath(CMPIInstance* instance, const CMPIObjectPath* path) {
    return guarded([&] {
        InstanceContent& target = content(instance);
        target.value.writable().path = argument(path);
    });
}

CMPIStatus filter(CMPIInstance* instance, const char** properties, bool filtersKeys) {
    return guarded([&] {
        InstanceContent& target = content(instance);
        target.accepted = propertyListFrom(properties);
        target.filtersKeys = filtersKeys;
        auto& values = target.value.writable().properties;
        const auto isHidden = [&](const NamedValue& each) { return !accepts(target, each.name); };
        const auto initialEnd = values.begin() + static_cast<std::ptrdiff_t>(target.initialCount);
        target.initialCount -= static_cast<std::size_t>(std::count_if(values.begin(), initialEnd, isHidden));
        values.erase(std::remove_if(values.begin(), values.end(), isHidden), values.end());
    });
}

/** The keys parameter is ignored, as the standard permits: the broker knows the keys. */
CMPIStatus setPropertyFilter(CMPIInstance* instance, const char** properties, const char**) {
    return filter(instance, properties, false);
}

}  // namespace

CMPIStatus setPropertyFilterWithKeys(CMPIInstance* instance, const char** properties, const char**) {
    return filter(instance, properties, true);
}

const CMPIInstanceFT instanceTable{tableVersion,
                                   releaseObject<CMPIInstance>,
                                   cloneObject<CMPIInstance>,
                                   getProperty,
                                   getPropertyAt,
                                   getPropertyCount,
                                   setProperty,
                                   getObjectPath,
                                   setPropertyFilter,
                                   setObjectPath,
                                   setPropertyWithOrigin};

}  // namespace cimhost
