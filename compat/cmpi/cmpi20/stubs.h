/*
 * Stubs: macros for a provider's source file. Each defines a function table, an interface with this table, and the
 * factory that the broker looks up. Included by cmpimacs.h.
 *
 * Parameters:
 *   prefix   prefix of the provider's functions, which each macro lists and which must be declared before it
 *   miname   the provider's name in its registration, without quotes; the prefix of the factory's name and
 *            the suffix of the interface's name
 *   broker   a variable of type const CMPIBroker*, which receives the broker
 *   hook     a statement at the end of the factory, for example a call that initializes the provider; CMNoHook
 *            for none. It can use the factory's arguments brkr, ctx and rc; rc may be null.
 *
 * The tables are valid as long as the library is loaded, and every call of a factory returns the same interface.
 */
#ifndef CMPI20_STUBS_H
#define CMPI20_STUBS_H

#include "../cmpift.h"

#ifdef __cplusplus
#define CMPI_EXTERN_C extern "C"
#else
#define CMPI_EXTERN_C extern
#endif

/** Exports a factory from a library with hidden visibility. */
#define CMPI_FACTORY CMPI_EXTERN_C __attribute__((visibility("default")))

/** Hook of a provider without initialization. */
#define CMNoHook ((void)0)

/** Defines the factory of an interface. The interface's table must be defined first. */
#define CMPI_DEFINE_FACTORY(kind, miname, broker, hook)                                                          \
    CMPI_FACTORY CMPI##kind##MI* miname##_Create_##kind##MI(const CMPIBroker* brkr, const CMPIContext* ctx,      \
                                                            CMPIStatus* rc);                                     \
    CMPI##kind##MI* miname##_Create_##kind##MI(const CMPIBroker* brkr, const CMPIContext* ctx, CMPIStatus* rc) { \
        static CMPI##kind##MI mi = {NULL, &miname##kind##MIFT_};                                                 \
        (void)ctx;                                                                                               \
        (void)rc;                                                                                                \
        broker = brkr;                                                                                           \
        hook;                                                                                                    \
        return &mi;                                                                                              \
    }

/**
 * An instance provider with prefixCleanup, prefixEnumInstanceNames, prefixEnumInstances, prefixGetInstance,
 * prefixCreateInstance, prefixModifyInstance, prefixDeleteInstance and prefixExecQuery.
 */
#define CMInstanceMIStub(prefix, miname, broker, hook)                                                  \
    static CMPIInstanceMIFT miname##InstanceMIFT_ = {                                                   \
        CMPICurrentVersion,        CMPICurrentVersion,     "instance" #miname,  prefix##Cleanup,        \
        prefix##EnumInstanceNames, prefix##EnumInstances,  prefix##GetInstance, prefix##CreateInstance, \
        prefix##ModifyInstance,    prefix##DeleteInstance, prefix##ExecQuery};                          \
    CMPI_DEFINE_FACTORY(Instance, miname, broker, hook)

/**
 * An association provider with prefixAssociationCleanup, prefixAssociators, prefixAssociatorNames, prefixReferences and
 * prefixReferenceNames.
 */
#define CMAssociationMIStub(prefix, miname, broker, hook)                                                \
    static CMPIAssociationMIFT miname##AssociationMIFT_ = {                                              \
        CMPICurrentVersion,  CMPICurrentVersion,      "association" #miname, prefix##AssociationCleanup, \
        prefix##Associators, prefix##AssociatorNames, prefix##References,    prefix##ReferenceNames};    \
    CMPI_DEFINE_FACTORY(Association, miname, broker, hook)

/** A method provider with prefixMethodCleanup and prefixInvokeMethod. */
#define CMMethodMIStub(prefix, miname, broker, hook)                                                       \
    static CMPIMethodMIFT miname##MethodMIFT_ = {CMPICurrentVersion, CMPICurrentVersion, "method" #miname, \
                                                 prefix##MethodCleanup, prefix##InvokeMethod};             \
    CMPI_DEFINE_FACTORY(Method, miname, broker, hook)

/**
 * A property provider with prefixPropertyCleanup, prefixSetProperty and prefixGetProperty. The slot of
 * setPropertyWithOrigin, which was added in CMPI 2.0, is null.
 */
#define CMPropertyMIStub(prefix, miname, broker, hook)                        \
    static CMPIPropertyMIFT miname##PropertyMIFT_ = {CMPICurrentVersion,      \
                                                     CMPICurrentVersion,      \
                                                     "property" #miname,      \
                                                     prefix##PropertyCleanup, \
                                                     prefix##SetProperty,     \
                                                     prefix##GetProperty,     \
                                                     NULL};                   \
    CMPI_DEFINE_FACTORY(Property, miname, broker, hook)

/**
 * An indication provider with prefixIndicationCleanup, prefixAuthorizeFilter, prefixMustPoll, prefixActivateFilter,
 * prefixDeActivateFilter, prefixEnableIndications and prefixDisableIndications.
 */
#define CMIndicationMIStub(prefix, miname, broker, hook)                                                         \
    static CMPIIndicationMIFT miname##IndicationMIFT_ = {                                                        \
        CMPICurrentVersion,        CMPICurrentVersion,        "indication" #miname,   prefix##IndicationCleanup, \
        prefix##AuthorizeFilter,   prefix##MustPoll,          prefix##ActivateFilter, prefix##DeActivateFilter,  \
        prefix##EnableIndications, prefix##DisableIndications};                                                  \
    CMPI_DEFINE_FACTORY(Indication, miname, broker, hook)

#endif
