#include "lab/emulation/RequestAdaptation.h"

#include <algorithm>
#include <iterator>
#include <memory>

#include "broker/NamedValues.h"
#include "cim/Names.h"

namespace cimhost::lab {
namespace {

using ClassPointer = std::shared_ptr<const ClassInfo>;

bool hasPropertyList(Operation operation) {
    switch (operation) {
        case Operation::enumerateInstances:
        case Operation::getInstance:
        case Operation::modifyInstance:
        case Operation::associators:
        case Operation::references:
            return true;
        default:
            return false;
    }
}

void trim(std::string& string, const std::function<bool(char)>& isRemoved) {
    string.erase(std::find_if_not(string.rbegin(), string.rend(), isRemoved).base(), string.end());
    string.erase(string.begin(), std::find_if_not(string.begin(), string.end(), isRemoved));
}

void trim(Scalar& scalar, const std::function<bool(char)>& isRemoved) {
    if (auto* string = std::get_if<std::string>(&scalar)) {
        trim(*string, isRemoved);
    }
}

void trim(std::vector<NamedValue>& values, const std::function<bool(char)>& isRemoved) {
    for (NamedValue& each : values) {
        trim(each.value.single, isRemoved);
        if (each.value.isArray) {
            const ScalarRange sent = each.value.elements();
            std::vector<Scalar> elements(sent.begin(), sent.end());
            for (Scalar& element : elements) {
                trim(element, isRemoved);
            }
            each.value.items = std::move(elements);
        }
    }
}

/** The value of a property that the client did not set. */
Value unsetValue(const PropertyInfo& property, const Value& unsetString) {
    const bool isSingleString = property.type == CMPI_string && !property.isArray;
    return isSingleString ? unsetString : Value::null(property.type, property.isArray);
}

/** All properties of the class in its order, then the sent properties that the class does not have. */
std::vector<NamedValue> allProperties(const std::vector<NamedValue>& sent, const ClassInfo& known,
                                      const Value& unsetString) {
    std::vector<NamedValue> all;
    for (const PropertyInfo& property : known.properties) {
        const NamedValue* found = findNamed(sent, property.name);
        const bool isSet = found != nullptr && !found->value.isNull;
        all.push_back(isSet ? *found : NamedValue{property.name, unsetValue(property, unsetString)});
    }
    std::copy_if(sent.begin(), sent.end(), std::back_inserter(all),
                 [&](const NamedValue& each) { return findNamed(all, each.name) == nullptr; });
    return all;
}

Value creationKeyValue(const Value& sent, CreationKey form) {
    if (form == CreationKey::asSent) {
        return sent;
    }
    return form == CreationKey::empty && sent.type == CMPI_string ? Value::of("") : Value::null(sent.type);
}

/** Adds the keys of the class to the path of a creation. */
void addCreationKeys(Request& request, const ClassInfo* known, const Value& unsetString, CreationKey form) {
    std::vector<NamedValue>& keys = request.path.keys;
    for (const PropertyInfo& property : known == nullptr ? std::vector<PropertyInfo>{} : known->properties) {
        const NamedValue* sent = findNamed(request.instance.properties, property.name);
        if (property.isKey && findNamed(keys, property.name) == nullptr) {
            keys.push_back({property.name, sent == nullptr ? unsetValue(property, unsetString) : sent->value});
        }
    }
    for (NamedValue& key : keys) {
        key.value = creationKeyValue(key.value, form);
    }
}

void addNames(std::vector<std::string>& names, const ClassInfo& known, bool onlyKeys) {
    for (const PropertyInfo& property : known.properties) {
        const bool isListed = std::any_of(names.begin(), names.end(),
                                          [&](const std::string& each) { return cim::sameName(each, property.name); });
        if (!isListed && (property.isKey || !onlyKeys)) {
            names.push_back(property.name);
        }
    }
}

/** The classes that the instances of the response can have. */
std::vector<ClassPointer> resultClasses(const Request& request, const Broker& broker) {
    if (!isAssociationOperation(request.operation)) {
        return {broker.classInfo(request.path.className)};
    }
    if (request.filter.resultClass) {
        return {broker.classInfo(*request.filter.resultClass)};
    }
    std::vector<ClassPointer> classes;
    const ClassPointer association = broker.classInfo(request.filter.associationClass.value_or(std::string{}));
    for (const PropertyInfo& end : association ? association->properties : std::vector<PropertyInfo>{}) {
        if (!end.referenceClass.empty()) {
            classes.push_back(broker.classInfo(end.referenceClass));
        }
    }
    return classes;
}

}  // namespace

void trimStrings(Request& request, const std::function<bool(char)>& isRemoved) {
    trim(request.path.keys, isRemoved);
    trim(request.instance.properties, isRemoved);
}

void completeInstance(Request& request, const Broker& broker, const Value& unsetString, CreationKey creationKey) {
    const bool isCreation = request.operation == Operation::createInstance;
    if (!isCreation && request.operation != Operation::modifyInstance) {
        return;
    }
    const ClassPointer known = broker.classInfo(request.path.className);
    if (isCreation) {
        addCreationKeys(request, known.get(), unsetString, creationKey);
        request.instance.path = request.path;
    }
    if (known) {
        request.instance.properties = allProperties(request.instance.properties, *known, unsetString);
    }
}

void completePropertyList(Request& request, const Broker& broker) {
    const bool isSent = request.properties.has_value();
    if (!hasPropertyList(request.operation) || (isSent && request.operation != Operation::modifyInstance)) {
        return;
    }
    std::vector<std::string>& names = isSent ? *request.properties : request.properties.emplace();
    for (const ClassPointer& known : resultClasses(request, broker)) {
        if (known) {
            addNames(names, *known, isSent);
        }
    }
}

}  // namespace cimhost::lab
