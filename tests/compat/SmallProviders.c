#include "SmallProviders.h"

#include <cmpidt.h>
#include <cmpift.h>
#include <cmpimacs.h>

/* Each operation returns a unique code, so that tests can identify the function in a slot. */

static const CMPIBroker* broker;
static int hookRuns;

#define UNUSED_REQUEST \
    (void)mi;          \
    (void)context

static CMPIStatus smallCleanup(CMPIInstanceMI* mi, const CMPIContext* context, CMPIBoolean terminating) {
    UNUSED_REQUEST;
    CMReturn(terminating ? CMPI_RC_OK : CMPI_RC_DO_NOT_UNLOAD);
}

static CMPIStatus smallEnumInstanceNames(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                         const CMPIObjectPath* path) {
    UNUSED_REQUEST;
    CMReturnObjectPath(result, path);
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus smallEnumInstances(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                     const CMPIObjectPath* path, const char** properties) {
    UNUSED_REQUEST;
    (void)result;
    (void)path;
    (void)properties;
    CMReturn(CMPI_RC_ERR_INVALID_CLASS);
}

static CMPIStatus smallGetInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                   const CMPIObjectPath* path, const char** properties) {
    CMPIStatus status = {CMPI_RC_OK, NULL};
    const CMPIData key = CMGetKey(path, "Id", &status);
    CMPIInstance* instance;
    UNUSED_REQUEST;
    (void)properties;
    if (status.rc != CMPI_RC_OK || CMIsNullValue(key)) {
        CMReturnWithChars(broker, CMPI_RC_ERR_NOT_FOUND, "no such thing");
    }
    instance = CMNewInstance(broker, path, &status);
    if (CMIsNullObject(instance)) {
        CMReturnWithString(CMPI_RC_ERR_FAILED, status.msg);
    }
    CMSetProperty(instance, "Name", "small", CMPI_chars);
    CMReturnInstance(result, instance);
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus smallCreateInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                      const CMPIObjectPath* path, const CMPIInstance* instance) {
    UNUSED_REQUEST;
    (void)result;
    (void)path;
    (void)instance;
    CMReturn(CMPI_RC_ERR_ALREADY_EXISTS);
}

static CMPIStatus smallModifyInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                      const CMPIObjectPath* path, const CMPIInstance* instance,
                                      const char** properties) {
    UNUSED_REQUEST;
    (void)result;
    (void)path;
    (void)instance;
    (void)properties;
    CMReturn(CMPI_RC_ERR_NO_SUCH_PROPERTY);
}

static CMPIStatus smallDeleteInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                      const CMPIObjectPath* path) {
    UNUSED_REQUEST;
    (void)result;
    (void)path;
    CMReturn(CMPI_RC_ERR_NOT_FOUND);
}

static CMPIStatus smallExecQuery(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                 const CMPIObjectPath* path, const char* query, const char* language) {
    UNUSED_REQUEST;
    (void)result;
    (void)path;
    (void)query;
    (void)language;
    CMReturn(CMPI_RC_ERR_INVALID_QUERY);
}

static CMPIStatus smallAssociationCleanup(CMPIAssociationMI* mi, const CMPIContext* context, CMPIBoolean terminating) {
    UNUSED_REQUEST;
    (void)terminating;
    CMReturn(CMPI_RC_NEVER_UNLOAD);
}

static CMPIStatus smallAssociators(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                                   const CMPIObjectPath* path, const char* assocClass, const char* resultClass,
                                   const char* role, const char* resultRole, const char** properties) {
    UNUSED_REQUEST;
    (void)result;
    (void)path;
    (void)assocClass;
    (void)resultClass;
    (void)role;
    (void)resultRole;
    (void)properties;
    CMReturn(CMPI_RC_ERR_FAILED);
}

static CMPIStatus smallAssociatorNames(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                                       const CMPIObjectPath* path, const char* assocClass, const char* resultClass,
                                       const char* role, const char* resultRole) {
    UNUSED_REQUEST;
    (void)result;
    (void)path;
    (void)assocClass;
    (void)resultClass;
    (void)role;
    (void)resultRole;
    CMReturn(CMPI_RC_ERR_ACCESS_DENIED);
}

static CMPIStatus smallReferences(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                                  const CMPIObjectPath* path, const char* resultClass, const char* role,
                                  const char** properties) {
    UNUSED_REQUEST;
    (void)result;
    (void)path;
    (void)resultClass;
    (void)role;
    (void)properties;
    CMReturn(CMPI_RC_ERR_INVALID_NAMESPACE);
}

static CMPIStatus smallReferenceNames(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                                      const CMPIObjectPath* path, const char* resultClass, const char* role) {
    UNUSED_REQUEST;
    (void)result;
    (void)path;
    (void)resultClass;
    (void)role;
    CMReturn(CMPI_RC_ERR_INVALID_PARAMETER);
}

static CMPIStatus smallMethodCleanup(CMPIMethodMI* mi, const CMPIContext* context, CMPIBoolean terminating) {
    UNUSED_REQUEST;
    (void)terminating;
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus smallInvokeMethod(CMPIMethodMI* mi, const CMPIContext* context, const CMPIResult* result,
                                    const CMPIObjectPath* path, const char* method, const CMPIArgs* in, CMPIArgs* out) {
    UNUSED_REQUEST;
    (void)result;
    (void)path;
    (void)method;
    (void)in;
    (void)out;
    CMReturn(CMPI_RC_ERR_METHOD_NOT_FOUND);
}

static CMPIStatus smallPropertyCleanup(CMPIPropertyMI* mi, const CMPIContext* context, CMPIBoolean terminating) {
    UNUSED_REQUEST;
    (void)terminating;
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus smallSetProperty(CMPIPropertyMI* mi, const CMPIContext* context, const CMPIResult* result,
                                   const CMPIObjectPath* path, const char* name, const CMPIData data) {
    UNUSED_REQUEST;
    (void)result;
    (void)path;
    (void)name;
    (void)data;
    CMReturn(CMPI_RC_ERR_TYPE_MISMATCH);
}

static CMPIStatus smallGetProperty(CMPIPropertyMI* mi, const CMPIContext* context, const CMPIResult* result,
                                   const CMPIObjectPath* path, const char* name) {
    UNUSED_REQUEST;
    (void)result;
    (void)path;
    (void)name;
    CMReturn(CMPI_RC_ERR_NO_SUCH_PROPERTY);
}

static CMPIStatus smallIndicationCleanup(CMPIIndicationMI* mi, const CMPIContext* context, CMPIBoolean terminating) {
    UNUSED_REQUEST;
    (void)terminating;
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus smallAuthorizeFilter(CMPIIndicationMI* mi, const CMPIContext* context, const CMPISelectExp* filter,
                                       const char* className, const CMPIObjectPath* path, const char* owner) {
    UNUSED_REQUEST;
    (void)filter;
    (void)className;
    (void)path;
    (void)owner;
    CMReturn(CMPI_RC_ERR_ACCESS_DENIED);
}

static CMPIStatus smallMustPoll(CMPIIndicationMI* mi, const CMPIContext* context, const CMPISelectExp* filter,
                                const char* className, const CMPIObjectPath* path) {
    UNUSED_REQUEST;
    (void)filter;
    (void)className;
    (void)path;
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus smallActivateFilter(CMPIIndicationMI* mi, const CMPIContext* context, const CMPISelectExp* filter,
                                      const char* className, const CMPIObjectPath* path, CMPIBoolean first) {
    UNUSED_REQUEST;
    (void)filter;
    (void)className;
    (void)path;
    (void)first;
    CMReturn(CMPI_RC_ERR_INVALID_QUERY);
}

static CMPIStatus smallDeActivateFilter(CMPIIndicationMI* mi, const CMPIContext* context, const CMPISelectExp* filter,
                                        const char* className, const CMPIObjectPath* path, CMPIBoolean last) {
    UNUSED_REQUEST;
    (void)filter;
    (void)className;
    (void)path;
    (void)last;
    CMReturn(CMPI_RC_ERR_NOT_FOUND);
}

static CMPIStatus smallEnableIndications(CMPIIndicationMI* mi, const CMPIContext* context) {
    UNUSED_REQUEST;
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus smallDisableIndications(CMPIIndicationMI* mi, const CMPIContext* context) {
    UNUSED_REQUEST;
    CMReturn(CMPI_RC_ERR_FAILED);
}

CMInstanceMIStub(small, Small, broker, CMNoHook) CMAssociationMIStub(small, Small, broker, CMNoHook)
    CMMethodMIStub(small, Small, broker, CMNoHook) CMPropertyMIStub(small, Small, broker, CMNoHook)
        CMIndicationMIStub(small, Small, broker, CMNoHook)

            static void noteFactoryCall(const CMPIContext* context, CMPIStatus* rc) {
    ++hookRuns;
    if (context == NULL) {
        CMSetStatus(rc, CMPI_RC_ERR_INVALID_PARAMETER);
    }
}

CMInstanceMIStub(small, Smaller, broker, noteFactoryCall(ctx, rc))

    const CMPIBroker* smallProvidersBroker(void) {
    return broker;
}

int smallerHookRuns(void) {
    return hookRuns;
}
