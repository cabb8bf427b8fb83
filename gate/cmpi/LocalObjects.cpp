#include "LocalObjects.h"

#include <algorithm>

namespace gate {

namespace {

template <class Local, class Object>
Local& localOf(const Object* object) {
    return *static_cast<Local*>(object->hdl);
}

}  // namespace

LocalMembers::Member::Member(const Property& itsProperty, std::string itsValue)
    : property(itsProperty), name(itsProperty.name), characters(std::move(itsValue)), value(characters.c_str()) {}

LocalMembers::LocalMembers(const Values& values, CMPIrc itsNotFound, CMPIValueState itsState)
    : notFound(itsNotFound), state(itsState) {
    for (const auto& [property, value] : values) {
        members.emplace_back(*property, value);
    }
}

CMPIData LocalMembers::find(const char* name, CMPIStatus* rc) {
    const auto found = std::find_if(members.begin(), members.end(),
                                    [&](const Member& member) { return sameName(member.property.name, name); });
    return dataOf(found == members.end() ? nullptr : &*found, rc);
}

CMPIData LocalMembers::at(CMPICount index, CMPIString** name, CMPIStatus* rc) {
    Member* member = index < members.size() ? &members[index] : nullptr;
    if (name != nullptr && member != nullptr) {
        *name = member->name.handle();
    }
    return dataOf(member, rc);
}

CMPIData LocalMembers::dataOf(Member* member, CMPIStatus* rc) const {
    setStatus(rc, member == nullptr ? notFound : CMPI_RC_OK);
    if (member == nullptr) {
        return {CMPI_null, CMPI_notFound | CMPI_nullValue, {}};
    }
    const CMPIType type = member->property.type;
    CMPIData data{type == CMPI_dateTime ? CMPIType{CMPI_string} : type, state, {}};
    if (data.type == CMPI_string) {
        data.value.string = member->value.handle();
    } else {
        data.value = scalarFrom(member->characters, type);
    }
    return data;
}

LocalObjectPath::LocalObjectPath(std::string itsNameSpace, const Class& itsClass, const Values& itsKeys)
    : nameSpaceCharacters(std::move(itsNameSpace)),
      nameSpace(nameSpaceCharacters.c_str()),
      className(itsClass.name),
      keys(itsKeys, CMPI_RC_ERR_NOT_FOUND, CMPI_keyValue),
      path{this, &functions} {}

CMPIObjectPathFT LocalObjectPath::makeFunctions() {
    CMPIObjectPathFT table{};
    table.ftVersion = CMPIVersion200;
    table.getNameSpace = [](const CMPIObjectPath* self, CMPIStatus* rc) {
        setStatus(rc, CMPI_RC_OK);
        return localOf<LocalObjectPath>(self).nameSpace.handle();
    };
    table.getClassName = [](const CMPIObjectPath* self, CMPIStatus* rc) {
        setStatus(rc, CMPI_RC_OK);
        return localOf<LocalObjectPath>(self).className.handle();
    };
    table.getKey = [](const CMPIObjectPath* self, const char* name, CMPIStatus* rc) {
        return localOf<LocalObjectPath>(self).keys.find(name, rc);
    };
    table.getKeyAt = [](const CMPIObjectPath* self, CMPICount index, CMPIString** name, CMPIStatus* rc) {
        return localOf<LocalObjectPath>(self).keys.at(index, name, rc);
    };
    table.getKeyCount = [](const CMPIObjectPath* self, CMPIStatus* rc) {
        setStatus(rc, CMPI_RC_OK);
        return localOf<LocalObjectPath>(self).keys.count();
    };
    return table;
}

CMPIObjectPathFT LocalObjectPath::functions = makeFunctions();

LocalInstance::LocalInstance(const Values& values)
    : properties(values, CMPI_RC_ERR_NO_SUCH_PROPERTY, CMPI_goodValue), instance{this, &functions} {}

CMPIInstanceFT LocalInstance::makeFunctions() {
    CMPIInstanceFT table{};
    table.ftVersion = CMPIVersion200;
    table.getProperty = [](const CMPIInstance* self, const char* name, CMPIStatus* rc) {
        return localOf<LocalInstance>(self).properties.find(name, rc);
    };
    return table;
}

CMPIInstanceFT LocalInstance::functions = makeFunctions();

LocalObjectPath localPath(const CMPIObjectPath* path, const Class& named) {
    Values keys;
    for (const Property& property : named) {
        if (!property.isKey) {
            continue;
        }
        auto value = keyOf(path, property);
        if (!value) {
            fail(CMPI_RC_ERR_INVALID_PARAMETER,
                 std::string("The path of a ") + named.name + " needs the key " + property.name + " as a string.");
        }
        keys.emplace_back(&property, std::move(*value));
    }
    return LocalObjectPath(nameSpaceOf(path), named, keys);
}

}  // namespace gate
