#include <map>
#include <stdexcept>

#include "ProviderKit.h"

// The provider "Sample", some of whose classes fail. It logs calls of factories and cleanup.

namespace {

const CMPIBroker* broker = nullptr;
std::map<std::string, std::string> things;  ///< property Text of each Sample_Thing, by name

/** Describes the properties of an instance. */
std::string describe(const CMPIInstance* instance) {
    std::string all;
    const CMPICount count = instance->ft->getPropertyCount(instance, nullptr);
    for (CMPICount i = 0; i < count; ++i) {
        CMPIString* name = nullptr;
        const CMPIData data = instance->ft->getPropertyAt(instance, i, &name, nullptr);
        all +=
            kit::characters(name) + "=" + (data.type == CMPI_string ? kit::characters(data.value.string) : "?") + ";";
    }
    return all;
}

CMPIInstance* thing(const CMPIObjectPath* like, const std::string& name, const std::string& text) {
    CMPIInstance* instance = kit::newInstance(broker, like, "Sample_Thing", "Name", name);
    kit::set(instance, "Text", text);
    return instance;
}

/** Returns the results and the status of an up-call. */
CMPIStatus returnUpCall(const CMPIContext* context, const CMPIResult* result, const CMPIObjectPath* path) {
    CMPIStatus status = kit::ok;
    const CMPIEnumeration* found = broker->bft->enumerateInstances(broker, context, path, nullptr, &status);
    while (found != nullptr && found->ft->hasNext(found, nullptr) != 0) {
        result->ft->returnInstance(result, found->ft->getNext(found, nullptr).value.inst);
    }
    return status;
}

/** Counts down by up-calls to itself: Sample_Recursive.Name="3" gets "2", and so on. */
CMPIStatus countDown(const CMPIContext* context, const CMPIResult* result, const CMPIObjectPath* path) {
    const int depth = std::stoi(kit::key(path, "Name"));
    std::string below = "bottom";
    if (depth > 0) {
        CMPIObjectPath* next = kit::newPath(broker, path, "Sample_Recursive");
        kit::addKey(next, "Name", std::to_string(depth - 1));
        CMPIStatus status = kit::ok;
        const CMPIInstance* instance = broker->bft->getInstance(broker, context, next, nullptr, &status);
        if (instance == nullptr) {
            return status;
        }
        below = describe(instance);
    }
    result->ft->returnInstance(
        result, kit::newInstance(broker, path, "Sample_Recursive", "Below", std::to_string(depth) + ">" + below));
    return kit::ok;
}

/** Describes the context. */
std::string describe(const CMPIContext* context) {
    std::string all;
    for (const char* name : {CMPIInitNameSpace, CMPIPrincipal}) {
        all += kit::characters(context->ft->getEntry(context, name, nullptr).value.string) + ";";
    }
    return all + std::to_string(context->ft->getEntry(context, CMPIInvocationFlags, nullptr).value.uint32);
}

CMPIStatus cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean terminating) {
    kit::log(broker, terminating != 0 ? "instance cleanup at the end" : "instance cleanup");
    return kit::ok;
}

CMPIStatus enumerateInstanceNames(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                                  const CMPIObjectPath* path) {
    if (kit::className(path) == "Sample_WrongKind") {
        result->ft->returnInstance(result, kit::newInstance(broker, path, "Sample_WrongKind", "Name", "x"));
        return kit::ok;
    }
    for (const auto& [name, text] : things) {
        const CMPIInstance* instance = thing(path, name, text);
        result->ft->returnObjectPath(result, instance->ft->getObjectPath(instance, nullptr));
    }
    result->ft->returnDone(result);
    return kit::ok;
}

CMPIStatus enumerateInstances(CMPIInstanceMI*, const CMPIContext* context, const CMPIResult* result,
                              const CMPIObjectPath* path, const char** properties) {
    const std::string asked = kit::className(path);
    if (asked == "Sample_Throwing") {
        throw std::runtime_error("out of paper");
    }
    if (asked == "Sample_ThrowingOdd") {
        throw 42;
    }
    if (asked == "Sample_Failing") {
        result->ft->returnInstance(result, kit::newInstance(broker, path, asked, "Name", "before"));
        return kit::failure(broker, CMPI_RC_ERR_ACCESS_DENIED, "not for you");
    }
    if (asked == "Sample_Context") {
        result->ft->returnInstance(result, kit::newInstance(broker, path, asked, "Name", describe(context)));
        return kit::ok;
    }
    if (asked.rfind("Sample_Calls", 0) == 0) {
        return returnUpCall(context, result, kit::newPath(broker, path, asked.substr(12)));
    }
    for (const auto& [name, text] : things) {
        result->ft->returnInstance(result, thing(path, name, properties == nullptr ? text : *properties));
    }
    result->ft->returnDone(result);
    return kit::ok;
}

CMPIStatus getInstance(CMPIInstanceMI*, const CMPIContext* context, const CMPIResult* result,
                       const CMPIObjectPath* path, const char**) {
    if (kit::className(path) == "Sample_Recursive") {
        return countDown(context, result, path);
    }
    const auto found = things.find(kit::key(path, "Name"));
    if (found != things.end()) {
        result->ft->returnInstance(result, thing(path, found->first, found->second));
    }
    result->ft->returnDone(result);
    return kit::ok;
}

CMPIStatus createInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                          const CMPIInstance* instance) {
    const std::string asked = kit::className(path);
    const std::string name = kit::key(path, "Name");
    if (asked == "Sample_Silent") {
        return kit::ok;
    }
    if (things.count(name) != 0) {
        return {CMPI_RC_ERR_ALREADY_EXISTS, nullptr};
    }
    things[name] = describe(instance);
    if (asked == "Sample_ReturnsInstance") {
        result->ft->returnInstance(result, thing(path, name, ""));
    } else {
        result->ft->returnObjectPath(result, path);
    }
    result->ft->returnDone(result);
    return kit::ok;
}

CMPIStatus modifyInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* path,
                          const CMPIInstance* instance, const char**) {
    const auto found = things.find(kit::key(path, "Name"));
    if (found == things.end()) {
        return {CMPI_RC_ERR_NOT_FOUND, nullptr};
    }
    found->second = describe(instance);
    return kit::ok;
}

CMPIStatus deleteInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* path) {
    return things.erase(kit::key(path, "Name")) == 0 ? CMPIStatus{CMPI_RC_ERR_NOT_FOUND, nullptr} : kit::ok;
}

CMPIInstanceMIFT instanceTable{CMPIVersion200,         CMPIVersion200,     "instanceSample", cleanup,
                               enumerateInstanceNames, enumerateInstances, getInstance,      createInstance,
                               modifyInstance,         deleteInstance,     nullptr};
CMPIInstanceMI instanceMI{nullptr, &instanceTable};

// Associations: each returns the requested association class.

CMPIStatus associationCleanup(CMPIAssociationMI*, const CMPIContext*, CMPIBoolean) {
    kit::log(broker, "association cleanup at the end");
    return kit::ok;
}

const char* orNone(const char* text) {
    return text == nullptr ? "none" : text;
}

CMPIStatus associators(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                       const char* association, const char* resultClass, const char* role, const char* resultRole,
                       const char**) {
    const std::string asked =
        std::string(orNone(association)) + "," + orNone(resultClass) + "," + orNone(role) + "," + orNone(resultRole);
    result->ft->returnInstance(result, kit::newInstance(broker, path, "Sample_Far", "Asked", asked));
    return kit::ok;
}

CMPIStatus associatorNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                           const char* association, const char*, const char*, const char*) {
    CMPIObjectPath* target = kit::newPath(broker, path, "Sample_Far");
    kit::addKey(target, "Asked", orNone(association));
    result->ft->returnObjectPath(result, target);
    return kit::ok;
}

/** Only Sample_Link supports references. */
CMPIStatus references(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                      const char* resultClass, const char*, const char**) {
    if (std::string(orNone(resultClass)) != "Sample_Link") {
        return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
    }
    result->ft->returnInstance(result, kit::newInstance(broker, path, "Sample_Link", "Asked", orNone(resultClass)));
    return kit::ok;
}

CMPIAssociationMIFT associationTable{CMPIVersion200, CMPIVersion200,  "associationSample", associationCleanup,
                                     associators,    associatorNames, references,          kit::noReferenceNames};
CMPIAssociationMI associationMI{nullptr, &associationTable};

}  // namespace

KIT_EXPORT CMPIInstanceMI* Sample_Create_InstanceMI(const CMPIBroker* itsBroker, const CMPIContext*, CMPIStatus*) {
    kit::store(broker, itsBroker);
    kit::log(broker, "instance factory");
    return &instanceMI;
}

KIT_EXPORT CMPIAssociationMI* Sample_Create_AssociationMI(const CMPIBroker* itsBroker, const CMPIContext*,
                                                          CMPIStatus*) {
    kit::store(broker, itsBroker);
    kit::log(broker, "association factory");
    return &associationMI;
}
