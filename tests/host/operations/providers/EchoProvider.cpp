#include <sstream>
#include <stdexcept>
#include <thread>

#include "ProviderKit.h"

// The provider "Echo". Echo_Seen describes its last request. The other classes each do something that object managers
// treat differently.

namespace {

const CMPIBroker* broker = nullptr;
std::string seen;

std::string orNone(const char* text) {
    return text == nullptr ? "none" : text;
}

std::string describeText(const CMPIString* string, bool isNull) {
    const char* text = string == nullptr ? nullptr : string->ft->getCharPtr(string, nullptr);
    if (isNull) {
        return string == nullptr ? "(null)"
               : text == nullptr ? "(null without characters)"
                                 : "(null, yet " + std::string(text) + ")";
    }
    return text == nullptr ? "(without characters)" : text;
}

/** Describes a value; in parentheses if there is none. */
std::string describe(const CMPIData& data, const CMPIStatus& status) {
    const bool isNull = (data.state & CMPI_nullValue) != 0;
    if (status.rc != CMPI_RC_OK) {
        return "(error " + std::to_string(status.rc) + (isNull ? ", null)" : ")");
    }
    if (data.type == CMPI_string) {
        return describeText(data.value.string, isNull);
    }
    return isNull ? "(null)" : data.type == CMPI_uint32 ? std::to_string(data.value.uint32) : "(something)";
}

std::string describe(const CMPIObjectPath* path) {
    std::string all;
    for (CMPICount i = 0; i < path->ft->getKeyCount(path, nullptr); ++i) {
        CMPIString* name = nullptr;
        path->ft->getKeyAt(path, i, &name, nullptr);
        CMPIStatus status = kit::ok;
        const CMPIData data = path->ft->getKey(path, kit::characters(name).c_str(), &status);
        all += kit::characters(name) + "=" + describe(data, status) + ";";
    }
    return kit::className(path) + "." + all;
}

std::string describe(const CMPIInstance* instance) {
    std::string all;
    for (CMPICount i = 0; i < instance->ft->getPropertyCount(instance, nullptr); ++i) {
        CMPIString* name = nullptr;
        CMPIStatus status = kit::ok;
        const CMPIData data = instance->ft->getPropertyAt(instance, i, &name, &status);
        all += kit::characters(name) + "=" + describe(data, status) + ";";
    }
    return all;
}

std::string describe(const char** properties) {
    std::string all = properties == nullptr ? "null" : "";
    for (const char** each = properties; each != nullptr && *each != nullptr; ++each) {
        all += std::string(*each) + ";";
    }
    return all;
}

std::string describe(const CMPIContext* context) {
    std::string all;
    for (const char* name : {CMPIPrincipal, CMPIRole}) {
        CMPIStatus status = kit::ok;
        const CMPIData data = context->ft->getEntry(context, name, &status);
        all += std::string(name) + "=" + describe(data, status) + ";";
    }
    return all;
}

std::string describeBroker() {
    const CMPIBrokerEncFT& make = *broker->eft;
    std::string all = "version " + std::to_string(broker->bft->brokerVersion) + "/" + std::to_string(make.ftVersion);
    const bool lacksEncapsulation = make.newCMPIError == nullptr && make.openMessageFile == nullptr &&
                                    make.closeMessageFile == nullptr && make.getMessage2 == nullptr;
    const bool lacksThreads = broker->xft->joinThread == nullptr && broker->xft->exitThread == nullptr &&
                              broker->xft->cancelThread == nullptr && broker->xft->threadSleep == nullptr &&
                              broker->xft->signalCondition == nullptr;
    all += lacksEncapsulation ? ", no errors and messages" : "";
    all += lacksThreads ? ", no joining" : "";
    if (broker->mft == nullptr) {
        return all + ", no memory table";
    }
    const bool marks = broker->mft->mark != nullptr && broker->mft->release != nullptr;
    return all +
           (marks && broker->mft->cmpiMalloc == nullptr && broker->mft->freeString == nullptr ? ", only marks" : "");
}

std::string describeThread() {
    std::ostringstream id;
    id << std::this_thread::get_id();
    return id.str();
}

CMPIInstance* reply(const CMPIObjectPath* path, const std::string& text) {
    return kit::newInstance(broker, path, kit::className(path), "Text", text);
}

/** Describes the thread of an up-call to Echo_Thread. */
std::string describeUpCall(const CMPIContext* context, const CMPIObjectPath* path) {
    const CMPIObjectPath* other = kit::newPath(broker, path, "Echo_Thread");
    const CMPIEnumeration* found = broker->bft->enumerateInstances(broker, context, other, nullptr, nullptr);
    const CMPIInstance* answer = found->ft->getNext(found, nullptr).value.inst;
    const CMPIString* thread = answer->ft->getProperty(answer, "Text", nullptr).value.string;
    return kit::characters(thread) == describeThread() ? "same thread" : "another thread";
}

CMPIStatus enumerateInstances(CMPIInstanceMI*, const CMPIContext* context, const CMPIResult* result,
                              const CMPIObjectPath* path, const char** properties) {
    const std::string asked = kit::className(path);
    if (asked == "Echo_Seen") {
        result->ft->returnInstance(result, reply(path, seen));
    } else if (asked == "Echo_Broker") {
        result->ft->returnInstance(result, reply(path, describeBroker()));
    } else if (asked == "Echo_Thread") {
        result->ft->returnInstance(result, reply(path, describeThread()));
    } else if (asked == "Echo_Calls") {
        result->ft->returnInstance(result, reply(path, describeUpCall(context, path)));
    } else if (asked == "Echo_Throwing") {
        throw std::runtime_error("out of ink");
    } else {
        seen = asked + "," + describe(context) + "," + describe(properties);
    }
    return kit::ok;
}

/** Returns an instance of the path's name if that is "there", and reports the status of returnDone. */
CMPIStatus getInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                       const char** properties) {
    if (kit::key(path, "Name") == "there") {
        result->ft->returnInstance(result, reply(path, "here"));
    }
    const CMPIStatus done = result->ft->returnDone(result);
    seen = describe(path) + "," + describe(properties) + ",done " + std::to_string(done.rc) + " " +
           kit::characters(done.msg);
    return kit::ok;
}

CMPIStatus createInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                          const CMPIInstance* instance) {
    const std::string asked = kit::className(path);
    seen = describe(path) + " " + describe(instance);
    CMPIObjectPath* made = kit::newPath(broker, path, asked);
    kit::addKey(made, "Name", "made");
    if (asked == "Echo_ReturnsInstance" || asked == "Echo_ReturnsBoth") {
        seen = "instance " + std::to_string(result->ft->returnInstance(result, reply(path, "an instance")).rc);
    }
    if (asked != "Echo_ReturnsInstance" && asked != "Echo_ReturnsNothing") {
        result->ft->returnObjectPath(result, made);
    }
    if (asked == "Echo_ReleasesPath") {
        made->ft->release(made);
    }
    return kit::ok;
}

CMPIStatus modifyInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* path,
                          const CMPIInstance* instance, const char** properties) {
    seen = describe(path) + " " + describe(instance) + " " + describe(properties);
    return kit::ok;
}

CMPIInstanceMIFT instanceTable{
    CMPIVersion200, CMPIVersion200, "instanceEcho", kit::cleanup, nullptr, enumerateInstances,
    getInstance,    createInstance, modifyInstance, nullptr,      nullptr};
CMPIInstanceMI instanceMI{nullptr, &instanceTable};

CMPIStatus associators(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                       const char* association, const char*, const char*, const char*, const char** properties) {
    result->ft->returnInstance(result, reply(path, orNone(association) + "," + describe(properties)));
    return kit::ok;
}

CMPIAssociationMIFT associationTable{CMPIVersion200, CMPIVersion200,         "associationEcho", kit::cleanup,
                                     associators,    kit::noAssociatorNames, kit::noReferences, kit::noReferenceNames};
CMPIAssociationMI associationMI{nullptr, &associationTable};

}  // namespace

KIT_EXPORT CMPIInstanceMI* Echo_Create_InstanceMI(const CMPIBroker* itsBroker, const CMPIContext*, CMPIStatus*) {
    kit::store(broker, itsBroker);
    kit::log(broker, "echo factory");
    return &instanceMI;
}

/** Enumerates Echo_Calls in its factory. */
KIT_EXPORT CMPIInstanceMI* Curious_Create_InstanceMI(const CMPIBroker* itsBroker, const CMPIContext* context,
                                                     CMPIStatus* status) {
    const CMPIObjectPath* path = itsBroker->eft->newObjectPath(itsBroker, "root/cimv2", "Echo_Calls", nullptr);
    itsBroker->bft->enumerateInstances(itsBroker, context, path, nullptr, status);
    return &instanceMI;
}

KIT_EXPORT CMPIAssociationMI* Echo_Create_AssociationMI(const CMPIBroker* itsBroker, const CMPIContext*, CMPIStatus*) {
    kit::store(broker, itsBroker);
    return &associationMI;
}
