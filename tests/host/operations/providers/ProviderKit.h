#pragma once

#include <cmpift.h>

#include <string>

// Shared by the test providers: shorter forms of broker functions, and functions that many tables have.

namespace kit {

constexpr CMPIStatus ok{CMPI_RC_OK, nullptr};

inline CMPIStatus failure(const CMPIBroker* broker, CMPIrc rc, const char* message) {
    return {rc, broker->eft->newString(broker, message, nullptr)};
}

inline std::string characters(const CMPIString* string) {
    const char* characters = string == nullptr ? nullptr : string->ft->getCharPtr(string, nullptr);
    return characters == nullptr ? "" : characters;
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

inline void addKey(CMPIObjectPath* path, const char* name, const std::string& value) {
    path->ft->addKey(path, name, reinterpret_cast<const CMPIValue*>(value.c_str()), CMPI_chars);
}

inline std::string key(const CMPIObjectPath* path, const char* name) {
    const CMPIData data = path->ft->getKey(path, name, nullptr);
    return data.type == CMPI_string && (data.state & CMPI_nullValue) == 0 ? characters(data.value.string) : "";
}

inline void set(CMPIInstance* instance, const char* name, const std::string& value) {
    instance->ft->setProperty(instance, name, reinterpret_cast<const CMPIValue*>(value.c_str()), CMPI_chars);
}

/** An instance whose only property is also its only key. */
inline CMPIInstance* newInstance(const CMPIBroker* broker, const CMPIObjectPath* like, const std::string& itsClass,
                                 const char* name, const std::string& value) {
    CMPIObjectPath* path = newPath(broker, like, itsClass);
    addKey(path, name, value);
    CMPIInstance* instance = broker->eft->newInstance(broker, path, nullptr);
    set(instance, name, value);
    return instance;
}

inline void log(const CMPIBroker* broker, const char* message) {
    broker->eft->logMessage(broker, CMPI_SEV_INFO, "provider", message, nullptr);
}

/** Stores the broker of a factory. A factory that is called again while requests run must not write it. */
inline void store(const CMPIBroker*& stored, const CMPIBroker* broker) {
    if (stored != broker) {
        stored = broker;
    }
}

/** @name Functions of tables */
///@{
template <class Interface>
CMPIStatus cleanup(Interface*, const CMPIContext*, CMPIBoolean) {
    return ok;
}

inline CMPIStatus noAssociatorNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                                    const char*, const char*, const char*, const char*) {
    return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
}

inline CMPIStatus noReferences(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                               const char*, const char*, const char**) {
    return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
}

inline CMPIStatus noReferenceNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                                   const char*, const char*) {
    return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
}
///@}

}  // namespace kit

#define KIT_EXPORT extern "C" __attribute__((visibility("default")))
