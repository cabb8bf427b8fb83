#include <string_view>

#include "broker/Convert.h"
#include "broker/Encapsulation.h"
#include "broker/FunctionTables.h"
#include "broker/NamedValues.h"
#include "schema/ObjectPathText.h"

namespace cimhost {
namespace {

template <std::string ObjectPath::*part>
CMPIStatus setPart(CMPIObjectPath* path, const char* value) {
    return guarded([&] {
        Shared<ObjectPath>& target = content(path);
        const std::string_view changed = argument(value);
        target.writable().*part = changed;
    });
}

template <std::string ObjectPath::*part>
CMPIString* getPart(const CMPIObjectPath* path, CMPIStatus* rc) {
    return guarded<CMPIString*>(rc, nullptr, [&] {
        const auto& object = self(path);
        return arenaFor(object).make<CMPIString>((**object.content).*part);
    });
}

CMPIStatus addKey(CMPIObjectPath* path, const char* name, const CMPIValue* value, const CMPIType type) {
    return guarded([&] {
        Shared<ObjectPath>& target = content(path);
        const std::string_view key = argument(name);
        Value converted = valueFrom(value, type);
        if (key.empty() || converted.isNull) {
            throw Failure(CMPI_RC_ERR_INVALID_PARAMETER);  // a key always has a value
        }
        setNamed(target.writable().keys, key, std::move(converted));
    });
}

/**
 * Returns the data that `read` finds among the keys, marked as a key. The status is CMPI_RC_ERR_NOT_FOUND for a null
 * key, which some object managers pass to providers.
 */
template <class Read>
CMPIData keyData(const CMPIObjectPath* path, CMPIStatus* rc, Read read) {
    const CMPIData data = guarded(rc, badData(), [&] {
        const auto& object = self(path);
        CMPIData found = read((*object.content)->keys, arenaFor(object));
        found.state = static_cast<CMPIValueState>(found.state | CMPI_keyValue);
        return found;
    });
    if (rc != nullptr && rc->rc == CMPI_RC_OK && (data.state & CMPI_nullValue) != 0) {
        rc->rc = CMPI_RC_ERR_NOT_FOUND;
    }
    return data;
}

CMPIData getKey(const CMPIObjectPath* path, const char* name, CMPIStatus* rc) {
    return keyData(path, rc, [&](const auto& keys, Arena& arena) { return namedData(keys, name, arena); });
}

CMPIData getKeyAt(const CMPIObjectPath* path, CMPICount index, CMPIString** name, CMPIStatus* rc) {
    return keyData(path, rc, [&](const auto& keys, Arena& arena) { return namedDataAt(keys, index, name, arena); });
}

CMPICount getKeyCount(const CMPIObjectPath* path, CMPIStatus* rc) {
    return guarded<CMPICount>(rc, 0, [&] { return static_cast<CMPICount>(content(path)->keys.size()); });
}

/** Copies the namespace and the class name of a path. @return the content of the target */
ObjectPath& copyClass(CMPIObjectPath* path, const CMPIObjectPath* source) {
    ObjectPath& target = content(path).writable();
    const ObjectPath& from = argument(source);
    target.nameSpace = from.nameSpace;
    target.className = from.className;
    return target;
}

CMPIStatus setNameSpaceFromObjectPath(CMPIObjectPath* path, const CMPIObjectPath* source) {
    return guarded([&] { copyClass(path, source); });
}

CMPIStatus setHostAndNameSpaceFromObjectPath(CMPIObjectPath* path, const CMPIObjectPath* source) {
    return guarded([&] {
        ObjectPath& target = copyClass(path, source);
        target.host = argument(source)->host;
    });
}

// Qualifiers are not supported, as the broker's capabilities state.

template <class... Names>
CMPIData noQualifier(const CMPIObjectPath* path, Names..., CMPIStatus* rc) {
    return guarded(rc, badData(), [&]() -> CMPIData {
        self(path);
        throw Failure(CMPI_RC_ERR_NOT_SUPPORTED);
    });
}

CMPIString* toString(const CMPIObjectPath* path, CMPIStatus* rc) {
    return guarded<CMPIString*>(rc, nullptr, [&] {
        const auto& object = self(path);
        return arenaFor(object).make<CMPIString>(formatObjectPath(**object.content));
    });
}

}  // namespace

const CMPIObjectPathFT objectPathTable{tableVersion,
                                       releaseObject<CMPIObjectPath>,
                                       cloneObject<CMPIObjectPath>,
                                       setPart<&ObjectPath::nameSpace>,
                                       getPart<&ObjectPath::nameSpace>,
                                       setPart<&ObjectPath::host>,
                                       getPart<&ObjectPath::host>,
                                       setPart<&ObjectPath::className>,
                                       getPart<&ObjectPath::className>,
                                       addKey,
                                       getKey,
                                       getKeyAt,
                                       getKeyCount,
                                       setNameSpaceFromObjectPath,
                                       setHostAndNameSpaceFromObjectPath,
                                       noQualifier<const char*>,
                                       noQualifier<const char*, const char*>,
                                       noQualifier<const char*, const char*>,
                                       noQualifier<const char*, const char*, const char*>,
                                       toString};

}  // namespace cimhost
