#pragma once

#include <cmpidt.h>

#include <string>

#include "Export.h"

namespace KO {

class Moniker;

/**
 * Functions that the agent's CIM providers share: class ids, and typed access to CMPI object paths and instances
 * through their function tables.
 *
 * Arguments are borrowed. New object paths and instances are created through the broker, which owns them; the caller
 * must not release them. The functions never throw and never crash on a null pointer, a missing or failing broker
 * function or a value of an unexpected type: reading functions then report that there is no value, creating functions
 * return null, and writing functions do nothing.
 */
class KO_EXPORT ProviderUtilities {
public:
    /** @name Class ids
     * Returns the 16-bit number of a CIM class; 0 if the agent does not know the class, or if the path or name is null.
     * Class names are case-insensitive.
     */
    ///@{
    static unsigned short getClassId(const CMPIObjectPath* path);
    static unsigned short getClassId(const char* className);
    ///@}

    /** Returns the path's namespace; empty if it has none. */
    static std::string getNamespace(const CMPIObjectPath* path);

    /** Returns the number of the path's keys, at most 0xFFFF. */
    static unsigned short getKeyCount(const CMPIObjectPath* path);

    /**
     * Reads a string key.
     * @param value receives the value; unchanged if the result is false
     * @return false if the key is missing, null or not a string
     */
    static bool getKeyProperty(const CMPIObjectPath* path, const char* name, std::string& value);

    /** Reads a reference key. The returned path belongs to the broker. Otherwise like the string overload. */
    static bool getKeyProperty(const CMPIObjectPath* path, const char* name, CMPIObjectPath** value);

    /** Creates a path of a class in a namespace, without keys. Returns null if the broker cannot create it. */
    static CMPIObjectPath* createObjectPath(const CMPIBroker* broker, const char* className, std::string nameSpace);

    /** Adds a string key, or replaces the value of an existing key. */
    static void setKeyProperty(CMPIObjectPath* path, const char* name, const std::string& value);

    /** Adds a reference key, or replaces the value of an existing key. */
    static void setKeyProperty(CMPIObjectPath* path, const char* name, CMPIObjectPath* value);

    /** Creates an instance of the path's class. Returns null if the broker cannot create it or the path is null. */
    static CMPIInstance* createInstance(const CMPIBroker* broker, CMPIObjectPath* path);

    /** @name Setting properties of an instance
     * One overload per CIM type: string, uint16, uint32, boolean, reference.
     */
    ///@{
    static void setProperty(CMPIInstance* instance, const char* name, std::string& value);
    static void setProperty(CMPIInstance* instance, const char* name, unsigned short value);
    static void setProperty(CMPIInstance* instance, const char* name, unsigned int value);
    static void setProperty(CMPIInstance* instance, const char* name, bool value);
    static void setProperty(CMPIInstance* instance, const char* name, CMPIObjectPath* value);
    ///@}

    /**
     * Sets a property from a string.
     * @param isDateTime true sets a property of type datetime from a CIM datetime string. If the string is empty, all
     *         zeros ("00000000000000.000000-000") or not a valid CIM datetime, the property becomes null. false sets a
     *         property of type string.
     */
    static void setProperty(const CMPIBroker* broker, CMPIInstance* instance, const char* name, std::string& text,
                            bool isDateTime);

    /** @name Reading properties of an instance
     * Each returns false and leaves value unchanged if the instance has no such property, or if its value is null or
     * has another type.
     */
    ///@{

    /** Reads a string, or a datetime as its 25-character string. The last argument has no effect on the result. */
    static bool getProperty(const CMPIInstance* instance, const char* name, std::string& value, bool isDateTime);

    /** Reads any CIM integer that fits. */
    static bool getProperty(const CMPIInstance* instance, const char* name, unsigned int& value);

    /** Reads a boolean. */
    static bool getProperty(const CMPIInstance* instance, const char* name, bool& value);
    ///@}

    /**
     * Appends the path's keys to a moniker, in the path's order. Converts integer and boolean keys to strings. Omits
     * keys that are neither strings nor integers nor booleans.
     */
    static void transformObjectPathToMoniker(const CMPIObjectPath* path, Moniker& moniker);

    /** Adds the moniker's keys to *path as string keys. Keeps the path's other keys. */
    static void transformMonikerToObjectPath(Moniker& moniker, CMPIObjectPath** path);
};

}  // namespace KO
