#pragma once

#include <cmpift.h>

#include <string>

// What the test providers share: the broker's functions in a handier form.

namespace kit {

constexpr CMPIStatus ok{CMPI_RC_OK, nullptr};

inline CMPIStatus failure(const CMPIBroker* broker, CMPIrc rc, const char* message) {
    return {rc, broker->eft->newString(broker, message, nullptr)};
}

inline std::string characters(const CMPIString* string) {
    const char* text = string == nullptr ? nullptr : string->ft->getCharPtr(string, nullptr);
    return text == nullptr ? "" : text;
}

inline std::string className(const CMPIObjectPath* path) {
    return characters(path->ft->getClassName(path, nullptr));
}

inline std::string nameSpace(const CMPIObjectPath* path) {
    return characters(path->ft->getNameSpace(path, nullptr));
}

inline CMPIObjectPath* newPath(const CMPIBroker* broker, const CMPIObjectPath* like, const std::string& name) {
    return broker->eft->newObjectPath(broker, nameSpace(like).c_str(), name.c_str(), nullptr);
}

inline void addKey(CMPIObjectPath* path, const char* name, const std::string& text) {
    path->ft->addKey(path, name, reinterpret_cast<const CMPIValue*>(text.c_str()), CMPI_chars);
}

inline std::string key(const CMPIObjectPath* path, const char* name) {
    const CMPIData data = path->ft->getKey(path, name, nullptr);
    return data.type == CMPI_string && (data.state & CMPI_nullValue) == 0 ? characters(data.value.string) : "";
}

inline void set(CMPIInstance* instance, const char* name, const std::string& text) {
    instance->ft->setProperty(instance, name, reinterpret_cast<const CMPIValue*>(text.c_str()), CMPI_chars);
}

/** An instance with one property, on a path with the same as its key. */
inline CMPIInstance* newInstance(const CMPIBroker* broker, const CMPIObjectPath* like, const std::string& itsClass,
                                 const char* name, const std::string& text) {
    CMPIObjectPath* path = newPath(broker, like, itsClass);
    addKey(path, name, text);
    CMPIInstance* instance = broker->eft->newInstance(broker, path, nullptr);
    set(instance, name, text);
    return instance;
}

inline void log(const CMPIBroker* broker, const char* text) {
    broker->eft->logMessage(broker, CMPI_SEV_INFO, "provider", text, nullptr);
}

/** Keeps the broker of a factory; factories may be called again while requests run, and must not write then. */
inline void keep(const CMPIBroker*& kept, const CMPIBroker* broker) {
    if (kept != broker) {
        kept = broker;
    }
}

}  // namespace kit

#define KIT_EXPORT extern "C" __attribute__((visibility("default")))
