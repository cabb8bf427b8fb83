/*
 * Instances, object paths and the values in them. Included by cmpift.h, which states what holds for
 * all tables. Names of properties, keys and arguments are compared without regard to letter case.
 */
#ifndef CMPI20_OBJECTS_H
#define CMPI20_OBJECTS_H

#include "../cmpidt.h"

#ifdef __cplusplus
extern "C" {
#endif

/** An instance: an object path and properties. */
struct _CMPIInstance {
    void* hdl;
    CMPIInstanceFT* ft;
};

struct _CMPIInstanceFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIInstance* instance);
    CMPIInstance* (*clone)(const CMPIInstance* instance, CMPIStatus* rc);

    /** The property of a name; CMPI_RC_ERR_NO_SUCH_PROPERTY when there is none. */
    CMPIData (*getProperty)(const CMPIInstance* instance, const char* name, CMPIStatus* rc);
    /** The property at a position; `name`, unless null, receives its name. */
    CMPIData (*getPropertyAt)(const CMPIInstance* instance, CMPICount index, CMPIString** name, CMPIStatus* rc);
    /** How many properties there are. */
    CMPICount (*getPropertyCount)(const CMPIInstance* instance, CMPIStatus* rc);
    /**
     * Sets a property; a null value makes it null, still of that type. A property outside of the
     * instance's property filter is left out without an error.
     */
    CMPIStatus (*setProperty)(const CMPIInstance* instance, const char* name, const CMPIValue* value, CMPIType type);
    /** The path of the instance. */
    CMPIObjectPath* (*getObjectPath)(const CMPIInstance* instance, CMPIStatus* rc);
    /** Restricts what setProperty takes to a property list and, in any case, the listed keys. */
    CMPIStatus (*setPropertyFilter)(CMPIInstance* instance, const char** properties, const char** keys);
    /** Gives the instance another path; the keys' properties are the caller's to keep equal. */
    CMPIStatus (*setObjectPath)(CMPIInstance* instance, const CMPIObjectPath* path);
    /** As setProperty, with the class that declares the property; a null origin is unknown. */
    CMPIStatus (*setPropertyWithOrigin)(const CMPIInstance* instance, const char* name, const CMPIValue* value,
                                        const CMPIType type, const char* origin);
};

/** The name of an instance: host, namespace, class and keys; without keys, the name of a class. */
struct _CMPIObjectPath {
    void* hdl;
    CMPIObjectPathFT* ft;
};

struct _CMPIObjectPathFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIObjectPath* path);
    CMPIObjectPath* (*clone)(const CMPIObjectPath* path, CMPIStatus* rc);

    /** @name Namespace, host and class
     * A part that was never set is answered as null or as a string without characters.
     */
    ///@{
    CMPIStatus (*setNameSpace)(CMPIObjectPath* path, const char* nameSpace);
    CMPIString* (*getNameSpace)(const CMPIObjectPath* path, CMPIStatus* rc);
    CMPIStatus (*setHostname)(CMPIObjectPath* path, const char* host);
    CMPIString* (*getHostname)(const CMPIObjectPath* path, CMPIStatus* rc);
    CMPIStatus (*setClassName)(CMPIObjectPath* path, const char* className);
    CMPIString* (*getClassName)(const CMPIObjectPath* path, CMPIStatus* rc);
    ///@}

    /** @name Keys */
    ///@{

    /** Adds a key, or replaces the value of the one of that name. */
    CMPIStatus (*addKey)(CMPIObjectPath* path, const char* name, const CMPIValue* value, const CMPIType type);
    /** The key of a name; CMPI_RC_ERR_NOT_FOUND when there is none. */
    CMPIData (*getKey)(const CMPIObjectPath* path, const char* name, CMPIStatus* rc);
    /** The key at a position; `name`, unless null, receives its name. */
    CMPIData (*getKeyAt)(const CMPIObjectPath* path, CMPICount index, CMPIString** name, CMPIStatus* rc);
    /** How many keys there are. */
    CMPICount (*getKeyCount)(const CMPIObjectPath* path, CMPIStatus* rc);
    ///@}

    /** Takes the namespace of another path. */
    CMPIStatus (*setNameSpaceFromObjectPath)(CMPIObjectPath* path, const CMPIObjectPath* source);
    /** Takes host and namespace of another path. */
    CMPIStatus (*setHostAndNameSpaceFromObjectPath)(CMPIObjectPath* path, const CMPIObjectPath* source);

    /** @name Qualifiers of the path's class
     * Of the class itself, or of a property, a method or a method's parameter. Many brokers do not
     * support these.
     */
    ///@{
    CMPIData (*getClassQualifier)(const CMPIObjectPath* path, const char* qualifier, CMPIStatus* rc);
    CMPIData (*getPropertyQualifier)(const CMPIObjectPath* path, const char* property, const char* qualifier,
                                     CMPIStatus* rc);
    CMPIData (*getMethodQualifier)(const CMPIObjectPath* path, const char* method, const char* qualifier,
                                   CMPIStatus* rc);
    CMPIData (*getParameterQualifier)(const CMPIObjectPath* path, const char* method, const char* parameter,
                                      const char* qualifier, CMPIStatus* rc);
    ///@}

    /** The path as text; its form is the broker's. Paths are not compared by it. */
    CMPIString* (*toString)(const CMPIObjectPath* path, CMPIStatus* rc);
};

/** The named arguments of a method, those that go in or those that come out. */
struct _CMPIArgs {
    void* hdl;
    CMPIArgsFT* ft;
};

struct _CMPIArgsFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIArgs* args);
    CMPIArgs* (*clone)(const CMPIArgs* args, CMPIStatus* rc);

    /** Adds an argument, or replaces the one of that name. */
    CMPIStatus (*addArg)(const CMPIArgs* args, const char* name, const CMPIValue* value, const CMPIType type);
    /** The argument of a name. */
    CMPIData (*getArg)(const CMPIArgs* args, const char* name, CMPIStatus* rc);
    /** The argument at a position; `name`, unless null, receives its name. */
    CMPIData (*getArgAt)(const CMPIArgs* args, CMPICount index, CMPIString** name, CMPIStatus* rc);
    /** How many arguments there are. */
    CMPICount (*getArgCount)(const CMPIArgs* args, CMPIStatus* rc);
};

/** Text, in UTF-8. */
struct _CMPIString {
    void* hdl;
    CMPIStringFT* ft;
};

struct _CMPIStringFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIString* string);
    CMPIString* (*clone)(const CMPIString* string, CMPIStatus* rc);

    /** The characters, ended by a zero. They live as long as the string does, and may be null. */
    const char* (*getCharPtr)(const CMPIString* string, CMPIStatus* rc);
};

/** An array of fixed size, all of whose elements are of one type. */
struct _CMPIArray {
    void* hdl;
    CMPIArrayFT* ft;
};

struct _CMPIArrayFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIArray* array);
    CMPIArray* (*clone)(const CMPIArray* array, CMPIStatus* rc);

    /** How many elements there are. */
    CMPICount (*getSize)(const CMPIArray* array, CMPIStatus* rc);
    /** The type of an element. */
    CMPIType (*getSimpleType)(const CMPIArray* array, CMPIStatus* rc);
    /** The element at a position. */
    CMPIData (*getElementAt)(const CMPIArray* array, CMPICount index, CMPIStatus* rc);
    /** Sets the element at a position; a null value makes it null. The type must be the array's. */
    CMPIStatus (*setElementAt)(CMPIArray* array, CMPICount index, const CMPIValue* value, CMPIType type);
};

/** What an up-call answers: elements that are read once, in order. */
struct _CMPIEnumeration {
    void* hdl;
    CMPIEnumerationFT* ft;
};

struct _CMPIEnumerationFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIEnumeration* enumeration);
    CMPIEnumeration* (*clone)(const CMPIEnumeration* enumeration, CMPIStatus* rc);

    /** The next element; an error at the end. */
    CMPIData (*getNext)(const CMPIEnumeration* enumeration, CMPIStatus* rc);
    /** Whether there is a next element. */
    CMPIBoolean (*hasNext)(const CMPIEnumeration* enumeration, CMPIStatus* rc);
    /** All elements as an array. */
    CMPIArray* (*toArray)(const CMPIEnumeration* enumeration, CMPIStatus* rc);
};

/** A point in time, with an offset from UTC, or an interval. */
struct _CMPIDateTime {
    void* hdl;
    CMPIDateTimeFT* ft;
};

struct _CMPIDateTimeFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIDateTime* dateTime);
    CMPIDateTime* (*clone)(const CMPIDateTime* dateTime, CMPIStatus* rc);

    /** Microseconds: since 1970-01-01 UTC, or of the interval. */
    CMPIUint64 (*getBinaryFormat)(const CMPIDateTime* dateTime, CMPIStatus* rc);
    /** The 25 characters of CIM's text form. */
    CMPIString* (*getStringFormat)(const CMPIDateTime* dateTime, CMPIStatus* rc);
    /** Whether it is an interval. */
    CMPIBoolean (*isInterval)(const CMPIDateTime* dateTime, CMPIStatus* rc);
};

#ifdef __cplusplus
}
#endif

#endif
