/*
 * Management interfaces: the functions of a provider, one table per kind of operation. Included by cmpift.h.
 *
 * A provider's library exports one factory per interface, with C linkage: NAME_Create_InstanceMI,
 * NAME_Create_AssociationMI and so on, where NAME is the provider's name in its registration. A factory receives the
 * broker, a context and a status. It returns the interface, which the provider owns and which is valid until its
 * cleanup. On failure it returns null and writes the reason to the status.
 *
 * Rules for all tables:
 * - The operations may be called on any thread, and concurrently.
 * - Context, result, object path, instance and strings belong to the caller. They are borrowed for the call.
 * - An operation writes its results to the result object and returns only a status.
 * - An operation that a provider does not support returns CMPI_RC_ERR_NOT_SUPPORTED; no slot is null.
 * - miVersion is the interface version that the provider was written for, miName the name of the interface.
 * - cleanup is called before the provider is unloaded. `terminating` is true if the broker itself ends; otherwise the
 *   provider can refuse with CMPI_RC_DO_NOT_UNLOAD or CMPI_RC_NEVER_UNLOAD.
 * - The names of classes and roles, and the property list, restrict the results. A null pointer does not restrict them.
 */
#ifndef CMPI20_INTERFACES_H
#define CMPI20_INTERFACES_H

#include "../cmpidt.h"

#ifdef __cplusplus
extern "C" {
#endif

/** Instance operations of a class. */
struct _CMPIInstanceMI {
    const void* hdl; /**< owned by the provider, as in the interfaces below; may be null */
    CMPIInstanceMIFT* ft;
};

struct _CMPIInstanceMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIInstanceMI* mi, const CMPIContext* context, CMPIBoolean terminating);

    /** Returns the object paths of all instances of the path's class. */
    CMPIStatus (*enumerateInstanceNames)(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                         const CMPIObjectPath* classPath);
    /** Returns all instances of the path's class. */
    CMPIStatus (*enumerateInstances)(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                     const CMPIObjectPath* classPath, const char** properties);
    /** Returns the instance with the path, or CMPI_RC_ERR_NOT_FOUND. */
    CMPIStatus (*getInstance)(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                              const CMPIObjectPath* path, const char** properties);
    /** Creates an instance and returns its object path. */
    CMPIStatus (*createInstance)(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                 const CMPIObjectPath* path, const CMPIInstance* instance);
    /** Sets the listed properties of the instance with the path. */
    CMPIStatus (*modifyInstance)(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                 const CMPIObjectPath* path, const CMPIInstance* instance, const char** properties);
    /** Deletes the instance with the path. */
    CMPIStatus (*deleteInstance)(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                 const CMPIObjectPath* path);
    /** Returns the instances of the path's class that a query selects. */
    CMPIStatus (*execQuery)(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                            const CMPIObjectPath* classPath, const char* query, const char* language);
};

/** Association operations. The path is the source. */
struct _CMPIAssociationMI {
    void* hdl;
    CMPIAssociationMIFT* ft;
};

struct _CMPIAssociationMIFT {
    int ftVersion;
    const CMPISint32 miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIAssociationMI* mi, const CMPIContext* context, CMPIBoolean terminating);

    /** Returns the associated instances. */
    CMPIStatus (*associators)(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                              const CMPIObjectPath* path, const char* assocClass, const char* resultClass,
                              const char* role, const char* resultRole, const char** properties);
    /** Returns the object paths of the associated instances. */
    CMPIStatus (*associatorNames)(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                                  const CMPIObjectPath* path, const char* assocClass, const char* resultClass,
                                  const char* role, const char* resultRole);
    /** Returns the association instances; resultClass is their class. */
    CMPIStatus (*references)(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                             const CMPIObjectPath* path, const char* resultClass, const char* role,
                             const char** properties);
    /** Returns the object paths of the association instances. */
    CMPIStatus (*referenceNames)(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                                 const CMPIObjectPath* path, const char* resultClass, const char* role);
};

/** Methods of a class and of its instances. */
struct _CMPIMethodMI {
    void* hdl;
    CMPIMethodMIFT* ft;
};

struct _CMPIMethodMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIMethodMI* mi, const CMPIContext* context, CMPIBoolean terminating);

    /** Calls a method. Adds its output arguments to `out` and returns its result as data. */
    CMPIStatus (*invokeMethod)(CMPIMethodMI* mi, const CMPIContext* context, const CMPIResult* result,
                               const CMPIObjectPath* path, const char* method, const CMPIArgs* in, CMPIArgs* out);
};

/** Single properties of instances. */
struct _CMPIPropertyMI {
    void* hdl;
    CMPIPropertyMIFT* ft;
};

struct _CMPIPropertyMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIPropertyMI* mi, const CMPIContext* context, CMPIBoolean terminating);

    /** Sets a property of the instance with the path. */
    CMPIStatus (*setProperty)(CMPIPropertyMI* mi, const CMPIContext* context, const CMPIResult* result,
                              const CMPIObjectPath* path, const char* name, const CMPIData data);
    /** Returns a property of the instance with the path, as data. */
    CMPIStatus (*getProperty)(CMPIPropertyMI* mi, const CMPIContext* context, const CMPIResult* result,
                              const CMPIObjectPath* path, const char* name);
    /** Like setProperty, with the class that declares the property. Since CMPI 2.0; may be null. */
    CMPIStatus (*setPropertyWithOrigin)(CMPIPropertyMI* mi, const CMPIContext* context, const CMPIResult* result,
                                        CMPIObjectPath* path, const char* name, const CMPIData data,
                                        const char* origin);
};

/** Indications of a class. Filters are select expressions, identified by their address. */
struct _CMPIIndicationMI {
    void* hdl;
    CMPIIndicationMIFT* ft;
};

struct _CMPIIndicationMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIIndicationMI* mi, const CMPIContext* context, CMPIBoolean terminating);

    /** Returns CMPI_RC_OK if the owner may subscribe with a filter to indications of a class. */
    CMPIStatus (*authorizeFilter)(CMPIIndicationMI* mi, const CMPIContext* context, const CMPISelectExp* filter,
                                  const char* className, const CMPIObjectPath* path, const char* owner);
    /** Returns CMPI_RC_OK if the broker must poll instances, because the provider does not detect changes. */
    CMPIStatus (*mustPoll)(CMPIIndicationMI* mi, const CMPIContext* context, const CMPISelectExp* filter,
                           const char* className, const CMPIObjectPath* path);
    /** Reports a new subscription with a filter; `first` is true if it is the first for this class. */
    CMPIStatus (*activateFilter)(CMPIIndicationMI* mi, const CMPIContext* context, const CMPISelectExp* filter,
                                 const char* className, const CMPIObjectPath* path, CMPIBoolean first);
    /** Reports the end of a subscription; `last` is true if it was the last for this class. */
    CMPIStatus (*deActivateFilter)(CMPIIndicationMI* mi, const CMPIContext* context, const CMPISelectExp* filter,
                                   const char* className, const CMPIObjectPath* path, CMPIBoolean last);
    /** Allows the provider to deliver indications. */
    CMPIStatus (*enableIndications)(CMPIIndicationMI* mi, const CMPIContext* context);
    /** Forbids the provider to deliver indications until they are enabled again. */
    CMPIStatus (*disableIndications)(CMPIIndicationMI* mi, const CMPIContext* context);
};

#ifdef __cplusplus
}
#endif

#endif
