#include "Objects.h"

#include <charconv>
#include <system_error>

namespace gate {

std::string managerFailure(const char* task, const CMPIStatus& status) {
    std::string message = std::string("The object manager could not ") + task;
    if (status.rc != CMPI_RC_OK) {
        message += ": code " + std::to_string(status.rc);
        const std::string reason = toString(status.msg);
        message += reason.empty() ? "" : ", " + reason;
    }
    return message + ".";
}

void require(bool isDone, const char* task, const CMPIStatus& status) {
    if (!isDone) {
        fail(CMPI_RC_ERR_FAILED, managerFailure(task, status));
    }
}

std::string classNameOf(const CMPIObjectPath* path) {
    return toString(demand<&CMPIObjectPathFT::getClassName>("return the class of a path", path));
}

std::string nameSpaceOf(const CMPIObjectPath* path) {
    return toString(demand<&CMPIObjectPathFT::getNameSpace>("return the namespace of a path", path));
}

CMPICount keyCountOf(const CMPIObjectPath* path) {
    return demand<&CMPIObjectPathFT::getKeyCount>("count the keys of a path", path);
}

const CMPIObjectPath* pathOf(const CMPIInstance* instance) {
    const auto answer = ask<&CMPIInstanceFT::getObjectPath>(instance);
    require(answer.isOk() && answer.value != nullptr, "return the path of an instance", answer.status);
    return answer.value;
}

CMPIObjectPath* makePath(const CMPIBroker* broker, const std::string& nameSpace, const char* className) {
    CMPIObjectPath* path = make<&CMPIBrokerEncFT::newObjectPath>(broker, nameSpace.c_str(), className);
    require(path != nullptr, "create an object path");
    return path;
}

CMPIInstance* makeInstance(const CMPIBroker* broker, const CMPIObjectPath* path) {
    CMPIInstance* instance = make<&CMPIBrokerEncFT::newInstance>(broker, path);
    require(instance != nullptr, "create an instance");
    return instance;
}

namespace {

/** Whether a value is accepted for a property of a type. Some object managers change the types of values. */
bool isConvertible(const CMPIData& data, CMPIType wanted) {
    const bool isString = data.type == CMPI_string || data.type == CMPI_chars;
    return wanted == CMPI_string     ? isString
           : wanted == CMPI_dateTime ? isString || data.type == CMPI_dateTime
           : wanted == CMPI_boolean  ? data.type == CMPI_boolean
                                     : cim::digitsOf(data).has_value();
}

/** The number that the digits represent; none if it is out of the range of the type. */
std::optional<CMPIUint32> numberIn(const std::string& digits, CMPIType type) {
    CMPIUint32 number = 0;
    const auto error = std::from_chars(digits.data(), digits.data() + digits.size(), number).ec;
    const CMPIUint32 limit = type == CMPI_uint16 ? 0xFFFFU : 0xFFFFFFFFU;
    return error == std::errc() && number <= limit ? std::optional<CMPIUint32>(number) : std::nullopt;
}

/** Whether another path has a key with this name and an equal value. */
bool sameKey(const CMPIData& key, const char* name, const CMPIObjectPath* other) {
    const auto found = ask<&CMPIObjectPathFT::getKey>(other, name);
    require(found.isOk() || isAbsent(found.status), "return the keys of a path", found.status);
    if (key.type == CMPI_ref) {
        const CMPIObjectPath* target = referenceOf(other, name);
        return target != nullptr && samePath(key.value.ref, target);
    }
    const CMPIType type = key.type == CMPI_chars ? CMPI_string : key.type;
    const auto value = cim::hasValue(key) ? cim::charactersOf(key) : std::nullopt;
    return value && value == keyOf(other, name, type);
}

}  // namespace

std::optional<std::string> propertyOf(const CMPIInstance* instance, const Property& property) {
    const auto [data, status] = ask<&CMPIInstanceFT::getProperty>(instance, property.name);
    if (isAbsent(status)) {
        return std::nullopt;
    }
    requireOk((std::string("return the value of ") + property.name).c_str(), status);
    if (!cim::hasValue(data)) {
        return std::nullopt;
    }
    failIf(!isConvertible(data, property.type), CMPI_RC_ERR_TYPE_MISMATCH, property.name,
           ": the value has another type than the property.");
    auto characters = cim::charactersOf(data);
    if (cim::digitsOf(data) && !numberIn(*characters, property.type)) {
        fail(CMPI_RC_ERR_TYPE_MISMATCH, property.name, ": ", *characters,
             " is out of the range of the property's type.");
    }
    return characters;
}

std::optional<std::string> keyOf(const CMPIObjectPath* path, const char* key, CMPIType type) {
    const auto answer = ask<&CMPIObjectPathFT::getKey>(path, key);
    const bool isUsable = answer.isOk() && cim::hasValue(answer.value) && isConvertible(answer.value, type);
    return isUsable ? cim::charactersOf(answer.value) : std::nullopt;
}

CMPIObjectPath* referenceOf(const CMPIObjectPath* path, const char* key) {
    const auto answer = ask<&CMPIObjectPathFT::getKey>(path, key);
    const bool isUsable = answer.isOk() && cim::hasValue(answer.value) && answer.value.type == CMPI_ref;
    return isUsable ? answer.value.value.ref : nullptr;
}

bool samePath(const CMPIObjectPath* left, const CMPIObjectPath* right) {
    const CMPICount count = keyCountOf(left);
    if (count == 0 || count != keyCountOf(right) || !sameName(classNameOf(left), classNameOf(right))) {
        return false;
    }
    const std::string leftSpace = nameSpaceOf(left);
    const std::string rightSpace = nameSpaceOf(right);
    if (!leftSpace.empty() && !rightSpace.empty() && !sameName(leftSpace, rightSpace)) {
        return false;
    }
    for (CMPICount index = 0; index < count; ++index) {
        CMPIString* name = nullptr;
        const CMPIData key = demand<&CMPIObjectPathFT::getKeyAt>("return the keys of a path", left, index, &name);
        if (!sameKey(key, toString(name).c_str(), right)) {
            return false;
        }
    }
    return true;
}

LocalObject::LocalObject(std::string itsNameSpace, const Class& itsClass, Values itsValues)
    : nameSpaceCharacters(std::move(itsNameSpace)), className(itsClass.name), values(std::move(itsValues)) {
    for (const auto& [property, value] : values) {
        const CMPIType type = property->type == CMPI_dateTime ? CMPIType{CMPI_string} : property->type;
        members.push_back({property->name, type, value});
    }
}

CMPIData LocalObject::dataOf(Member* member, CMPIValueState state, CMPIrc notFound, CMPIStatus* rc) {
    setStatus(rc, member == nullptr ? notFound : CMPI_RC_OK);
    if (member == nullptr) {
        return {CMPI_null, CMPI_notFound | CMPI_nullValue, {}};
    }
    CMPIValue value{};
    if (member->type == CMPI_string) {
        value.string = member->valueString.handle();
    } else if (member->type == CMPI_boolean) {
        value.boolean = member->characters == "true" ? 1 : 0;
    } else {  // all writable integers of the classes are uint32
        value.uint32 = numberIn(member->characters, CMPI_uint32).value_or(0);
    }
    return {member->type, state, value};
}

CMPIObjectPathFT LocalObject::pathFunctions = [] {
    CMPIObjectPathFT table{};
    table.ftVersion = CMPIVersion200;
    table.getNameSpace = [](const CMPIObjectPath* self, CMPIStatus* rc) {
        setStatus(rc, CMPI_RC_OK);
        return of(self).nameSpace.handle();
    };
    table.getClassName = [](const CMPIObjectPath* self, CMPIStatus* rc) {
        setStatus(rc, CMPI_RC_OK);
        return of(self).className.handle();
    };
    table.getKey = [](const CMPIObjectPath* self, const char* name, CMPIStatus* rc) {
        return dataOf(cim::findNamed(of(self).members, name), CMPI_keyValue, CMPI_RC_ERR_NOT_FOUND, rc);
    };
    table.getKeyAt = [](const CMPIObjectPath* self, CMPICount index, CMPIString** name, CMPIStatus* rc) {
        LocalObject& object = of(self);
        Member* member = index < object.members.size() ? &object.members[index] : nullptr;
        if (name != nullptr && member != nullptr) {
            *name = member->nameString.handle();
        }
        return dataOf(member, CMPI_keyValue, CMPI_RC_ERR_NOT_FOUND, rc);
    };
    table.getKeyCount = [](const CMPIObjectPath* self, CMPIStatus* rc) {
        setStatus(rc, CMPI_RC_OK);
        return static_cast<CMPICount>(of(self).members.size());
    };
    return table;
}();

CMPIInstanceFT LocalObject::instanceFunctions = [] {
    CMPIInstanceFT table{};
    table.ftVersion = CMPIVersion200;
    table.getProperty = [](const CMPIInstance* self, const char* name, CMPIStatus* rc) {
        return dataOf(cim::findNamed(of(self).members, name), CMPI_goodValue, CMPI_RC_ERR_NO_SUCH_PROPERTY, rc);
    };
    return table;
}();

LocalObject localPath(const CMPIObjectPath* path, const Class& named) {
    Values keys;
    for (const Property& property : named) {
        if (property.isKey) {
            const auto value = keyOf(path, property.name, property.type);
            failIf(!value, CMPI_RC_ERR_INVALID_PARAMETER, "The path of a ", named.name, " needs the key ",
                   property.name, " as a string.");
            keys.emplace_back(&property, *value);
        }
    }
    return LocalObject(nameSpaceOf(path), named, keys);
}

}  // namespace gate
