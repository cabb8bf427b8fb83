/*
 * Stubs: macros that stand once in a provider's source file and define a function table, an
 * interface with it, and the factory that the broker looks for. Included by cmpimacs.h.
 *
 * Each takes
 *   prefix   what the names of the provider's functions begin with; they are listed at each macro and
 *            have to be declared before it
 *   miname   the provider's name in its registration, without quotes; the factory's name begins
 *            with it, and the interface's name ends with it
 *   broker   a variable of type const CMPIBroker*, which receives the broker
 *   hook     a statement that the factory executes last, such as a call that initialises the
 *            provider; CMNoHook for none. It sees the factory's arguments brkr, ctx and rc; rc may
 *            be null.
 *
 * The tables live as long as the library does, and every call of a factory answers the same interface.
 */
#ifndef CMPI20_STUBS_H
#define CMPI20_STUBS_H

#include "../cmpift.h"

#ifdef __cplusplus
#define CMPI_EXTERN_C extern "C"
#else
#define CMPI_EXTERN_C extern
#endif

/** What a factory needs, to be found in a library that hides its symbols otherwise. */
#define CMPI_FACTORY CMPI_EXTERN_C __attribute__((visibility("default")))

/** The hook of a provider that has nothing to do when its factory is called. */
#define CMNoHook ((void)0)

/** Defines the factory of an interface of a kind over the table that was defined before it. */
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
 * An instance provider, of prefixCleanup, prefixEnumInstanceNames, prefixEnumInstances,
 * prefixGetInstance, prefixCreateInstance, prefixModifyInstance, prefixDeleteInstance and
 * prefixExecQuery.
 */
#define CMInstanceMIStub(prefix, miname, broker, hook)                                                  \
    static CMPIInstanceMIFT miname##InstanceMIFT_ = {                                                   \
        CMPICurrentVersion,        CMPICurrentVersion,     "instance" #miname,  prefix##Cleanup,        \
        prefix##EnumInstanceNames, prefix##EnumInstances,  prefix##GetInstance, prefix##CreateInstance, \
        prefix##ModifyInstance,    prefix##DeleteInstance, prefix##ExecQuery};                          \
    CMPI_DEFINE_FACTORY(Instance, miname, broker, hook)

/**
 * An association provider, of prefixAssociationCleanup, prefixAssociators, prefixAssociatorNames,
 * prefixReferences and prefixReferenceNames.
 */
#define CMAssociationMIStub(prefix, miname, broker, hook)                                                \
    static CMPIAssociationMIFT miname##AssociationMIFT_ = {                                              \
        CMPICurrentVersion,  CMPICurrentVersion,      "association" #miname, prefix##AssociationCleanup, \
        prefix##Associators, prefix##AssociatorNames, prefix##References,    prefix##ReferenceNames};    \
    CMPI_DEFINE_FACTORY(Association, miname, broker, hook)

/** A method provider, of prefixMethodCleanup and prefixInvokeMethod. */
#define CMMethodMIStub(prefix, miname, broker, hook)                                                       \
    static CMPIMethodMIFT miname##MethodMIFT_ = {CMPICurrentVersion, CMPICurrentVersion, "method" #miname, \
                                                 prefix##MethodCleanup, prefix##InvokeMethod};             \
    CMPI_DEFINE_FACTORY(Method, miname, broker, hook)

/**
 * A property provider, of prefixPropertyCleanup, prefixSetProperty and prefixGetProperty. The slot
 * of setPropertyWithOrigin, which came with CMPI 2.0, stays null.
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
 * An indication provider, of prefixIndicationCleanup, prefixAuthorizeFilter, prefixMustPoll,
 * prefixActivateFilter, prefixDeActivateFilter, prefixEnableIndications and prefixDisableIndications.
 */
#define CMIndicationMIStub(prefix, miname, broker, hook)                                                         \
    static CMPIIndicationMIFT miname##IndicationMIFT_ = {                                                        \
        CMPICurrentVersion,        CMPICurrentVersion,        "indication" #miname,   prefix##IndicationCleanup, \
        prefix##AuthorizeFilter,   prefix##MustPoll,          prefix##ActivateFilter, prefix##DeActivateFilter,  \
        prefix##EnableIndications, prefix##DisableIndications};                                                  \
    CMPI_DEFINE_FACTORY(Indication, miname, broker, hook)

#endif
