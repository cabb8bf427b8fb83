#include "operations/HandedOver.h"

#include <algorithm>
#include <utility>

#include "broker/NamedValues.h"
#include "schema/Names.h"

namespace cimhost {
namespace {

using Shape = std::shared_ptr<const ClassShape>;

bool takesInstance(Operation operation) {
    return operation == Operation::createInstance || operation == Operation::modifyInstance;
}

bool takesPropertyList(Operation operation) {
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

/** Whether a manager drops the character at the end of a text. */
bool isTrimmed(char character, const Profile& profile) {
    const bool isOutsideAscii = static_cast<unsigned char>(character) > 0x7F;
    return (profile.trimsBlanks && character == ' ') || (profile.trimsOutsideAscii && isOutsideAscii);
}

void trim(std::string& text, const Profile& profile) {
    const auto stays = [&](char each) { return !isTrimmed(each, profile); };
    text.erase(std::find_if(text.rbegin(), text.rend(), stays).base(), text.end());
    text.erase(text.begin(), std::find_if(text.begin(), text.end(), stays));
}

void trim(std::vector<NamedValue>& values, const Profile& profile) {
    for (NamedValue& each : values) {
        for (Scalar& element : each.value.elements) {
            if (auto* text = std::get_if<std::string>(&element)) {
                trim(*text, profile);
            }
        }
    }
}

/** The value of a property that the client did not set. */
Value unset(const PropertyShape& property, const Profile& profile) {
    const bool isText = property.type == CMPI_string && !property.isArray;
    return isText && profile.hollowTexts ? hollowText(true) : Value{property.type, property.isArray, true, {}};
}

/** All properties of the class in its order, then what it does not have. */
std::vector<NamedValue> allProperties(const std::vector<NamedValue>& given, const ClassShape& shape,
                                      const Profile& profile) {
    std::vector<NamedValue> all;
    for (const PropertyShape& property : shape.properties) {
        const NamedValue* found = findNamed(given, property.name);
        const bool isSet = found != nullptr && !found->value.isNull;
        all.push_back(isSet ? *found : NamedValue{property.name, unset(property, profile)});
    }
    std::copy_if(given.begin(), given.end(), std::back_inserter(all),
                 [&](const NamedValue& each) { return findNamed(all, each.name) == nullptr; });
    return all;
}

/** What becomes of a key in the path of a new instance. */
Value creationKey(const Value& sent, CreationKey played) {
    if (played == CreationKey::asSent) {
        return sent;
    }
    const bool isEmpty = played == CreationKey::empty && sent.type == CMPI_string;
    return isEmpty ? Value{CMPI_string, false, false, {std::string{}}} : Value{sent.type, false, true, {}};
}

/** The path of a creation: the keys of the class are those of the instance, or say nothing. */
void addCreationKeys(Request& request, const ClassShape* shape, const Profile& profile) {
    std::vector<NamedValue>& keys = request.path.keys;
    for (const PropertyShape& property : shape == nullptr ? std::vector<PropertyShape>{} : shape->properties) {
        const NamedValue* given = findNamed(request.instance.properties, property.name);
        if (property.isKey && findNamed(keys, property.name) == nullptr) {
            keys.push_back({property.name, given == nullptr ? unset(property, profile) : given->value});
        }
    }
    for (NamedValue& key : keys) {
        key.value = creationKey(key.value, profile.creationKey);
    }
}

void addNames(std::vector<std::string>& names, const ClassShape& shape, bool onlyKeys) {
    for (const PropertyShape& property : shape.properties) {
        const bool isThere = std::any_of(names.begin(), names.end(),
                                         [&](const std::string& each) { return sameName(each, property.name); });
        if (!isThere && (property.isKey || !onlyKeys)) {
            names.push_back(property.name);
        }
    }
}

/** The classes that the answer's instances can have. */
std::vector<Shape> resultShapes(const Request& request, const Broker& broker) {
    if (!isAssociationOperation(request.operation)) {
        return {broker.classShape(request.path.className)};
    }
    if (request.filter.resultClass) {
        return {broker.classShape(*request.filter.resultClass)};
    }
    std::vector<Shape> shapes;
    const Shape association = broker.classShape(request.filter.associationClass.value_or(std::string{}));
    for (const PropertyShape& end : association ? association->properties : std::vector<PropertyShape>{}) {
        if (!end.referenceClass.empty()) {
            shapes.push_back(broker.classShape(end.referenceClass));
        }
    }
    return shapes;
}

/** A list names all properties where the client sent none, and that of a modification the keys, too. */
void nameProperties(Request& request, const Broker& broker) {
    const bool isGiven = request.properties.has_value();
    if (isGiven && request.operation != Operation::modifyInstance) {
        return;
    }
    std::vector<std::string>& names = isGiven ? *request.properties : request.properties.emplace();
    for (const Shape& shape : resultShapes(request, broker)) {
        if (shape) {
            addNames(names, *shape, isGiven);
        }
    }
}

void addIfMissing(ContextEntries& entries, const char* name, const Value& value) {
    if (findNamed(entries, name) == nullptr) {
        entries.push_back({name, value});
    }
}

}  // namespace

Request handedOver(Request request, const Broker& broker) {
    const Profile& profile = broker.profile();
    const Shape shape = broker.classShape(request.path.className);
    trim(request.path.keys, profile);
    trim(request.instance.properties, profile);
    if (request.operation == Operation::createInstance && profile.completesInstances) {
        addCreationKeys(request, shape.get(), profile);
    }
    if (request.operation == Operation::createInstance) {
        request.instance.path = request.path;
    }
    if (takesInstance(request.operation) && profile.completesInstances && shape) {
        request.instance.properties = allProperties(request.instance.properties, *shape, profile);
    }
    if (takesPropertyList(request.operation) && profile.namesAllProperties) {
        nameProperties(request, broker);
    }
    if (profile.hollowTexts) {
        addIfMissing(request.context, CMPIPrincipal, hollowText(false));
        addIfMissing(request.context, CMPIRole, hollowText(false));
    }
    return request;
}

}  // namespace cimhost
