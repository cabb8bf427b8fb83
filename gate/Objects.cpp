#include "Objects.h"

#include "Calls.h"
#include "Values.h"

namespace gate {

namespace {

/** Whether the second path has that key of the first one. */
bool sameKey(const CMPIData& key, const char* name, const CMPIObjectPath* other) {
    const CMPIStatus status = ask<&CMPIObjectPathFT::getKey>(other, name).status;
    require(status.rc == CMPI_RC_OK || saysAbsent(status), "give the keys of a path", status);
    if (key.type == CMPI_ref) {
        const CMPIObjectPath* target = referenceOf(other, name);
        return target != nullptr && samePath(key.value.ref, target);
    }
    const CMPIType type = key.type == CMPI_chars ? CMPI_string : key.type;
    const Property property{name, type, true, false, nullptr};
    const auto text = valueOf(key, {CMPI_RC_OK, nullptr}, property);
    return text && text == keyOf(other, property);
}

}  // namespace

CMPICount keyCountOf(const CMPIObjectPath* path) {
    const auto answer = ask<&CMPIObjectPathFT::getKeyCount>(path);
    require(answer.isOk(), "count the keys of a path", answer.status);
    return answer.value;
}

std::string classNameOf(const CMPIObjectPath* path) {
    const auto answer = ask<&CMPIObjectPathFT::getClassName>(path);
    require(answer.isOk(), "give the class of a path", answer.status);
    return textOf(answer.value);
}

std::string nameSpaceOf(const CMPIObjectPath* path) {
    const auto answer = ask<&CMPIObjectPathFT::getNameSpace>(path);
    require(answer.isOk(), "give the namespace of a path", answer.status);
    return textOf(answer.value);
}

CMPIObjectPath* makePath(const CMPIBroker* broker, const std::string& nameSpace, const char* className) {
    CMPIObjectPath* path = make<&CMPIBrokerEncFT::newObjectPath>(broker, nameSpace.c_str(), className);
    require(path != nullptr, "make an object path");
    return path;
}

CMPIInstance* makeInstance(const CMPIBroker* broker, const CMPIObjectPath* path) {
    CMPIInstance* instance = make<&CMPIBrokerEncFT::newInstance>(broker, path);
    require(instance != nullptr, "make an instance");
    return instance;
}

OwnPath namingPath(const CMPIObjectPath* path, const Class& named) {
    OwnPath made(nameSpaceOf(path), named.name);
    for (const Property& property : named) {
        if (!property.isKey) {
            continue;
        }
        auto text = keyOf(path, property);
        if (!text) {
            fail(CMPI_RC_ERR_INVALID_PARAMETER,
                 std::string("The path of a ") + named.name + " needs the key " + property.name + " as a string.");
        }
        made.addKey(property.name, std::move(*text));
    }
    return made;
}

const CMPIObjectPath* pathOf(const CMPIInstance* instance) {
    const auto answer = ask<&CMPIInstanceFT::getObjectPath>(instance);
    require(answer.isOk() && answer.value != nullptr, "give the path of an instance", answer.status);
    return answer.value;
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
        const auto key = ask<&CMPIObjectPathFT::getKeyAt>(left, index, &name);
        require(key.isOk(), "give the keys of a path", key.status);
        if (!sameKey(key.value, textOf(name).c_str(), right)) {
            return false;
        }
    }
    return true;
}

}  // namespace gate
