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
        std::string& target = content(path).*part;
        target = argument(value);
    });
}

template <std::string ObjectPath::*part>
CMPIString* getPart(const CMPIObjectPath* path, CMPIStatus* rc) {
    return guarded<CMPIString*>(rc, nullptr, [&] {
        const auto& object = self(path);
        return arenaFor(object).make<CMPIString>((*object.content).*part);
    });
}

CMPIStatus addKey(CMPIObjectPath* path, const char* name, const CMPIValue* value, const CMPIType type) {
    return guarded([&] {
        ObjectPath& target = content(path);
        const std::string key = argument(name);
        Value converted = valueFrom(value, type);
        if (key.empty() || converted.isNull) {
            throw Failure(CMPI_RC_ERR_INVALID_PARAMETER);  // a key always has a value
        }
        setNamed(target.keys, key, std::move(converted));
    });
}

CMPIData asKey(CMPIData data) {
    data.state = static_cast<CMPIValueState>(data.state | CMPI_keyValue);
    return data;
}

/** Sets the status of a null key, which some object managers pass to providers. */
CMPIData withNullStatus(const CMPIData& data, CMPIStatus* rc) {
    if (rc != nullptr && rc->rc == CMPI_RC_OK && (data.state & CMPI_nullValue) != 0) {
        rc->rc = CMPI_RC_ERR_NOT_FOUND;
    }
    return data;
}

CMPIData getKey(const CMPIObjectPath* path, const char* name, CMPIStatus* rc) {
    const CMPIData data = guarded(rc, badData(), [&] {
        const auto& object = self(path);
        return asKey(namedData(object.content->keys, name, arenaFor(object)));
    });
    return withNullStatus(data, rc);
}

CMPIData getKeyAt(const CMPIObjectPath* path, CMPICount index, CMPIString** name, CMPIStatus* rc) {
    const CMPIData data = guarded(rc, badData(), [&] {
        const auto& object = self(path);
        return asKey(namedDataAt(object.content->keys, index, name, arenaFor(object)));
    });
    return withNullStatus(data, rc);
}

CMPICount getKeyCount(const CMPIObjectPath* path, CMPIStatus* rc) {
    return guarded<CMPICount>(rc, 0, [&] { return static_cast<CMPICount>(content(path).keys.size()); });
}

CMPIStatus setNameSpaceFromObjectPath(CMPIObjectPath* path, const CMPIObjectPath* source) {
    return guarded([&] {
        ObjectPath& target = content(path);
        const ObjectPath& from = argument(source);
        target.nameSpace = from.nameSpace;
        target.className = from.className;
    });
}

CMPIStatus setHostAndNameSpaceFromObjectPath(CMPIObjectPath* path, const CMPIObjectPath* source) {
    return guarded([&] {
        ObjectPath& target = content(path);
        const ObjectPath& from = argument(source);
        target.host = from.host;
        target.nameSpace = from.nameSpace;
        target.className = from.className;
    });
}

// Qualifiers are not supported, as the broker's capabilities state.

CMPIData noQualifier(const CMPIObjectPath* path, CMPIStatus* rc) {
    return guarded(rc, badData(), [&]() -> CMPIData {
        self(path);
        throw Failure(CMPI_RC_ERR_NOT_SUPPORTED);
    });
}

CMPIData getClassQualifier(const CMPIObjectPath* path, const char*, CMPIStatus* rc) {
    return noQualifier(path, rc);
}

CMPIData getPropertyOrMethodQualifier(const CMPIObjectPath* path, const char*, const char*, CMPIStatus* rc) {
    return noQualifier(path, rc);
}

CMPIData getParameterQualifier(const CMPIObjectPath* path, const char*, const char*, const char*, CMPIStatus* rc) {
    return noQualifier(path, rc);
}

CMPIString* toString(const CMPIObjectPath* path, CMPIStatus* rc) {
    return guarded<CMPIString*>(rc, nullptr, [&] {
        const auto& object = self(path);
        return arenaFor(object).make<CMPIString>(formatObjectPath(*object.content));
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
                                       getClassQualifier,
                                       getPropertyOrMethodQualifier,
                                       getPropertyOrMethodQualifier,
                                       getParameterQualifier,
                                       toString};

}  // namespace cimhost
