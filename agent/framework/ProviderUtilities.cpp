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

/** Returns a value of type CMPI_chars. CMPI passes such a value as the pointer to the characters. */
const CMPIValue* asValue(const char* characters) {
    return reinterpret_cast<const CMPIValue*>(characters);
}

/** The result of reading a key or a property. */
using Read = cim::Answer<CMPIData>;

Read getKey(const CMPIObjectPath* path, const char* name) {
    return name != nullptr ? cim::ask<&CMPIObjectPathFT::getKey>(path, name) : Read{};
}

void addKey(CMPIObjectPath* path, const char* name, const CMPIValue* value, CMPIType type) {
    if (name != nullptr) {
        cim::tell<&CMPIObjectPathFT::addKey>(path, name, value, type);
    }
}

Read getPropertyData(const CMPIInstance* instance, const char* name) {
    return name != nullptr ? cim::ask<&CMPIInstanceFT::getProperty>(instance, name) : Read{};
}

/** @param value the value; null sets the property to null */
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

bool isPresent(const Read& read, CMPIType type) {
    return read.isOk() && cim::hasValue(read.value) && read.value.type == type;
}

/** @name Values read from a broker
 * None if reading failed, or if the value is null or has another type.
 */
///@{
std::optional<std::string> stringOf(const Read& read) {
    const bool isString = isPresent(read, CMPI_string) || isPresent(read, CMPI_chars);
    return isString ? cim::charactersOf(read.value) : std::nullopt;
}

std::optional<std::string> dateTimeOf(const Read& read) {
    return isPresent(read, CMPI_dateTime) ? cim::charactersOf(read.value) : std::nullopt;
}

std::optional<unsigned int> numberOf(const Read& read) {
    const auto digits = isPresent(read, read.value.type) ? cim::digitsOf(read.value) : std::nullopt;
    unsigned int number = 0;
    const bool fits =
        digits && std::from_chars(digits->data(), digits->data() + digits->size(), number).ec == std::errc();
    return fits ? std::optional<unsigned int>(number) : std::nullopt;
}

std::optional<bool> flagOf(const Read& read) {
    return isPresent(read, CMPI_boolean) ? std::optional<bool>(read.value.value.boolean != 0) : std::nullopt;
}

/** A string, an integer in decimal digits, or a boolean as "true" or "false". */
std::optional<std::string> keyOf(const Read& read) {
    const bool isKeyType = read.value.type != CMPI_dateTime && isPresent(read, read.value.type);
    return isKeyType ? cim::charactersOf(read.value) : std::nullopt;
}

/** A reference, owned by the broker; null if there is none. */
CMPIObjectPath* referenceOf(const Read& read) {
    return isPresent(read, CMPI_ref) ? read.value.value.ref : nullptr;
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
    return deliver(stringOf(getKey(path, name)), value);
}

bool ProviderUtilities::getKeyProperty(const CMPIObjectPath* path, const char* name, CMPIObjectPath** value) {
    CMPIObjectPath* reference = referenceOf(getKey(path, name));
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
    const Read read = getPropertyData(instance, name);
    return deliver(dateTimeOf(read), value) || deliver(stringOf(read), value);
}

bool ProviderUtilities::getProperty(const CMPIInstance* instance, const char* name, unsigned int& value) {
    return deliver(numberOf(getPropertyData(instance, name)), value);
}

bool ProviderUtilities::getProperty(const CMPIInstance* instance, const char* name, bool& value) {
    return deliver(flagOf(getPropertyData(instance, name)), value);
}

void ProviderUtilities::transformObjectPathToMoniker(const CMPIObjectPath* path, Moniker& moniker) {
    const CMPICount count = cim::ask<&CMPIObjectPathFT::getKeyCount>(path).value;
    for (CMPICount index = 0; index < count; ++index) {
        CMPIString* nameString = nullptr;
        const Read key = cim::ask<&CMPIObjectPathFT::getKeyAt>(path, index, &nameString);
        const std::optional<std::string> name = cim::charactersOf(nameString);
        const std::optional<std::string> value = keyOf(key);
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
