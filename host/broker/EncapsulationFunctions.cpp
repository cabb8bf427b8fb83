#include <cstring>

#include "broker/Broker.h"
#include "broker/Convert.h"
#include "broker/DateTimes.h"
#include "broker/ErrorTranslation.h"
#include "broker/FunctionTables.h"
#include "broker/NamedValues.h"
#include "cim/DateTime.h"

// CMPIBrokerEncFT: creates and describes encapsulated objects, and logs. getMessage() is in Messages.cpp.

namespace cimhost {
namespace {

/** The arena for a new object. @throws Failure if the handle is not that of a broker */
Arena& arenaOf(const CMPIBroker* broker) {
    return Broker::of(broker).arena();
}

/** The number of properties that a provider will probably set. Memory for more would make large results slower. */
std::size_t expectedCount(const ClassInfo* classInfo) {
    constexpr std::size_t ofUnknownClass = 16;
    if (classInfo == nullptr) {
        return ofUnknownClass;
    }
    const std::size_t usual = classInfo->usualCount;
    return usual != 0 ? usual : classInfo->properties.size();
}

/** The keys of a path that the class declares; none for an unknown class. The provider sets the other properties. */
std::vector<NamedValue> initialProperties(const ObjectPath& path, const ClassInfo* classInfo) {
    std::vector<NamedValue> properties;
    properties.reserve(expectedCount(classInfo));
    if (classInfo == nullptr) {
        return properties;
    }
    for (const PropertyInfo& property : classInfo->properties) {
        const NamedValue* key = property.isKey ? findNamed(path.keys, property.name) : nullptr;
        if (key != nullptr) {
            properties.emplace_back(property.name, key->value);
        }
    }
    return properties;
}

/** A new instance of a known class has the keys of its path as properties. An instance of an unknown class has none. */
CMPIInstance* newInstance(const CMPIBroker* broker, const CMPIObjectPath* path, CMPIStatus* rc) {
    return guarded<CMPIInstance*>(rc, nullptr, [&] {
        Broker& owner = Broker::of(broker);
        const ObjectPath& itsPath = argument(path);
        auto classInfo = owner.classInfo(itsPath.className);
        auto properties = initialProperties(itsPath, classInfo.get());
        const std::size_t initialCount = properties.size();
        return owner.arena().make<CMPIInstance>(
            {Instance{itsPath, std::move(properties)}, std::move(classInfo), {}, false, initialCount});
    });
}

CMPIObjectPath* newObjectPath(const CMPIBroker* broker, const char* nameSpace, const char* className, CMPIStatus* rc) {
    return guarded<CMPIObjectPath*>(rc, nullptr, [&] {
        Arena& arena = arenaOf(broker);
        return arena.make<CMPIObjectPath>(
            ObjectPath{{}, nameSpace == nullptr ? "" : nameSpace, argument(className), {}});
    });
}

CMPIArgs* newArgs(const CMPIBroker* broker, CMPIStatus* rc) {
    return guarded<CMPIArgs*>(rc, nullptr, [&] { return arenaOf(broker).make<CMPIArgs>({}); });
}

CMPIString* newString(const CMPIBroker* broker, const char* characters, CMPIStatus* rc) {
    return guarded<CMPIString*>(rc, nullptr, [&] { return arenaOf(broker).make<CMPIString>(argument(characters)); });
}

CMPIArray* newArray(const CMPIBroker* broker, CMPICount size, CMPIType type, CMPIStatus* rc) {
    return guarded<CMPIArray*>(rc, nullptr, [&] {
        if ((type & CMPI_ARRAY) != 0) {
            throw Failure(CMPI_RC_ERR_INVALID_DATA_TYPE);
        }
        return arenaOf(broker).make<CMPIArray>({elementType(type), std::vector<Scalar>(size)});
    });
}

CMPIDateTime* newDateTime(const CMPIBroker* broker, CMPIStatus* rc) {
    return guarded<CMPIDateTime*>(rc, nullptr,
                                  [&] { return arenaOf(broker).make<CMPIDateTime>({formatCurrentTime()}); });
}

CMPIDateTime* newDateTimeFromBinary(const CMPIBroker* broker, CMPIUint64 microseconds, CMPIBoolean interval,
                                    CMPIStatus* rc) {
    return guarded<CMPIDateTime*>(rc, nullptr, [&] {
        std::optional<std::string> formatted =
            interval != 0 ? formatInterval(microseconds) : formatTime(static_cast<std::int64_t>(microseconds));
        if (!formatted) {
            throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "The time is out of range.");
        }
        return arenaOf(broker).make<CMPIDateTime>({*std::move(formatted)});
    });
}

CMPIDateTime* newDateTimeFromChars(const CMPIBroker* broker, const char* characters, CMPIStatus* rc) {
    return guarded<CMPIDateTime*>(rc, nullptr, [&] {
        Arena& arena = arenaOf(broker);
        std::string dateTime = argument(characters);
        if (!cim::isDateTime(dateTime)) {
            throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "'" + dateTime + "' is not a CIM datetime.");
        }
        return arena.make<CMPIDateTime>({std::move(dateTime)});
    });
}

/** Queries are not supported, so there is never a CMPISelectExp. */
CMPISelectExp* newSelectExp(const CMPIBroker* broker, const char*, const char*, CMPIArray** projection,
                            CMPIStatus* rc) {
    return guarded<CMPISelectExp*>(rc, nullptr, [&]() -> CMPISelectExp* {
        Broker::of(broker);
        if (projection != nullptr) {
            *projection = nullptr;
        }
        throw Failure(CMPI_RC_ERR_NOT_SUPPORTED, "Queries are not supported by this object manager.");
    });
}

CMPIBoolean classPathIsA(const CMPIBroker* broker, const CMPIObjectPath* path, const char* className, CMPIStatus* rc) {
    return guarded<CMPIBoolean>(rc, 0, [&] {
        const bool isA = Broker::of(broker).isA(argument(path)->className, argument(className));
        return static_cast<CMPIBoolean>(isA ? 1 : 0);
    });
}

/** The object of a handle of any type: all handles begin with a pointer to their object. */
const Object& anyObject(const CMPIBroker* broker, const void* handle) {
    Broker::of(broker);
    const void* object = nullptr;
    if (handle != nullptr) {
        std::memcpy(&object, handle, sizeof object);
    }
    if (object == nullptr) {
        throw Failure(CMPI_RC_ERR_INVALID_HANDLE);
    }
    return *static_cast<const Object*>(object);
}

CMPIString* toString(const CMPIBroker* broker, const void* object, CMPIStatus* rc) {
    return guarded<CMPIString*>(rc, nullptr,
                                [&] { return arenaOf(broker).make<CMPIString>(describe(anyObject(broker, object))); });
}

CMPIBoolean isOfType(const CMPIBroker* broker, const void* object, const char* type, CMPIStatus* rc) {
    return guarded<CMPIBoolean>(rc, 0, [&] {
        const std::string actual = typeNameOf(anyObject(broker, object).kind());
        return static_cast<CMPIBoolean>(argument(type) == actual ? 1 : 0);
    });
}

CMPIString* getType(const CMPIBroker* broker, const void* object, CMPIStatus* rc) {
    return guarded<CMPIString*>(
        rc, nullptr, [&] { return arenaOf(broker).make<CMPIString>(typeNameOf(anyObject(broker, object).kind())); });
}

/** Logs a record. @param characters the message; null: the message is in `string` */
CMPIStatus record(const CMPIBroker* broker, LogRecord record, const char* component, const char* characters,
                  const CMPIString* string) {
    return guarded([&] {
        const Broker& owner = Broker::of(broker);
        record.component = component == nullptr ? "" : component;
        if (characters != nullptr) {
            record.message = characters;
        } else if (string != nullptr) {
            record.message = content(string);
        }
        owner.log(record);
    });
}

CMPIStatus logMessage(const CMPIBroker* broker, int severity, const char* id, const char* characters,
                      const CMPIString* string) {
    return record(broker, {false, severity, {}, {}}, id, characters, string);
}

CMPIStatus trace(const CMPIBroker* broker, int level, const char* component, const char* characters,
                 const CMPIString* string) {
    return record(broker, {true, level, {}, {}}, component, characters, string);
}

CMPIError* newCMPIError(const CMPIBroker* broker, const char* owner, const char* id, const char* message,
                        const CMPIErrorSeverity severity, const CMPIErrorProbableCause cause, const CMPIrc code,
                        CMPIStatus* rc) {
    return guarded<CMPIError*>(rc, nullptr, [&] {
        ErrorInfo error;
        error.owningEntity = optionalString(owner);
        error.messageId = optionalString(id);
        error.message = optionalString(message);
        error.severity = severity;
        error.probableCause = cause;
        error.statusCode = code;
        return arenaOf(broker).make<CMPIError>(std::move(error));
    });
}

/** There are no message files: providers use their default messages. */
CMPIStatus openMessageFile(const CMPIBroker* broker, const char*, CMPIMsgFileHandle* file) {
    return guarded([&] {
        Broker::of(broker);
        if (file == nullptr) {
            throw Failure(CMPI_RC_ERR_INVALID_PARAMETER);
        }
        *file = nullptr;
        throw Failure(CMPI_RC_ERR_NOT_FOUND);
    });
}

CMPIStatus closeMessageFile(const CMPIBroker* broker, CMPIMsgFileHandle file) {
    return guarded([&] {
        Broker::of(broker);
        if (file != nullptr) {
            throw Failure(CMPI_RC_ERR_INVALID_HANDLE);
        }
    });
}

}  // namespace

const CMPIBrokerEncFT encapsulationTable{tableVersion,
                                         newInstance,
                                         newObjectPath,
                                         newArgs,
                                         newString,
                                         newArray,
                                         newDateTime,
                                         newDateTimeFromBinary,
                                         newDateTimeFromChars,
                                         newSelectExp,
                                         classPathIsA,
                                         toString,
                                         isOfType,
                                         getType,
                                         getMessage,
                                         logMessage,
                                         trace,
                                         newCMPIError,
                                         openMessageFile,
                                         closeMessageFile,
                                         getMessage2};

}  // namespace cimhost
