#pragma once

#include <cmpift.h>

#include <string>

#include "Rows.h"

/** The broker calls that create a response, without checks for errors. */
namespace bench {

inline const char* characters(const CMPIString* string) {
    return string->ft->getCharPtr(string, nullptr);
}

inline const char* nameSpaceOf(const CMPIObjectPath* path) {
    return characters(path->ft->getNameSpace(path, nullptr));
}

inline std::string stringKey(const CMPIObjectPath* path, const char* name) {
    return characters(path->ft->getKey(path, name, nullptr).value.string);
}

/** In CMPI, the pointer to a value of type CMPI_chars is the pointer to its characters. */
inline const CMPIValue* charsValue(const char* characters) {
    return reinterpret_cast<const CMPIValue*>(characters);
}

inline CMPIObjectPath* newPath(const CMPIBroker* broker, const char* nameSpace, const char* className) {
    return broker->eft->newObjectPath(broker, nameSpace, className, nullptr);
}

inline void addKey(CMPIObjectPath* path, const char* name, const std::string& value) {
    path->ft->addKey(path, name, charsValue(value.c_str()), CMPI_chars);
}

inline void addKey(CMPIObjectPath* path, const char* name, CMPIObjectPath* reference) {
    CMPIValue value{};
    value.ref = reference;
    path->ft->addKey(path, name, &value, CMPI_ref);
}

/** Sets the properties of an instance, with the same types as the provider. */
class PropertySetter {
public:
    PropertySetter(const CMPIBroker* itsBroker, CMPIInstance* itsInstance) : broker(itsBroker), instance(itsInstance) {}

    void string(const char* name, const std::string& value) const { set(name, charsValue(value.c_str()), CMPI_chars); }

    void number(const char* name, unsigned int number) const {
        CMPIValue value{};
        value.uint32 = number;
        set(name, &value, CMPI_uint32);
    }

    void flag(const char* name, bool flag) const {
        CMPIValue value{};
        value.boolean = flag ? 1 : 0;
        set(name, &value, CMPI_boolean);
    }

    /** @param date CIM datetime; empty: null */
    void date(const char* name, const std::string& date) const {
        CMPIValue value{};
        if (!date.empty()) {
            value.dateTime = broker->eft->newDateTimeFromChars(broker, date.c_str(), nullptr);
        }
        set(name, date.empty() ? nullptr : &value, CMPI_dateTime);
    }

private:
    void set(const char* name, const CMPIValue* value, CMPIType type) const {
        instance->ft->setProperty(instance, name, value, type);
    }

    const CMPIBroker* broker;
    CMPIInstance* instance;
};

template <class Row>
CMPIObjectPath* pathOf(const CMPIBroker* broker, const char* nameSpace, const Row& row) {
    CMPIObjectPath* path = newPath(broker, nameSpace, Row::className);
    for (const auto& key : Row::keys) {
        addKey(path, key.name, row.*key.member);
    }
    return path;
}

template <class Row>
CMPIInstance* instanceOf(const CMPIBroker* broker, const char* nameSpace, const Row& row) {
    CMPIInstance* instance = broker->eft->newInstance(broker, pathOf(broker, nameSpace, row), nullptr);
    row.eachProperty(PropertySetter(broker, instance));
    return instance;
}

}  // namespace bench
