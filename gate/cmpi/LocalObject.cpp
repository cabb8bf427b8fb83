#include "LocalObject.h"

namespace gate {

LocalObject::LocalObject(std::string itsNameSpace, const Class& itsClass, const Values& values)
    : nameSpaceCharacters(std::move(itsNameSpace)), className(itsClass.name) {
    for (const auto& [property, value] : values) {
        members.emplace_back(*property, value);
    }
}

CMPIData LocalObject::dataOf(Member* member, CMPIValueState state, CMPIrc notFound, CMPIStatus* rc) {
    setStatus(rc, member == nullptr ? notFound : CMPI_RC_OK);
    if (member == nullptr) {
        return {CMPI_null, CMPI_notFound | CMPI_nullValue, {}};
    }
    CMPIValue value = scalarFrom(member->characters, member->type);
    if (member->type == CMPI_string) {
        value.string = member->valueString.handle();
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
            const auto value = keyOf(path, property);
            failIf(!value, CMPI_RC_ERR_INVALID_PARAMETER, "The path of a ", named.name, " needs the key ",
                   property.name, " as a string.");
            keys.emplace_back(&property, *value);
        }
    }
    return LocalObject(nameSpaceOf(path), named, keys);
}

}  // namespace gate
