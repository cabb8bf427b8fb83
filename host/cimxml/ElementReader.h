#pragma once

#include <string>

#include "cimxml/XmlElement.h"
#include "model/Value.h"
#include "schema/Schema.h"

namespace cimhost::cimxml {

/**
 * Reads CIM objects from elements of a request. The schema determines the types of values and the letter case of names;
 * for classes and properties that the schema does not have, the element does.
 * All functions throw CimError: with CMPI_RC_ERR_TYPE_MISMATCH for a property element that does not match the declared
 * property, and with CMPI_RC_ERR_INVALID_PARAMETER for other unexpected elements, a value that does not fit its type,
 * and a key that the class does not have.
 */
class ElementReader {
public:
    /** @param itsNameSpace namespace of paths that have none */
    ElementReader(const Schema& itsSchema, std::string itsNameSpace)
        : schema(itsSchema), nameSpace(std::move(itsNameSpace)) {}

    /** Reads CLASSNAME, INSTANCENAME, or a path with one of them. Only the path of an instance has keys. */
    ObjectPath path(const XmlElement& element) const;

    /** Reads INSTANCE. The path has the keys that are among the properties and not null. */
    Instance instance(const XmlElement& element) const;

    /** Reads VALUE.NAMEDINSTANCE. */
    Instance namedInstance(const XmlElement& element) const;

    /** Reads VALUE, VALUE.ARRAY, VALUE.REFERENCE or VALUE.REFARRAY as a value of a type. */
    Value value(const XmlElement& element, CMPIType type, bool isArray) const;

private:
    ObjectPath instanceName(const XmlElement& element, const std::string& itsNameSpace) const;
    void addKey(ObjectPath& path, const std::string& name, const XmlElement& element) const;
    NamedValue property(const XmlElement& element, const Class* known) const;
    Scalar scalar(const XmlElement& element, CMPIType type) const;

    const Schema& schema;
    std::string nameSpace;
};

/**
 * Limits the properties, keys or names in an element, since some work is quadratic in their number.
 * @throws CimError if there are more than 1,000
 */
void requireFew(const XmlElement& element);

/** Converts the characters of an element to a value of a simple type. @throws ValueError if they do not fit the type */
Scalar scalarFrom(const std::string& characters, CMPIType type);

}  // namespace cimhost::cimxml
