#include "LeaseAndWarrantyProvider.h"

#include <exception>
#include <string>

#include "Dispatch.h"
#include "KO/ProviderUtilities.h"
#include "Trace.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerLeaseAndWarrantyProvider = LoggerNames::loggerName(LoggerNames::provider);

/** Broker of the latest call to a factory. */
const CMPIBroker* broker = nullptr;

namespace {

const TraceSource traceSource{loggerLeaseAndWarrantyProvider, "LeaseAndWarrantyProvider.cpp"};

/** Logs the entry of a dispatched entry point and, unless an exception leaves it, the exit. */
class EntryMarkers {
public:
    explicit EntryMarkers(const CallSite& callSite) : site(callSite), exceptions(std::uncaught_exceptions()) {
        markProviderEntry(site.source->logger, site.function, site.source->file, site.line);
    }

    ~EntryMarkers() {
        if (std::uncaught_exceptions() == exceptions) {
            markProviderExit(site.source->logger, site.function, site.source->file, site.line);
        }
    }

    EntryMarkers(const EntryMarkers&) = delete;
    EntryMarkers& operator=(const EntryMarkers&) = delete;

private:
    CallSite site;
    int exceptions;
};

/** Returns and traces the class id of a request's path or association class. */
template <class Class>
unsigned short classIdOf(const CallSite& site, Class requestedClass) {
    const unsigned short classId = ProviderUtilities::getClassId(requestedClass);
    traceVariable(site, "classId", classId);
    return classId;
}

/**
 * Returns the namespace of a path; empty on failure. Sets the status of the entry point, which is returned even if an
 * exception follows. Does not use ProviderUtilities::getNamespace, since that returns no status.
 */
std::string nameSpaceOf(const CMPIObjectPath* path, CMPIStatus& status) {
    if (path == nullptr) {
        return {};
    }
    const CMPIString* string = path->ft->getNameSpace(path, &status);
    if (status.rc != CMPI_RC_OK || string == nullptr) {
        return {};
    }
    const char* characters = string->ft->getCharPtr(string, &status);
    return status.rc == CMPI_RC_OK && characters != nullptr ? characters : "";
}

/**
 * Runs the handler of an operation for the class of a path or a class name, between the markers of the entry point.
 * Exceptions derived from std::exception are only logged: the object manager receives the current status, normally
 * CMPI_RC_OK, and the results returned so far. Other exceptions leave the provider. The returned status has no message,
 * since a message that a failing broker call wrote does not belong to the provider.
 */
template <class Class>
CMPIStatus serve(const CallSite& site, Handler ClassHandlers::*operation, Class requestedClass, Invocation invocation) {
    const EntryMarkers markers(site);
    try {
        const unsigned short classId = classIdOf(site, requestedClass);
        if (operation == &ClassHandlers::createInstance) {
            invocation.nameSpace = nameSpaceOf(invocation.path, invocation.status);
        }
        (handlersOf(classId).*operation)(invocation);
    } catch (const std::exception& failure) {
        traceMessage(at(traceSource, Level::error, site.function), failure.what());
    }
    return {invocation.status.rc, nullptr};
}

/** Traces the call of an operation that has no handler, and returns its fixed status. */
CMPIStatus note(const CallSite& site, CMPIrc rc) {
    traceMethod(site);
    return {rc, nullptr};
}

CMPIStatus LeaseAndWarranty_Cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return note(at(traceSource), CMPI_RC_OK);
}

CMPIStatus LeaseAndWarranty_EnumInstanceNames(CMPIInstanceMI*, const CMPIContext* ctx, const CMPIResult* result,
                                              const CMPIObjectPath* ref) {
    return serve(at(traceSource), &ClassHandlers::enumInstanceNames, ref, {broker, ctx, result, ref});
}

CMPIStatus LeaseAndWarranty_EnumInstances(CMPIInstanceMI*, const CMPIContext* ctx, const CMPIResult* result,
                                          const CMPIObjectPath* ref, const char** properties) {
    return serve(at(traceSource), &ClassHandlers::enumInstances, ref, {broker, ctx, result, ref, properties});
}

CMPIStatus LeaseAndWarranty_GetInstance(CMPIInstanceMI*, const CMPIContext* ctx, const CMPIResult* result,
                                        const CMPIObjectPath* ref, const char** properties) {
    return serve(at(traceSource), &ClassHandlers::getInstance, ref, {broker, ctx, result, ref, properties});
}

CMPIStatus LeaseAndWarranty_CreateInstance(CMPIInstanceMI*, const CMPIContext* ctx, const CMPIResult* result,
                                           const CMPIObjectPath* ref, const CMPIInstance*) {
    return serve(at(traceSource), &ClassHandlers::createInstance, ref, {broker, ctx, result, ref});
}

CMPIStatus LeaseAndWarranty_ModifyInstance(CMPIInstanceMI*, const CMPIContext* ctx, const CMPIResult* result,
                                           const CMPIObjectPath* ref, const CMPIInstance* inst,
                                           const char** properties) {
    return serve(at(traceSource), &ClassHandlers::modifyInstance, ref, {broker, ctx, result, ref, properties, inst});
}

CMPIStatus LeaseAndWarranty_DeleteInstance(CMPIInstanceMI*, const CMPIContext* ctx, const CMPIResult* result,
                                           const CMPIObjectPath* ref) {
    return serve(at(traceSource), &ClassHandlers::deleteInstance, ref, {broker, ctx, result, ref});
}

CMPIStatus LeaseAndWarranty_ExecQuery(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                                      const char*, const char*) {
    return note(at(traceSource), CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIStatus LeaseAndWarranty_AssociationCleanup(CMPIAssociationMI*, const CMPIContext*, CMPIBoolean) {
    return note(at(traceSource), CMPI_RC_OK);
}

CMPIStatus LeaseAndWarranty_Associators(CMPIAssociationMI*, const CMPIContext* ctx, const CMPIResult* result,
                                        const CMPIObjectPath* ref, const char* assocClass, const char*, const char*,
                                        const char*, const char** properties) {
    return serve(at(traceSource), &ClassHandlers::associators, assocClass, {broker, ctx, result, ref, properties});
}

CMPIStatus LeaseAndWarranty_AssociatorNames(CMPIAssociationMI*, const CMPIContext* ctx, const CMPIResult* result,
                                            const CMPIObjectPath* ref, const char* assocClass, const char*, const char*,
                                            const char*) {
    return serve(at(traceSource), &ClassHandlers::associatorNames, assocClass, {broker, ctx, result, ref});
}

CMPIStatus LeaseAndWarranty_References(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                                       const char*, const char*, const char**) {
    return note(at(traceSource), CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIStatus LeaseAndWarranty_ReferenceNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*,
                                           const CMPIObjectPath*, const char*, const char*) {
    return note(at(traceSource), CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIInstanceMIFT instMIFT__{
    CMPIVersion200,
    CMPIVersion200,
    "instanceLeaseAndWarrantyProvider",
    LeaseAndWarranty_Cleanup,
    LeaseAndWarranty_EnumInstanceNames,
    LeaseAndWarranty_EnumInstances,
    LeaseAndWarranty_GetInstance,
    LeaseAndWarranty_CreateInstance,
    LeaseAndWarranty_ModifyInstance,
    LeaseAndWarranty_DeleteInstance,
    LeaseAndWarranty_ExecQuery,
};

CMPIAssociationMIFT assocMIFT__{
    CMPIVersion200,
    CMPIVersion200,
    "associationLeaseAndWarrantyProvider",
    LeaseAndWarranty_AssociationCleanup,
    LeaseAndWarranty_Associators,
    LeaseAndWarranty_AssociatorNames,
    LeaseAndWarranty_References,
    LeaseAndWarranty_ReferenceNames,
};

CMPIInstanceMI instanceMI{nullptr, &instMIFT__};
CMPIAssociationMI associationMI{nullptr, &assocMIFT__};

}  // namespace

}  // namespace KO::LeaseWarrantyProvider

CMPIInstanceMI* LeaseAndWarrantyProvider_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext*, CMPIStatus*) {
    KO::LeaseWarrantyProvider::broker = broker;
    return &KO::LeaseWarrantyProvider::instanceMI;
}

CMPIAssociationMI* LeaseAndWarrantyProvider_Create_AssociationMI(const CMPIBroker* broker, const CMPIContext*,
                                                                 CMPIStatus*) {
    KO::LeaseWarrantyProvider::broker = broker;
    return &KO::LeaseWarrantyProvider::associationMI;
}
