#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "model/Request.h"
#include "model/Value.h"
#include "schema/Schema.h"

namespace cimhost::cimxml {

/** The form of an instance or a path in a response. */
enum class ObjectForm {
    instance,          ///< INSTANCE
    namedInstance,     ///< VALUE.NAMEDINSTANCE
    instanceWithPath,  ///< VALUE.INSTANCEWITHPATH
    objectWithPath,    ///< VALUE.OBJECTWITHPATH
    instanceName,      ///< INSTANCENAME
    instancePath,      ///< INSTANCEPATH
    objectPath         ///< OBJECTPATH
};

/** The parts of an instance to write. */
struct InstanceParts {
    PropertyList properties{};        ///< only these; nullopt: all
    const Class* onlyOf = nullptr;    ///< only properties that this class has; null: all
    const Schema* origins = nullptr;  ///< source of the class origins of properties; null: write none

    bool haveAllProperties() const { return !properties && onlyOf == nullptr; }
};

/** Appends CIM objects as CIM-XML elements to a string. */
class ObjectWriter {
public:
    /**
     * @param itsHost      host of paths that have none
     * @param itsNameSpace namespace of paths that have none
     */
    ObjectWriter(std::string itsHost, std::string itsNameSpace)
        : host(std::move(itsHost)), nameSpace(std::move(itsNameSpace)) {}

    void append(std::string& xml, const Instance& instance, ObjectForm form, const InstanceParts& parts = {}) const;
    void append(std::string& xml, const ObjectPath& path, ObjectForm form) const;

    void appendInstance(std::string& xml, const Instance& instance, const InstanceParts& parts = {}) const;
    void appendInstanceName(std::string& xml, const ObjectPath& path) const;
    void appendInstancePath(std::string& xml, const ObjectPath& path) const;

    /** Appends CLASSPATH with the default namespace. */
    void appendClassPath(std::string& xml, const std::string& className) const;

    /** Appends VALUE, VALUE.ARRAY, VALUE.REFERENCE or VALUE.REFARRAY. Appends nothing for null. */
    void appendValue(std::string& xml, const Value& value) const;

private:
    /**
     * The tags around the content of a property or a key. The objects that a thread writes usually have the same
     * properties and keys in the same order, so each thread caches the tags by position.
     */
    struct Tags;

    void appendNameSpacePath(std::string& xml, const ObjectPath& path) const;
    void appendLocalNameSpacePath(std::string& xml, const std::string& itsNameSpace) const;
    void appendProperty(std::string& xml, const NamedValue& property, std::string_view origin, Tags& tags) const;
    void appendKey(std::string& xml, const NamedValue& key, Tags& tags) const;
    void appendReference(std::string& xml, const ObjectPath& path) const;
    void appendContent(std::string& xml, const Value& value) const;
    void appendScalar(std::string& xml, const Scalar& scalar) const;

    std::string host;
    std::string nameSpace;
};

/**
 * Checks that XML can represent all strings of a path, or of an instance with the wanted parts.
 * @throws CimError that names the class and the property
 */
void requireRepresentable(const Instance& instance, const InstanceParts& parts = {});
void requireRepresentable(const ObjectPath& path);

}  // namespace cimhost::cimxml
