#pragma once

#include <string>

#include "cimxml/XmlElement.h"
#include "model/Value.h"
#include "schema/Schema.h"

namespace cimhost::cimxml {

/**
 * Reads CIM objects from elements of a request. The schema determines the types of values and the letter case of names;
 * for classes and properties that it does not have, the element does.
 * All functions throw CimError with CMPI_RC_ERR_INVALID_PARAMETER for an element that is not of the expected kind, a
 * value that does not fit its type, and a key that the class does not have.
 */
class ElementReader {
public:
    /** @param itsNameSpace of paths that have none */
    ElementReader(const Schema& itsSchema, std::string itsNameSpace)
        : schema(itsSchema), nameSpace(std::move(itsNameSpace)) {}

    /** CLASSNAME, INSTANCENAME, or a path with one of them: a path has keys only if it is that of an instance. */
    ObjectPath path(const XmlElement& element) const;

    /** INSTANCE, with a path of those keys that are among its properties. */
    Instance instance(const XmlElement& element) const;

    /** VALUE.NAMEDINSTANCE */
    Instance namedInstance(const XmlElement& element) const;

    /** VALUE, VALUE.ARRAY, VALUE.REFERENCE or VALUE.REFARRAY as a value of a type. */
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

/** The characters of an element as one value of a simple type. @throws ValueError if they do not fit it */
Scalar scalarFrom(const std::string& characters, CMPIType type);

}  // namespace cimhost::cimxml
