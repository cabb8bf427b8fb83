#pragma once

#include <deque>
#include <string>

#include "Objects.h"

namespace gate {

/**
 * An object path or an instance that the gate makes for the provider, without the object manager. Reading it cannot
 * fail: if the provider cannot read a key, it uses its first instance. It has only the functions that the provider
 * calls.
 */
class LocalObject {
public:
    /** @param values the keys of a path or the properties of an instance */
    LocalObject(std::string itsNameSpace, const Class& itsClass, const Values& values = {});
    LocalObject(const LocalObject&) = delete;
    LocalObject& operator=(const LocalObject&) = delete;

    const CMPIObjectPath* path() const { return &pathHandle; }

    /** The object as an instance, from which properties are read by name. Datetimes are strings. */
    const CMPIInstance* instance() const { return &instanceHandle; }

private:
    struct Member {
        Member(const Property& property, std::string itsValue)
            : name(property.name),
              type(property.type == CMPI_dateTime ? CMPIType{CMPI_string} : property.type),
              characters(std::move(itsValue)) {}

        const char* name;
        CMPIType type;
        std::string characters;
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
    std::deque<Member> members{};  ///< whose elements stay where they are
    CMPIObjectPath pathHandle{this, &pathFunctions};
    CMPIInstance instanceHandle{this, &instanceFunctions};
};

/**
 * The path as the provider expects it: the class's name as in the MOF, its keys and no others. Fails with
 * CMPI_RC_ERR_INVALID_PARAMETER if a key is missing, since such a path names no instance.
 */
LocalObject localPath(const CMPIObjectPath* path, const Class& named);

}  // namespace gate
