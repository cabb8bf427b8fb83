// A provider of two boxes, one in the other, for tests of the program. It returns what it receives, or any status.

#include <cmpift.h>

#include <cstring>
#include <stdexcept>
#include <string>

namespace {

const CMPIBroker* theBroker = nullptr;

/** Returns a status with any code: a provider written in C may return one that is not a CMPIrc. */
CMPIStatus status(int code, const char* message = nullptr) {
    CMPIStatus result{CMPI_RC_OK, nullptr};
    static_assert(sizeof result.rc == sizeof code);
    std::memcpy(&result.rc, &code, sizeof code);
    if (message != nullptr) {
        result.msg = theBroker->eft->newString(theBroker, message, nullptr);
    }
    return result;
}

std::string className(const CMPIObjectPath* path) {
    const CMPIString* name = path->ft->getClassName(path, nullptr);
    return name->ft->getCharPtr(name, nullptr);
}

std::string nameSpace(const CMPIObjectPath* path) {
    const CMPIString* name = path->ft->getNameSpace(path, nullptr);
    return name->ft->getCharPtr(name, nullptr);
}

std::string nameKey(const CMPIObjectPath* path) {
    CMPIStatus rc{CMPI_RC_OK, nullptr};
    const CMPIData key = path->ft->getKey(path, "Name", &rc);
    return rc.rc == CMPI_RC_OK ? key.value.string->ft->getCharPtr(key.value.string, nullptr) : "";
}

CMPIObjectPath* boxPath(const CMPIObjectPath* request, const std::string& name) {
    CMPIObjectPath* path = theBroker->eft->newObjectPath(theBroker, nameSpace(request).c_str(), "Test_Box", nullptr);
    path->ft->addKey(path, "Name", reinterpret_cast<const CMPIValue*>(name.c_str()), CMPI_chars);
    return path;
}

template <typename Plain>
void set(const CMPIInstance* instance, const char* name, CMPIType type, const Plain& plain) {
    instance->ft->setProperty(instance, name, reinterpret_cast<const CMPIValue*>(&plain), type);
}

void setText(const CMPIInstance* instance, const char* name, const char* text) {
    instance->ft->setProperty(instance, name, reinterpret_cast<const CMPIValue*>(text), CMPI_chars);
}

CMPIInstance* box(const CMPIObjectPath* request, const std::string& name) {
    CMPIInstance* instance = theBroker->eft->newInstance(theBroker, boxPath(request, name), nullptr);
    setText(instance, "Name", name.c_str());
    if (name == "A") {
        CMPIArray* labels = theBroker->eft->newArray(theBroker, 2, CMPI_string, nullptr);
        labels->ft->setElementAt(labels, 0, reinterpret_cast<const CMPIValue*>("this side \"up\""), CMPI_chars);
        labels->ft->setElementAt(labels, 1, reinterpret_cast<const CMPIValue*>("two\nlines"), CMPI_chars);
        set(instance, "Size", CMPI_uint32, CMPIUint32{4294967295U});
        set(instance, "Open", CMPI_boolean, CMPIBoolean{1});
        CMPIDateTime* packed = theBroker->eft->newDateTimeFromChars(theBroker, "20260131120000.000000+060", nullptr);
        set(instance, "Packed", CMPI_dateTime, packed);
        set(instance, "Labels", CMPI_stringA, labels);
        set(instance, "Shelf", CMPI_sint8, CMPISint8{-3});
        set(instance, "Mark", CMPI_char16, CMPIChar16{0x20AC});
        set(instance, "Weight", CMPI_real64, CMPIReal64{2.5});
        set(instance, "Serial", CMPI_uint64, CMPIUint64{18446744073709551615ULL});
        set(instance, "Inside", CMPI_ref, boxPath(request, "B"));
    }
    instance->ft->setProperty(instance, "Note", nullptr, CMPI_string);
    return instance;
}

CMPIStatus done(const CMPIResult* result) {
    result->ft->returnDone(result);
    return status(CMPI_RC_OK);
}

/** The status for the class whose key is a status code; -1 for other classes. */
CMPIStatus answer(const CMPIObjectPath* path) {
    const CMPIData code = path->ft->getKey(path, "Code", nullptr);
    if (code.value.uint16 == 999) {
        throw std::runtime_error("the provider is at its wit's end");
    }
    return code.value.uint16 == 200 ? status(200) : status(code.value.uint16, "as you\nlike \"it\"");
}

CMPIStatus cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return status(CMPI_RC_OK);
}

CMPIStatus cleanupAssociation(CMPIAssociationMI*, const CMPIContext*, CMPIBoolean) {
    return status(CMPI_RC_OK);
}

CMPIStatus enumerateInstanceNames(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                                  const CMPIObjectPath* path) {
    result->ft->returnObjectPath(result, boxPath(path, "A"));
    result->ft->returnObjectPath(result, boxPath(path, "B"));
    return done(result);
}

CMPIStatus enumerateInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                              const char**) {
    result->ft->returnInstance(result, box(path, "A"));
    result->ft->returnInstance(result, box(path, "B"));
    return done(result);
}

CMPIStatus getInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                       const char** properties) {
    if (className(path) == "Test_Answer") {
        return answer(path);
    }
    const std::string name = nameKey(path);
    if (name == "A" || name == "B") {
        CMPIInstance* instance = box(path, name);
        if (properties != nullptr) {
            std::string asked = "asked for";
            for (const char** each = properties; *each != nullptr; ++each) {
                asked += std::string(" ") + *each;
            }
            setText(instance, "Note", asked.c_str());
        }
        result->ft->returnInstance(result, instance);
    }
    result->ft->returnDone(result);
    return done(result);
}

CMPIStatus createInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                          const CMPIInstance* instance) {
    if (nameKey(path) == "A") {
        return status(CMPI_RC_ERR_ALREADY_EXISTS, "there is a box A");
    }
    result->ft->returnObjectPath(result, path);
    result->ft->returnInstance(result, instance);
    return done(result);
}

CMPIStatus modifyInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                          const CMPIInstance* instance, const char** properties) {
    if (nameKey(path) != "A") {
        return status(CMPI_RC_ERR_NOT_FOUND);
    }
    result->ft->returnInstance(result, instance);
    for (const char** each = properties; each != nullptr && *each != nullptr; ++each) {
        const CMPIString* name = theBroker->eft->newString(theBroker, *each, nullptr);
        result->ft->returnData(result, reinterpret_cast<const CMPIValue*>(&name), CMPI_string);
    }
    return status(CMPI_RC_OK);
}

CMPIStatus deleteInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* path) {
    return nameKey(path) == "A" ? status(CMPI_RC_OK) : status(CMPI_RC_ERR_NOT_FOUND, "no such box");
}

/** A box whose name describes the request. */
std::string described(const char* first, const char* second, const char* third, const char* fourth) {
    std::string text;
    for (const char* each : {first, second, third, fourth}) {
        text += (text.empty() ? "" : "|") + std::string(each == nullptr ? "-" : each);
    }
    return text;
}

CMPIStatus associators(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                       const char*, const char*, const char*, const char*, const char**) {
    result->ft->returnInstance(result, box(path, nameKey(path) == "A" ? "B" : "A"));
    return done(result);
}

CMPIStatus associatorNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                           const char* associationClass, const char* resultClass, const char* role,
                           const char* resultRole) {
    result->ft->returnObjectPath(result, boxPath(path, described(associationClass, resultClass, role, resultRole)));
    return done(result);
}

CMPIObjectPath* containsPath(const CMPIObjectPath* request) {
    CMPIObjectPath* path =
        theBroker->eft->newObjectPath(theBroker, nameSpace(request).c_str(), "Test_Contains", nullptr);
    const CMPIObjectPath* outer = boxPath(request, "A");
    const CMPIObjectPath* inner = boxPath(request, "B");
    path->ft->addKey(path, "Outer", reinterpret_cast<const CMPIValue*>(&outer), CMPI_ref);
    path->ft->addKey(path, "Inner", reinterpret_cast<const CMPIValue*>(&inner), CMPI_ref);
    return path;
}

CMPIStatus references(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                      const char*, const char*, const char**) {
    CMPIInstance* instance = theBroker->eft->newInstance(theBroker, containsPath(path), nullptr);
    set(instance, "Outer", CMPI_ref, boxPath(path, "A"));
    set(instance, "Inner", CMPI_ref, boxPath(path, "B"));
    result->ft->returnInstance(result, instance);
    return done(result);
}

CMPIStatus referenceNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                          const char*, const char*) {
    result->ft->returnObjectPath(result, containsPath(path));
    return done(result);
}

CMPIInstanceMIFT instanceFunctions = {200,
                                      200,
                                      "instanceCliTest",
                                      cleanup,
                                      enumerateInstanceNames,
                                      enumerateInstances,
                                      getInstance,
                                      createInstance,
                                      modifyInstance,
                                      deleteInstance,
                                      nullptr};
CMPIAssociationMIFT associationFunctions = {
    200, 200, "associationCliTest", cleanupAssociation, associators, associatorNames, references, referenceNames};
CMPIInstanceMI instanceInterface = {nullptr, &instanceFunctions};
CMPIAssociationMI associationInterface = {nullptr, &associationFunctions};

}  // namespace

extern "C" __attribute__((visibility("default"))) CMPIInstanceMI* CliTest_Create_InstanceMI(const CMPIBroker* broker,
                                                                                            const CMPIContext*,
                                                                                            CMPIStatus*) {
    theBroker = broker;
    return &instanceInterface;
}

extern "C" __attribute__((visibility("default"))) CMPIAssociationMI* CliTest_Create_AssociationMI(
    const CMPIBroker* broker, const CMPIContext*, CMPIStatus*) {
    theBroker = broker;
    return &associationInterface;
}
