#pragma once

#include "Export.h"

#include <cmpidt.h>

#include <string>

namespace KO {

class Moniker;

/**
 * What CIM providers of the agent share: class ids, and typed access to CMPI object paths and
 * instances through their own function tables.
 *
 * Objects passed in are borrowed. Object paths and instances that are made here are made through
 * the broker and belong to it; nobody releases them. A null pointer, a failing or missing broker
 * function or a value of an unexpected type never crashes and never throws: reads answer that the
 * value is absent, makers answer null, writers do nothing.
 */
class KO_EXPORT ProviderUtilities {
public:
    /** @name Class ids
     * The 16-bit number of a CIM class, whose name is compared without regard to letter case.
     * 0 for a class unknown to the agent and for a null path or name.
     */
    ///@{
    static unsigned short getClassId(const CMPIObjectPath* path);
    static unsigned short getClassId(const char* className);
    ///@}

    /** The path's namespace; empty when it has none. */
    static std::string getNamespace(const CMPIObjectPath* path);

    /** How many keys the path has; 0xFFFF also stands for more than that. */
    static unsigned short getKeyCount(const CMPIObjectPath* path);

    /**
     * Reads a string key.
     * @param value receives the text; untouched when the answer is false
     * @return false when the key is missing, null or not text
     */
    static bool getKeyProperty(const CMPIObjectPath* path, const char* name, std::string& value);

    /** Reads a reference key; the path that is read belongs to the broker. Otherwise as above. */
    static bool getKeyProperty(const CMPIObjectPath* path, const char* name, CMPIObjectPath** value);

    /** A new path of a class in a namespace, without keys; null when the broker cannot make it. */
    static CMPIObjectPath* createObjectPath(const CMPIBroker* broker, const char* className, std::string nameSpace);

    /** Adds a string key, or replaces the value of a key of that name. */
    static void setKeyProperty(CMPIObjectPath* path, const char* name, const std::string& value);

    /** Adds a reference key, or replaces the value of a key of that name. */
    static void setKeyProperty(CMPIObjectPath* path, const char* name, CMPIObjectPath* value);

    /** A new instance of the path's class; null when the broker cannot make it or the path is null. */
    static CMPIInstance* createInstance(const CMPIBroker* broker, CMPIObjectPath* path);

    /** @name Setting properties of an instance
     * One overload a CIM type: string, uint16, uint32, boolean, reference.
     */
    ///@{
    static void setProperty(CMPIInstance* instance, const char* name, std::string& value);
    static void setProperty(CMPIInstance* instance, const char* name, unsigned short value);
    static void setProperty(CMPIInstance* instance, const char* name, unsigned int value);
    static void setProperty(CMPIInstance* instance, const char* name, bool value);
    static void setProperty(CMPIInstance* instance, const char* name, CMPIObjectPath* value);
    ///@}

    /**
     * Sets a property from text.
     * @param isDateTime true: the text is a CIM datetime and the property is of type datetime. A text
     *                   that is empty, all zeros ("00000000000000.000000-000") or no valid CIM
     *                   datetime sets the property to null, still of type datetime. False: the
     *                   property is a string.
     */
    static void setProperty(const CMPIBroker* broker, CMPIInstance* instance, const char* name, std::string& text,
                            bool isDateTime);

    /** @name Reading properties of an instance
     * Each answers false, and leaves value untouched, when the instance has no such property, when
     * it is null, or when its value is not of the asked kind.
     */
    ///@{

    /** Reads a string, or a datetime as its 25-character text whichever flag is passed. */
    static bool getProperty(const CMPIInstance* instance, const char* name, std::string& value, bool isDateTime);

    /** Reads any CIM integer whose value fits. */
    static bool getProperty(const CMPIInstance* instance, const char* name, unsigned int& value);

    /** Reads a boolean. */
    static bool getProperty(const CMPIInstance* instance, const char* name, bool& value);
    ///@}

    /**
     * Appends the path's keys, name and value, in the path's order, to a moniker. Integer and boolean
     * keys are carried as text; keys of other types are left out.
     */
    static void transformObjectPathToMoniker(const CMPIObjectPath* path, Moniker& moniker);

    /** Sets the moniker's keys as string keys of *path; keys that the path has already stay. */
    static void transformMonikerToObjectPath(Moniker& moniker, CMPIObjectPath** path);
};

}  // namespace KO
