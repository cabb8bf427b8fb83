#include "KO/ProviderUtilities.h"

#include <algorithm>
#include <charconv>
#include <optional>
#include <system_error>

#include "KO/ClassIds.h"
#include "KO/Moniker.h"
#include "cim/CmpiAccess.h"
#include "cim/DateTime.h"
#include "cim/Names.h"

namespace KO {

namespace {

struct ClassEntry {
    const char* name;
    unsigned short id;
};

constexpr ClassEntry classIds[] = {
    {"VELKO_ComputerSystem", ClassId::computerSystem},
    {"VELKO_Lease", ClassId::lease},
    {"VELKO_Warranty", ClassId::warranty},
    {"VELKO_LeaseSetting", ClassId::leaseSetting},
    {"VELKO_WarrantySetting", ClassId::warrantySetting},
    {"VELKO_OstrelAgent", ClassId::ostrelAgent},
    {"VELKO_AssetIDDetails", ClassId::assetIDDetails},
};

/** Returns a value of type CMPI_chars, which is the pointer to the characters itself. */
const CMPIValue* asValue(const char* characters) {
    return reinterpret_cast<const CMPIValue*>(characters);
}

cim::Answer<CMPIData> getKey(const CMPIObjectPath* path, const char* name) {
    return name != nullptr ? cim::ask<&CMPIObjectPathFT::getKey>(path, name) : cim::Answer<CMPIData>{};
}

void addKey(CMPIObjectPath* path, const char* name, const CMPIValue* value, CMPIType type) {
    if (name != nullptr) {
        cim::tell<&CMPIObjectPathFT::addKey>(path, name, value, type);
    }
}

cim::Answer<CMPIData> getPropertyData(const CMPIInstance* instance, const char* name) {
    return name != nullptr ? cim::ask<&CMPIInstanceFT::getProperty>(instance, name) : cim::Answer<CMPIData>{};
}

/** @param value null sets the property to null */
void setPropertyValue(CMPIInstance* instance, const char* name, const CMPIValue* value, CMPIType type) {
    if (name != nullptr) {
        cim::tell<&CMPIInstanceFT::setProperty>(instance, name, value, type);
    }
}

CMPIDateTime* makeDateTime(const CMPIBroker* broker, const std::string& text) {
    if (!cim::isPointInTime(text) && !cim::isInterval(text)) {
        return nullptr;
    }
    return cim::make<&CMPIBrokerEncFT::newDateTimeFromChars>(broker, text.c_str());
}

bool isPresent(const CMPIData& data, const CMPIStatus& status, CMPIType type) {
    return status.rc == CMPI_RC_OK && cim::hasValue(data) && data.type == type;
}

/** @name Values read from a broker
 * None when the reading failed, the value is null, or it is of another type.
 */
///@{
std::optional<std::string> stringOf(const CMPIData& data, const CMPIStatus& status) {
    const bool isString = isPresent(data, status, CMPI_string) || isPresent(data, status, CMPI_chars);
    return isString ? cim::charactersOf(data) : std::nullopt;
}

std::optional<std::string> dateTimeOf(const CMPIData& data, const CMPIStatus& status) {
    return isPresent(data, status, CMPI_dateTime) ? cim::charactersOf(data) : std::nullopt;
}

std::optional<unsigned int> numberOf(const CMPIData& data, const CMPIStatus& status) {
    const auto digits = isPresent(data, status, data.type) ? cim::digitsOf(data) : std::nullopt;
    unsigned int number = 0;
    const bool fits =
        digits && std::from_chars(digits->data(), digits->data() + digits->size(), number).ec == std::errc();
    return fits ? std::optional<unsigned int>(number) : std::nullopt;
}

std::optional<bool> flagOf(const CMPIData& data, const CMPIStatus& status) {
    return isPresent(data, status, CMPI_boolean) ? std::optional<bool>(data.value.boolean != 0) : std::nullopt;
}

/** A string, an integer in decimal digits, or a boolean as "true" or "false". */
std::optional<std::string> keyOf(const CMPIData& data, const CMPIStatus& status) {
    const bool isKeyType = data.type != CMPI_dateTime && isPresent(data, status, data.type);
    return isKeyType ? cim::charactersOf(data) : std::nullopt;
}

/** A reference; null for none. It belongs to the broker. */
CMPIObjectPath* referenceOf(const CMPIData& data, const CMPIStatus& status) {
    return isPresent(data, status, CMPI_ref) ? data.value.ref : nullptr;
}
///@}

/** Assigns a value if there is one. @return whether there is one */
template <typename Value>
bool deliver(std::optional<Value> found, Value& value) {
    if (found) {
        value = std::move(*found);
    }
    return found.has_value();
}

}  // namespace

unsigned short ProviderUtilities::getClassId(const CMPIObjectPath* path) {
    const std::optional<std::string> name = cim::charactersOf(cim::ask<&CMPIObjectPathFT::getClassName>(path).value);
    return name ? getClassId(name->c_str()) : ClassId::unknown;
}

unsigned short ProviderUtilities::getClassId(const char* className) {
    const ClassEntry* entry = className != nullptr ? cim::findNamed(classIds, className) : nullptr;
    return entry != nullptr ? entry->id : ClassId::unknown;
}

std::string ProviderUtilities::getNamespace(const CMPIObjectPath* path) {
    return cim::charactersOf(cim::ask<&CMPIObjectPathFT::getNameSpace>(path).value).value_or(std::string());
}

unsigned short ProviderUtilities::getKeyCount(const CMPIObjectPath* path) {
    const CMPICount count = cim::ask<&CMPIObjectPathFT::getKeyCount>(path).value;
    return static_cast<unsigned short>(std::min<CMPICount>(count, 0xFFFF));
}

bool ProviderUtilities::getKeyProperty(const CMPIObjectPath* path, const char* name, std::string& value) {
    const auto [data, status] = getKey(path, name);
    return deliver(stringOf(data, status), value);
}

bool ProviderUtilities::getKeyProperty(const CMPIObjectPath* path, const char* name, CMPIObjectPath** value) {
    const auto [data, status] = getKey(path, name);
    CMPIObjectPath* reference = referenceOf(data, status);
    if (reference == nullptr || value == nullptr) {
        return false;
    }
    *value = reference;
    return true;
}

CMPIObjectPath* ProviderUtilities::createObjectPath(const CMPIBroker* broker, const char* className,
                                                    std::string nameSpace) {
    if (className == nullptr) {
        return nullptr;
    }
    return cim::make<&CMPIBrokerEncFT::newObjectPath>(broker, nameSpace.c_str(), className);
}

void ProviderUtilities::setKeyProperty(CMPIObjectPath* path, const char* name, const std::string& value) {
    addKey(path, name, asValue(value.c_str()), CMPI_chars);
}

void ProviderUtilities::setKeyProperty(CMPIObjectPath* path, const char* name, CMPIObjectPath* value) {
    if (value != nullptr) {
        CMPIValue reference{};
        reference.ref = value;
        addKey(path, name, &reference, CMPI_ref);
    }
}

CMPIInstance* ProviderUtilities::createInstance(const CMPIBroker* broker, CMPIObjectPath* path) {
    return path != nullptr ? cim::make<&CMPIBrokerEncFT::newInstance>(broker, path) : nullptr;
}

void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name, std::string& value) {
    setPropertyValue(instance, name, asValue(value.c_str()), CMPI_chars);
}

void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name, unsigned short value) {
    CMPIValue number{};
    number.uint16 = value;
    setPropertyValue(instance, name, &number, CMPI_uint16);
}

void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name, unsigned int value) {
    CMPIValue number{};
    number.uint32 = value;
    setPropertyValue(instance, name, &number, CMPI_uint32);
}

void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name, bool value) {
    CMPIValue flag{};
    flag.boolean = value ? 1 : 0;
    setPropertyValue(instance, name, &flag, CMPI_boolean);
}

void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name, CMPIObjectPath* value) {
    if (value != nullptr) {
        CMPIValue reference{};
        reference.ref = value;
        setPropertyValue(instance, name, &reference, CMPI_ref);
    }
}

void ProviderUtilities::setProperty(const CMPIBroker* broker, CMPIInstance* instance, const char* name,
                                    std::string& text, bool isDateTime) {
    if (!isDateTime) {
        setProperty(instance, name, text);
        return;
    }
    CMPIValue value{};
    value.dateTime = makeDateTime(broker, text);
    setPropertyValue(instance, name, value.dateTime != nullptr ? &value : nullptr, CMPI_dateTime);
}

bool ProviderUtilities::getProperty(const CMPIInstance* instance, const char* name, std::string& value,
                                    bool /*isDateTime*/) {
    const auto [data, status] = getPropertyData(instance, name);
    return deliver(dateTimeOf(data, status), value) || deliver(stringOf(data, status), value);
}

bool ProviderUtilities::getProperty(const CMPIInstance* instance, const char* name, unsigned int& value) {
    const auto [data, status] = getPropertyData(instance, name);
    return deliver(numberOf(data, status), value);
}

bool ProviderUtilities::getProperty(const CMPIInstance* instance, const char* name, bool& value) {
    const auto [data, status] = getPropertyData(instance, name);
    return deliver(flagOf(data, status), value);
}

void ProviderUtilities::transformObjectPathToMoniker(const CMPIObjectPath* path, Moniker& moniker) {
    const CMPICount count = cim::ask<&CMPIObjectPathFT::getKeyCount>(path).value;
    for (CMPICount index = 0; index < count; ++index) {
        CMPIString* nameString = nullptr;
        const auto key = cim::ask<&CMPIObjectPathFT::getKeyAt>(path, index, &nameString);
        const std::optional<std::string> name = cim::charactersOf(nameString);
        const std::optional<std::string> value = keyOf(key.value, key.status);
        if (name && value) {
            moniker.addKey(*name, *value);
        }
    }
}

void ProviderUtilities::transformMonikerToObjectPath(Moniker& moniker, CMPIObjectPath** path) {
    if (path == nullptr) {
        return;
    }
    Moniker cursor = moniker;  // keeps the caller's selection
    std::string name;
    std::string value;
    for (unsigned int index = 0; cursor.selectKey(index); ++index) {
        if (cursor.getName(name) && cursor.getValue(value)) {
            setKeyProperty(*path, name.c_str(), value);
        }
    }
}

}  // namespace KO
