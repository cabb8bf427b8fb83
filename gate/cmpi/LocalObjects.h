#pragma once

#include "Objects.h"

#include <deque>
#include <string>

// Object paths and instances that the gate makes for the provider, without the object manager. Reading them cannot
// fail: if the provider cannot read a key, it uses its first instance. They have only the functions that the provider
// calls.

namespace gate {

/** The keys of a path or the properties of an instance. */
class LocalMembers {
public:
    /** @param notFound the status of a missing member */
    LocalMembers(const Values& values, CMPIrc itsNotFound, CMPIValueState itsState);

    CMPICount count() const { return static_cast<CMPICount>(members.size()); }
    CMPIData find(const char* name, CMPIStatus* rc);
    CMPIData at(CMPICount index, CMPIString** name, CMPIStatus* rc);

private:
    struct Member {
        Member(const Property& itsProperty, std::string itsValue);

        const Property& property;
        StaticString name;
        std::string characters;
        StaticString value;  ///< over the characters
    };

    CMPIData dataOf(Member* member, CMPIStatus* rc) const;

    std::deque<Member> members{};  ///< whose elements stay where they are
    CMPIrc notFound;
    CMPIValueState state;
};

/** An object path. */
class LocalObjectPath {
public:
    LocalObjectPath(std::string itsNameSpace, const Class& itsClass, const Values& itsKeys = {});
    LocalObjectPath(const LocalObjectPath&) = delete;
    LocalObjectPath& operator=(const LocalObjectPath&) = delete;

    const CMPIObjectPath* handle() const { return &path; }

private:
    static CMPIObjectPathFT makeFunctions();
    static CMPIObjectPathFT functions;

    std::string nameSpaceCharacters;
    StaticString nameSpace;
    StaticString className;
    LocalMembers keys;
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
    static CMPIInstanceFT makeFunctions();
    static CMPIInstanceFT functions;

    LocalMembers properties;
    CMPIInstance instance;
};

/**
 * The path as the provider expects it: the class's name as in the MOF, its keys and no others. Fails with
 * CMPI_RC_ERR_INVALID_PARAMETER if a key is missing, since such a path names no instance.
 */
LocalObjectPath localPath(const CMPIObjectPath* path, const Class& named);

}  // namespace gate
