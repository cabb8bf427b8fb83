#pragma once

#include <cmpift.h>

#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "Failure.h"
#include "Schema.h"
#include "cim/CmpiAccess.h"

// Calls to functions of the object manager and of its paths and instances, which it frees when the request ends. Paths
// and instances that the gate creates itself.

namespace gate {

using cim::ask;
using cim::make;
using cim::tell;

/** The characters of a string; empty if the string, its function table or its characters are missing. */
inline std::string toString(const CMPIString* string) {
    return cim::charactersOf(string).value_or(std::string());
}

/** Whether a status says that a key or property does not exist. */
inline bool isAbsent(const CMPIStatus& status) {
    return status.rc == CMPI_RC_ERR_NOT_FOUND || status.rc == CMPI_RC_ERR_NO_SUCH_PROPERTY;
}

/** The message that the object manager could not do a task, with the error code and reason that it returned. */
std::string managerFailure(const char* task, const CMPIStatus& status);

/** Fails with managerFailure() if the object manager could not do a task. */
void require(bool isDone, const char* task, const CMPIStatus& status = {CMPI_RC_OK, nullptr});

/** Fails with managerFailure() unless the status of a task is OK. */
inline void requireOk(const char* task, const CMPIStatus& status) {
    require(status.rc == CMPI_RC_OK, task, status);
}

/** Calls a function of an object and returns its result. Fails with managerFailure() unless its status is OK. */
template <auto function, class Object, class... Arguments>
auto demand(const char* task, Object* object, Arguments... arguments) {
    const auto answer = ask<function>(object, arguments...);
    requireOk(task, answer.status);
    return answer.value;
}

/** @name Reading, creating and extending objects; these functions fail if the object manager fails */
///@{
std::string classNameOf(const CMPIObjectPath* path);
std::string nameSpaceOf(const CMPIObjectPath* path);
CMPICount keyCountOf(const CMPIObjectPath* path);
const CMPIObjectPath* pathOf(const CMPIInstance* instance);

/** A path without keys. */
CMPIObjectPath* makePath(const CMPIBroker* broker, const std::string& nameSpace, const char* className);

/** An instance without properties. */
CMPIInstance* makeInstance(const CMPIBroker* broker, const CMPIObjectPath* path);

inline void addKey(CMPIObjectPath* path, const char* name, const CMPIValue* value, CMPIType type) {
    requireOk("add a key", tell<&CMPIObjectPathFT::addKey>(path, name, value, type));
}

inline void setProperty(const CMPIInstance* instance, const char* name, const CMPIValue* value, CMPIType type) {
    requireOk("set a property", tell<&CMPIInstanceFT::setProperty>(instance, name, value, type));
}
///@}

// The gate compares and checks values of all CIM types as C++ strings: the characters of a string or datetime, the
// decimal digits of an integer, "true" or "false" for a boolean. The schema has the type.

/** Properties and their values. Each property occurs at most once. */
using Values = std::vector<std::pair<const Property*, std::string>>;

/**
 * Returns the value of a property; none if it is absent or null. Fails with CMPI_RC_ERR_TYPE_MISMATCH if the value has
 * another type or is out of range, and with managerFailure() if the object manager cannot read it.
 */
std::optional<std::string> propertyOf(const CMPIInstance* instance, const Property& property);

/** Returns the values of the wanted properties, except those without a value. */
template <class IsWanted>
Values valuesOf(const CMPIInstance* instance, const Class& requested, IsWanted isWanted) {
    Values values;
    for (const Property& property : requested) {
        if (const auto value = isWanted(property) ? propertyOf(instance, property) : std::nullopt) {
            values.emplace_back(&property, *value);
        }
    }
    return values;
}

/** The value of a key that is not a reference; none if the key is missing, has another type or cannot be read. */
std::optional<std::string> keyOf(const CMPIObjectPath* path, const char* key, CMPIType type);

/** The path of the object that a key refers to; null if there is none. */
CMPIObjectPath* referenceOf(const CMPIObjectPath* path, const char* key);

/** Whether two paths have keys and name the same instance. Compares namespaces only if both paths have one. */
bool samePath(const CMPIObjectPath* left, const CMPIObjectPath* right);

/**
 * An object path or an instance that the gate creates for the provider, without the object manager, so that reading it
 * cannot fail: a provider that cannot read a key would use its first instance instead. Has only the functions that the
 * provider calls.
 */
class LocalObject {
public:
    /** @param itsValues the keys of a path or the properties of an instance */
    LocalObject(std::string itsNameSpace, const Class& itsClass, Values itsValues = {});
    LocalObject(const LocalObject&) = delete;
    LocalObject& operator=(const LocalObject&) = delete;

    const CMPIObjectPath* path() const { return &pathHandle; }

    /** The object as an instance, from which properties are read by name. Datetimes are strings. */
    const CMPIInstance* instance() const { return &instanceHandle; }

private:
    struct Member {
        const char* name;
        CMPIType type;
        const std::string& characters;
        StaticString nameString{name};
        StaticString valueString{characters.c_str()};
    };

    template <class Handle>
    static LocalObject& of(const Handle* handle) {
        return *static_cast<LocalObject*>(handle->hdl);
    }

    static CMPIData dataOf(Member* member, CMPIValueState state, CMPIrc notFound, CMPIStatus* rc);
    static CMPIObjectPathFT pathFunctions;
    static CMPIInstanceFT instanceFunctions;

    std::string nameSpaceCharacters;
    StaticString nameSpace{nameSpaceCharacters.c_str()};
    StaticString className;
    const Values values;
    std::vector<Member> members{};  ///< one per value
    CMPIObjectPath pathHandle{this, &pathFunctions};
    CMPIInstance instanceHandle{this, &instanceFunctions};
};

/**
 * The path as the provider expects it: the class name spelled as in the MOF, and only the keys of the class. Fails with
 * CMPI_RC_ERR_INVALID_PARAMETER if a key is missing or has another type, since such a path names no instance.
 */
LocalObject localPath(const CMPIObjectPath* path, const Class& named);

}  // namespace gate
