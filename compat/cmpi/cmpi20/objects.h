/*
 * Instances, object paths and their values. Included by cmpift.h, which documents the rules for all tables. Names of
 * properties, keys and arguments are case-insensitive.
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

    /** Returns the property with the name, or CMPI_RC_ERR_NO_SUCH_PROPERTY. */
    CMPIData (*getProperty)(const CMPIInstance* instance, const char* name, CMPIStatus* rc);
    /** Returns the property at an index; `name`, unless null, receives its name. */
    CMPIData (*getPropertyAt)(const CMPIInstance* instance, CMPICount index, CMPIString** name, CMPIStatus* rc);
    /** Returns the number of properties. */
    CMPICount (*getPropertyCount)(const CMPIInstance* instance, CMPIStatus* rc);
    /**
     * Sets a property. A null value sets the property to null and keeps the type. A property that the instance's
     * property filter excludes is ignored without an error.
     */
    CMPIStatus (*setProperty)(const CMPIInstance* instance, const char* name, const CMPIValue* value, CMPIType type);
    /** Returns the path of the instance. */
    CMPIObjectPath* (*getObjectPath)(const CMPIInstance* instance, CMPIStatus* rc);
    /** Restricts setProperty to a property list and the listed keys. */
    CMPIStatus (*setPropertyFilter)(CMPIInstance* instance, const char** properties, const char** keys);
    /** Replaces the path of the instance. The caller must keep the key properties consistent. */
    CMPIStatus (*setObjectPath)(CMPIInstance* instance, const CMPIObjectPath* path);
    /** Like setProperty, with the class that declares the property. A null origin means unknown. */
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
     * A part that was never set is null or a string without characters.
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

    /** Adds a key, or replaces the value of an existing key. */
    CMPIStatus (*addKey)(CMPIObjectPath* path, const char* name, const CMPIValue* value, const CMPIType type);
    /** Returns the key with the name, or CMPI_RC_ERR_NOT_FOUND. */
    CMPIData (*getKey)(const CMPIObjectPath* path, const char* name, CMPIStatus* rc);
    /** Returns the key at an index; `name`, unless null, receives its name. */
    CMPIData (*getKeyAt)(const CMPIObjectPath* path, CMPICount index, CMPIString** name, CMPIStatus* rc);
    /** Returns the number of keys. */
    CMPICount (*getKeyCount)(const CMPIObjectPath* path, CMPIStatus* rc);
    ///@}

    /** Copies the namespace of another path. */
    CMPIStatus (*setNameSpaceFromObjectPath)(CMPIObjectPath* path, const CMPIObjectPath* source);
    /** Copies host and namespace of another path. */
    CMPIStatus (*setHostAndNameSpaceFromObjectPath)(CMPIObjectPath* path, const CMPIObjectPath* source);

    /** @name Qualifiers of the path's class
     * Qualifiers of the class, a property, a method or a method's parameter. Many brokers do not support them.
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

    /** Returns the path as a string in a format of the broker. Do not compare paths by this string. */
    CMPIString* (*toString)(const CMPIObjectPath* path, CMPIStatus* rc);
};

/** The named input or output arguments of a method. */
struct _CMPIArgs {
    void* hdl;
    CMPIArgsFT* ft;
};

struct _CMPIArgsFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIArgs* args);
    CMPIArgs* (*clone)(const CMPIArgs* args, CMPIStatus* rc);

    /** Adds an argument, or replaces the value of an existing one. */
    CMPIStatus (*addArg)(const CMPIArgs* args, const char* name, const CMPIValue* value, const CMPIType type);
    /** Returns the argument with the name. */
    CMPIData (*getArg)(const CMPIArgs* args, const char* name, CMPIStatus* rc);
    /** Returns the argument at an index; `name`, unless null, receives its name. */
    CMPIData (*getArgAt)(const CMPIArgs* args, CMPICount index, CMPIString** name, CMPIStatus* rc);
    /** Returns the number of arguments. */
    CMPICount (*getArgCount)(const CMPIArgs* args, CMPIStatus* rc);
};

/** A string in UTF-8. */
struct _CMPIString {
    void* hdl;
    CMPIStringFT* ft;
};

struct _CMPIStringFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIString* string);
    CMPIString* (*clone)(const CMPIString* string, CMPIStatus* rc);

    /** Returns the null-terminated characters, which are valid as long as the string; may be null. */
    const char* (*getCharPtr)(const CMPIString* string, CMPIStatus* rc);
};

/** An array of fixed size whose elements have the same type. */
struct _CMPIArray {
    void* hdl;
    CMPIArrayFT* ft;
};

struct _CMPIArrayFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIArray* array);
    CMPIArray* (*clone)(const CMPIArray* array, CMPIStatus* rc);

    /** Returns the number of elements. */
    CMPICount (*getSize)(const CMPIArray* array, CMPIStatus* rc);
    /** Returns the type of an element. */
    CMPIType (*getSimpleType)(const CMPIArray* array, CMPIStatus* rc);
    /** Returns the element at an index. */
    CMPIData (*getElementAt)(const CMPIArray* array, CMPICount index, CMPIStatus* rc);
    /** Sets the element at an index; a null value sets it to null. The type must be the array's. */
    CMPIStatus (*setElementAt)(CMPIArray* array, CMPICount index, const CMPIValue* value, CMPIType type);
};

/** The result of an up-call: elements that are read once, in order. */
struct _CMPIEnumeration {
    void* hdl;
    CMPIEnumerationFT* ft;
};

struct _CMPIEnumerationFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIEnumeration* enumeration);
    CMPIEnumeration* (*clone)(const CMPIEnumeration* enumeration, CMPIStatus* rc);

    /** Returns the next element, or an error at the end. */
    CMPIData (*getNext)(const CMPIEnumeration* enumeration, CMPIStatus* rc);
    /** Returns whether there is a next element. */
    CMPIBoolean (*hasNext)(const CMPIEnumeration* enumeration, CMPIStatus* rc);
    /** Returns all elements as an array. */
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

    /** Returns microseconds: since 1970-01-01 UTC, or of the interval. */
    CMPIUint64 (*getBinaryFormat)(const CMPIDateTime* dateTime, CMPIStatus* rc);
    /** Returns the 25-character CIM string. */
    CMPIString* (*getStringFormat)(const CMPIDateTime* dateTime, CMPIStatus* rc);
    /** Returns whether it is an interval. */
    CMPIBoolean (*isInterval)(const CMPIDateTime* dateTime, CMPIStatus* rc);
};

#ifdef __cplusplus
}
#endif

#endif
