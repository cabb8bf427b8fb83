#pragma once

#include "Objects.h"

#include <deque>
#include <string>

// Object paths and instances that the gate makes for the provider, without the object manager. Reading them cannot
// fail: if the provider cannot read a key, it uses its first instance. They have only the functions that the provider
// calls.

namespace gate {

/** A string as a CMPI object. */
class LocalString {
public:
    explicit LocalString(std::string itsCharacters)
        : characters(std::move(itsCharacters)), string(characters.c_str()) {}
    LocalString(const LocalString&) = delete;
    LocalString& operator=(const LocalString&) = delete;

    const std::string& get() const { return characters; }
    CMPIString* handle() { return string.handle(); }

private:
    std::string characters;
    StaticString string;
};

/** A key or property. */
struct LocalMember {
    LocalMember(const char* itsName, CMPIType itsType, std::string itsValue)
        : name(itsName), type(itsType), value(std::move(itsValue)) {}

    CMPIData data(CMPIValueState state);

    LocalString name;
    CMPIType type;
    LocalString value;
};

using LocalMembers = std::deque<LocalMember>;  // whose elements need not be movable

/** An object path. */
class LocalObjectPath {
public:
    LocalObjectPath(std::string nameSpace, const Class& itsClass, const Values& keys = {});
    LocalObjectPath(const LocalObjectPath&) = delete;
    LocalObjectPath& operator=(const LocalObjectPath&) = delete;

    /** The value of a key; empty if there is none. */
    std::string key(const char* name) const;

    const CMPIObjectPath* handle() const { return &path; }

private:
    struct Functions;

    LocalString nameSpace;
    LocalString className;
    LocalMembers keys{};
    CMPIObjectPath path;
};

/** An instance, from which properties are read by name. Datetimes are strings. */
class LocalInstance {
public:
    explicit LocalInstance(const Values& values);
    LocalInstance(const LocalInstance&) = delete;
    LocalInstance& operator=(const LocalInstance&) = delete;

    const CMPIInstance* handle() const { return &instance; }

private:
    struct Functions;

    LocalMembers properties{};
    CMPIInstance instance;
};

/**
 * The path as the provider expects it: the class's name as in the MOF, its keys and no others. Fails with
 * CMPI_RC_ERR_INVALID_PARAMETER if a key is missing, since such a path names no instance.
 */
LocalObjectPath localPath(const CMPIObjectPath* path, const Class& named);

}  // namespace gate
