#include "LocalObjects.h"

#include <algorithm>

namespace gate {

namespace {

constexpr CMPIData noData{CMPI_null, CMPI_notFound | CMPI_nullValue, {}};

void setStatus(CMPIStatus* rc, CMPIrc code) {
    if (rc != nullptr) {
        *rc = {code, nullptr};
    }
}

LocalMembers::iterator find(LocalMembers& members, const char* name) {
    return std::find_if(members.begin(), members.end(),
                        [&](const LocalMember& member) { return sameName(member.name.get(), name); });
}

/** The data of a member or, with that code, of none. */
CMPIData dataAt(LocalMembers& members, LocalMembers::iterator member, CMPIValueState state, CMPIStatus* rc,
                CMPIrc codeForNone) {
    const bool isFound = member != members.end();
    setStatus(rc, isFound ? CMPI_RC_OK : codeForNone);
    return isFound ? member->data(state) : noData;
}

void add(LocalMembers& members, const Values& values) {
    for (const auto& [property, value] : values) {
        const CMPIType type = property->type == CMPI_dateTime ? CMPIType{CMPI_string} : property->type;
        members.emplace_back(property->name, type, value);
    }
}

}  // namespace

CMPIData LocalMember::data(CMPIValueState state) {
    CMPIData data{type, state, {}};
    if (type == CMPI_string) {
        data.value.string = value.handle();
    } else {
        data.value = scalarFrom(value.get(), type);
    }
    return data;
}

struct LocalObjectPath::Functions {
    static LocalObjectPath& of(const CMPIObjectPath* path) { return *static_cast<LocalObjectPath*>(path->hdl); }

    template <LocalString LocalObjectPath::*part>
    static CMPIString* get(const CMPIObjectPath* path, CMPIStatus* rc) {
        setStatus(rc, CMPI_RC_OK);
        return (of(path).*part).handle();
    }

    static CMPIData getKey(const CMPIObjectPath* path, const char* name, CMPIStatus* rc) {
        LocalMembers& keys = of(path).keys;
        return dataAt(keys, find(keys, name), CMPI_keyValue, rc, CMPI_RC_ERR_NOT_FOUND);
    }

    static CMPIData getKeyAt(const CMPIObjectPath* path, CMPICount index, CMPIString** name, CMPIStatus* rc) {
        LocalMembers& keys = of(path).keys;
        const auto key = index < keys.size() ? keys.begin() + index : keys.end();
        if (name != nullptr && key != keys.end()) {
            *name = key->name.handle();
        }
        return dataAt(keys, key, CMPI_keyValue, rc, CMPI_RC_ERR_NOT_FOUND);
    }

    static CMPICount getKeyCount(const CMPIObjectPath* path, CMPIStatus* rc) {
        setStatus(rc, CMPI_RC_OK);
        return static_cast<CMPICount>(of(path).keys.size());
    }

    static CMPIObjectPathFT makeTable() {
        CMPIObjectPathFT table{};
        table.ftVersion = CMPIVersion200;
        table.getNameSpace = &get<&LocalObjectPath::nameSpace>;
        table.getClassName = &get<&LocalObjectPath::className>;
        table.getKey = &getKey;
        table.getKeyAt = &getKeyAt;
        table.getKeyCount = &getKeyCount;
        return table;
    }

    static inline CMPIObjectPathFT table = makeTable();
};

LocalObjectPath::LocalObjectPath(std::string itsNameSpace, const Class& itsClass, const Values& itsKeys)
    : nameSpace(std::move(itsNameSpace)), className(itsClass.name), path{this, &Functions::table} {
    add(keys, itsKeys);
}

std::string LocalObjectPath::key(const char* name) const {
    const auto found = std::find_if(keys.begin(), keys.end(),
                                    [&](const LocalMember& member) { return sameName(member.name.get(), name); });
    return found == keys.end() ? std::string() : found->value.get();
}

struct LocalInstance::Functions {
    static CMPIData getProperty(const CMPIInstance* instance, const char* name, CMPIStatus* rc) {
        LocalMembers& properties = static_cast<LocalInstance*>(instance->hdl)->properties;
        return dataAt(properties, find(properties, name), CMPI_goodValue, rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    }

    static CMPIInstanceFT makeTable() {
        CMPIInstanceFT table{};
        table.ftVersion = CMPIVersion200;
        table.getProperty = &getProperty;
        return table;
    }

    static inline CMPIInstanceFT table = makeTable();
};

LocalInstance::LocalInstance(const Values& values) : instance{this, &Functions::table} {
    add(properties, values);
}

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
