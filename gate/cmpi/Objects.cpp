#include "Objects.h"

#include <RZLog/RZLogger.h>

#include <charconv>
#include <cstring>
#include <exception>
#include <system_error>

namespace gate {

void logError(const std::string& message, const char* function, const char* file, int line) {
    constexpr const char* logger = "Tarvik.LeaseAndWarrantyGate";
    constexpr int errorLevel = 3000;
    const char* folder = std::strrchr(file, '/');
    const char* name = folder == nullptr ? file : folder + 1;
    try {
        RZLog::RZLogger::logLevelMessage(function, name, line, logger, errorLevel, nullptr, 0, 0, message);
        RZLog::RZLogger::traceLevelMessage(function, name, line, logger, errorLevel, nullptr, 0, 0, message);
    } catch (const std::exception&) {
        // The log is not needed to serve the request.
    }
}

std::string managerFailure(const char* task, const CMPIStatus& status) {
    std::string message = std::string("The object manager could not ") + task;
    if (status.rc != CMPI_RC_OK) {
        message += ": code " + std::to_string(status.rc);
        const std::string reason = toString(status.msg);
        message += reason.empty() ? "" : ", " + reason;
    }
    return message + ".";
}

void require(bool isDone, const char* task, const CMPIStatus& status) {
    if (!isDone) {
        fail(CMPI_RC_ERR_FAILED, managerFailure(task, status));
    }
}

std::string classNameOf(const CMPIObjectPath* path) {
    return toString(demand<&CMPIObjectPathFT::getClassName>("return the class of a path", path));
}

std::string nameSpaceOf(const CMPIObjectPath* path) {
    return toString(demand<&CMPIObjectPathFT::getNameSpace>("return the namespace of a path", path));
}

CMPICount keyCountOf(const CMPIObjectPath* path) {
    return demand<&CMPIObjectPathFT::getKeyCount>("count the keys of a path", path);
}

const CMPIObjectPath* pathOf(const CMPIInstance* instance) {
    const auto answer = ask<&CMPIInstanceFT::getObjectPath>(instance);
    require(answer.isOk() && answer.value != nullptr, "return the path of an instance", answer.status);
    return answer.value;
}

CMPIObjectPath* makePath(const CMPIBroker* broker, const std::string& nameSpace, const char* className) {
    CMPIObjectPath* path = make<&CMPIBrokerEncFT::newObjectPath>(broker, nameSpace.c_str(), className);
    require(path != nullptr, "create an object path");
    return path;
}

CMPIInstance* makeInstance(const CMPIBroker* broker, const CMPIObjectPath* path) {
    CMPIInstance* instance = make<&CMPIBrokerEncFT::newInstance>(broker, path);
    require(instance != nullptr, "create an instance");
    return instance;
}

namespace {

/** Whether a value is accepted for a property of a type: managers do not keep types apart strictly. */
bool isConvertible(const CMPIData& data, CMPIType wanted) {
    const bool isString = data.type == CMPI_string || data.type == CMPI_chars;
    return wanted == CMPI_string     ? isString
           : wanted == CMPI_dateTime ? isString || data.type == CMPI_dateTime
           : wanted == CMPI_boolean  ? data.type == CMPI_boolean
                                     : cim::digitsOf(data).has_value();
}

/** The number that the digits represent; none if it is out of the range of its type. */
std::optional<CMPIUint32> numberIn(const std::string& digits, CMPIType type) {
    CMPIUint32 number = 0;
    const auto error = std::from_chars(digits.data(), digits.data() + digits.size(), number).ec;
    const CMPIUint32 limit = type == CMPI_uint16 ? 0xFFFFU : 0xFFFFFFFFU;
    return error == std::errc() && number <= limit ? std::optional<CMPIUint32>(number) : std::nullopt;
}

/** Whether the second path has that key of the first one. */
bool sameKey(const CMPIData& key, const char* name, const CMPIObjectPath* other) {
    const auto found = ask<&CMPIObjectPathFT::getKey>(other, name);
    require(found.isOk() || isAbsent(found.status), "return the keys of a path", found.status);
    if (key.type == CMPI_ref) {
        const CMPIObjectPath* target = referenceOf(other, name);
        return target != nullptr && samePath(key.value.ref, target);
    }
    const CMPIType type = key.type == CMPI_chars ? CMPI_string : key.type;
    const auto value = cim::hasValue(key) ? cim::charactersOf(key) : std::nullopt;
    const bool isUsable = found.isOk() && cim::hasValue(found.value) && isConvertible(found.value, type);
    return value && isUsable && value == cim::charactersOf(found.value);
}

}  // namespace

std::optional<std::string> propertyOf(const CMPIInstance* instance, const Property& property) {
    const auto [data, status] = ask<&CMPIInstanceFT::getProperty>(instance, property.name);
    if (isAbsent(status)) {
        return std::nullopt;
    }
    requireOk((std::string("return the value of ") + property.name).c_str(), status);
    if (!cim::hasValue(data)) {
        return std::nullopt;
    }
    failIf(!isConvertible(data, property.type), CMPI_RC_ERR_TYPE_MISMATCH, property.name,
           ": the value has another type than the property.");
    auto characters = cim::charactersOf(data);
    if (cim::digitsOf(data) && !numberIn(*characters, property.type)) {
        fail(CMPI_RC_ERR_TYPE_MISMATCH, property.name, ": ", *characters,
             " is out of the range of the property's type.");
    }
    return characters;
}

std::optional<std::string> keyOf(const CMPIObjectPath* path, const Property& property) {
    const auto answer = ask<&CMPIObjectPathFT::getKey>(path, property.name);
    const bool isUsable = answer.isOk() && cim::hasValue(answer.value) && isConvertible(answer.value, property.type);
    return isUsable ? cim::charactersOf(answer.value) : std::nullopt;
}

CMPIObjectPath* referenceOf(const CMPIObjectPath* path, const char* key) {
    const auto answer = ask<&CMPIObjectPathFT::getKey>(path, key);
    const bool isUsable = answer.isOk() && cim::hasValue(answer.value) && answer.value.type == CMPI_ref;
    return isUsable ? answer.value.value.ref : nullptr;
}

CMPIValue scalarFrom(const std::string& characters, CMPIType type) {
    CMPIValue value{};
    const CMPIUint32 number = numberIn(characters, type).value_or(0);
    if (type == CMPI_boolean) {
        value.boolean = characters == "true" ? 1 : 0;
    } else if (type == CMPI_uint16) {
        value.uint16 = static_cast<CMPIUint16>(number);
    } else {
        value.uint32 = number;
    }
    return value;
}

CMPIValue referenceTo(const CMPIObjectPath* target) {
    CMPIValue value{};
    value.ref = const_cast<CMPIObjectPath*>(target);
    return value;
}

bool samePath(const CMPIObjectPath* left, const CMPIObjectPath* right) {
    const CMPICount count = keyCountOf(left);
    if (count == 0 || count != keyCountOf(right) || !sameName(classNameOf(left), classNameOf(right))) {
        return false;
    }
    const std::string leftSpace = nameSpaceOf(left);
    const std::string rightSpace = nameSpaceOf(right);
    if (!leftSpace.empty() && !rightSpace.empty() && !sameName(leftSpace, rightSpace)) {
        return false;
    }
    for (CMPICount index = 0; index < count; ++index) {
        CMPIString* name = nullptr;
        const CMPIData key = demand<&CMPIObjectPathFT::getKeyAt>("return the keys of a path", left, index, &name);
        if (!sameKey(key, toString(name).c_str(), right)) {
            return false;
        }
    }
    return true;
}

}  // namespace gate
