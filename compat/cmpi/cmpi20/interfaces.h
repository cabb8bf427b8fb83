/*
 * Management interfaces: what a provider offers, one table a kind of operation. Included by cmpift.h.
 *
 * A provider's library exports one factory an interface that it offers, with C linkage:
 * NAME_Create_InstanceMI, NAME_Create_AssociationMI and so on, where NAME is the provider's name in
 * its registration. A factory is given the broker, a context and a status, and answers the interface,
 * which is the provider's own and stays valid until its cleanup; or null, with the reason in the
 * status.
 *
 * What holds for all tables here:
 * - The operations are called on any thread, and on several at once.
 * - Context, result, object path, instance and texts belong to the caller; they are borrowed for the
 *   call.
 * - What an operation answers goes into the result; the status says only how it ended.
 * - An operation that a provider does not support answers CMPI_RC_ERR_NOT_SUPPORTED; no slot is null.
 * - miVersion is the version of the interface that the provider was written for, miName its name.
 * - cleanup is called before the provider is unloaded. `terminating` is true when the broker itself
 *   ends; otherwise the provider can refuse with CMPI_RC_DO_NOT_UNLOAD or CMPI_RC_NEVER_UNLOAD.
 * - The names of classes and roles, and the property list, restrict the answer; null does not.
 */
#ifndef CMPI20_INTERFACES_H
#define CMPI20_INTERFACES_H

#include "../cmpidt.h"

#ifdef __cplusplus
extern "C" {
#endif

/** Instances of a class. */
struct _CMPIInstanceMI {
    const void* hdl; /**< the provider's own, as in the interfaces below; may be null */
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
    /** Returns the instance that the path names; CMPI_RC_ERR_NOT_FOUND when there is none. */
    CMPIStatus (*getInstance)(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                              const CMPIObjectPath* path, const char** properties);
    /** Creates an instance and returns its object path. */
    CMPIStatus (*createInstance)(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                 const CMPIObjectPath* path, const CMPIInstance* instance);
    /** Changes the listed properties of the instance that the path names to those given. */
    CMPIStatus (*modifyInstance)(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                 const CMPIObjectPath* path, const CMPIInstance* instance, const char** properties);
    /** Deletes the instance that the path names. */
    CMPIStatus (*deleteInstance)(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                 const CMPIObjectPath* path);
    /** Returns the instances of the path's class that a query in a language selects. */
    CMPIStatus (*execQuery)(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                            const CMPIObjectPath* classPath, const char* query, const char* language);
};

/** Associations of a class with others. The path is where they start. */
struct _CMPIAssociationMI {
    void* hdl;
    CMPIAssociationMIFT* ft;
};

struct _CMPIAssociationMIFT {
    int ftVersion;
    const CMPISint32 miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIAssociationMI* mi, const CMPIContext* context, CMPIBoolean terminating);

    /** Returns the instances at the far ends. */
    CMPIStatus (*associators)(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                              const CMPIObjectPath* path, const char* assocClass, const char* resultClass,
                              const char* role, const char* resultRole, const char** properties);
    /** Returns the object paths of the far ends. */
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

    /** Runs a method; adds its output to `out` and returns what it answers as data. */
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

    /** Sets a property of the instance that the path names. */
    CMPIStatus (*setProperty)(CMPIPropertyMI* mi, const CMPIContext* context, const CMPIResult* result,
                              const CMPIObjectPath* path, const char* name, const CMPIData data);
    /** Returns a property of the instance that the path names, as data. */
    CMPIStatus (*getProperty)(CMPIPropertyMI* mi, const CMPIContext* context, const CMPIResult* result,
                              const CMPIObjectPath* path, const char* name);
    /** As setProperty, with the class that declares the property. Since CMPI 2.0; may be null. */
    CMPIStatus (*setPropertyWithOrigin)(CMPIPropertyMI* mi, const CMPIContext* context, const CMPIResult* result,
                                        CMPIObjectPath* path, const char* name, const CMPIData data,
                                        const char* origin);
};

/** Indications of a class. Filters are select expressions; a filter is known by its address. */
struct _CMPIIndicationMI {
    void* hdl;
    CMPIIndicationMIFT* ft;
};

struct _CMPIIndicationMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIIndicationMI* mi, const CMPIContext* context, CMPIBoolean terminating);

    /** CMPI_RC_OK when the owner may subscribe with a filter to indications of a class. */
    CMPIStatus (*authorizeFilter)(CMPIIndicationMI* mi, const CMPIContext* context, const CMPISelectExp* filter,
                                  const char* className, const CMPIObjectPath* path, const char* owner);
    /** CMPI_RC_OK when the broker must poll instances, because the provider does not notice changes itself. */
    CMPIStatus (*mustPoll)(CMPIIndicationMI* mi, const CMPIContext* context, const CMPISelectExp* filter,
                           const char* className, const CMPIObjectPath* path);
    /** Somebody subscribed with a filter; `first` says that it is the first for this class. */
    CMPIStatus (*activateFilter)(CMPIIndicationMI* mi, const CMPIContext* context, const CMPISelectExp* filter,
                                 const char* className, const CMPIObjectPath* path, CMPIBoolean first);
    /** A subscription ended; `last` says that it was the last for this class. */
    CMPIStatus (*deActivateFilter)(CMPIIndicationMI* mi, const CMPIContext* context, const CMPISelectExp* filter,
                                   const char* className, const CMPIObjectPath* path, CMPIBoolean last);
    /** From here on indications may be delivered. */
    CMPIStatus (*enableIndications)(CMPIIndicationMI* mi, const CMPIContext* context);
    /** No indication may be delivered until they are enabled again. */
    CMPIStatus (*disableIndications)(CMPIIndicationMI* mi, const CMPIContext* context);
};

#ifdef __cplusplus
}
#endif

#endif
