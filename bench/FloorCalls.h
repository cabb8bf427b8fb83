#pragma once

#include "Rows.h"

#include <cmpift.h>

#include <string>

/** The broker calls that any answer is made of, without a check: the floor's requests are known to be good. */
namespace bench {

inline const char* characters(const CMPIString* string) {
    return string->ft->getCharPtr(string, nullptr);
}

inline const char* nameSpaceOf(const CMPIObjectPath* path) {
    return characters(path->ft->getNameSpace(path, nullptr));
}

inline std::string textKey(const CMPIObjectPath* path, const char* name) {
    return characters(path->ft->getKey(path, name, nullptr).value.string);
}

/** By the convention of CMPI, a value of type CMPI_chars is the characters themselves. */
inline const CMPIValue* charsValue(const char* text) {
    return reinterpret_cast<const CMPIValue*>(text);
}

inline CMPIObjectPath* newPath(const CMPIBroker* broker, const char* nameSpace, const char* className) {
    return broker->eft->newObjectPath(broker, nameSpace, className, nullptr);
}

inline void addKey(CMPIObjectPath* path, const char* name, const std::string& text) {
    path->ft->addKey(path, name, charsValue(text.c_str()), CMPI_chars);
}

inline void addKey(CMPIObjectPath* path, const char* name, CMPIObjectPath* reference) {
    CMPIValue value{};
    value.ref = reference;
    path->ft->addKey(path, name, &value, CMPI_ref);
}

/** Sets the properties of an instance with the types that the provider gives them. */
class PropertySetter {
public:
    PropertySetter(const CMPIBroker* itsBroker, CMPIInstance* itsInstance) : broker(itsBroker), instance(itsInstance) {}

    void text(const char* name, const std::string& text) const { set(name, charsValue(text.c_str()), CMPI_chars); }

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

    /** @param text CIM datetime text; empty for null */
    void date(const char* name, const std::string& text) const {
        CMPIValue value{};
        if (!text.empty()) {
            value.dateTime = broker->eft->newDateTimeFromChars(broker, text.c_str(), nullptr);
        }
        set(name, text.empty() ? nullptr : &value, CMPI_dateTime);
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
