#pragma once

#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "model/Value.h"

namespace cimhost {

/** The CIM operations. Those after referenceNames occur only in up-calls: this host does not send them to providers. */
enum class Operation {
    enumerateInstances,
    enumerateInstanceNames,
    getInstance,
    createInstance,
    modifyInstance,
    deleteInstance,
    execQuery,
    associators,
    associatorNames,
    references,
    referenceNames,
    invokeMethod,
    setProperty,
    getProperty
};

/** The name of the operation in the standard, such as "EnumerateInstances". */
const char* nameOf(Operation operation);

/** Whether an operation is associators, references, or one that returns their names. */
bool isAssociationOperation(Operation operation);

/** Whether an operation is references or referenceNames. */
bool isReferenceOperation(Operation operation);

/** Whether the results of an operation are object paths, not instances. */
bool returnsPaths(Operation operation);

/** Names of requested properties; std::nullopt requests all properties, an empty list none. */
using PropertyList = std::optional<std::vector<std::string>>;

/** The entries of a request's context, such as CMPIInvocationFlags and CMPIPrincipal. */
using ContextEntries = std::vector<NamedValue>;

/** Names that restrict the results of an association operation. A name without a value does not restrict them. */
struct AssociationFilter {
    std::optional<std::string> associationClass{};  ///< not for references: their result class is the association
    std::optional<std::string> resultClass{};
    std::optional<std::string> role{};
    std::optional<std::string> resultRole{};  ///< not for references
};

/** One CIM operation with its arguments. Members that the operation does not use keep their defaults. */
struct Request {
    Operation operation = Operation::enumerateInstances;
    ObjectPath path{};
    PropertyList properties{};
    Instance instance{};         ///< of createInstance and modifyInstance
    AssociationFilter filter{};  ///< of the association operations
    ContextEntries context{};
    std::string language{};           ///< of execQuery
    std::string query{};              ///< of execQuery
    std::string member{};             ///< the method of invokeMethod; the property of setProperty and getProperty
    Value value{};                    ///< of setProperty
    std::vector<NamedValue> input{};  ///< parameters of invokeMethod

    /** @name One function per operation */
    ///@{
    static Request enumerateInstances(ObjectPath path, PropertyList properties = {}) {
        return {Operation::enumerateInstances, std::move(path), std::move(properties)};
    }
    static Request enumerateInstanceNames(ObjectPath path) {
        return {Operation::enumerateInstanceNames, std::move(path)};
    }
    static Request getInstance(ObjectPath path, PropertyList properties = {}) {
        return {Operation::getInstance, std::move(path), std::move(properties)};
    }
    static Request createInstance(ObjectPath path, Instance instance) {
        return {Operation::createInstance, std::move(path), {}, std::move(instance)};
    }
    static Request modifyInstance(ObjectPath path, Instance instance, PropertyList properties = {}) {
        return {Operation::modifyInstance, std::move(path), std::move(properties), std::move(instance)};
    }
    static Request deleteInstance(ObjectPath path) { return {Operation::deleteInstance, std::move(path)}; }
    static Request execQuery(ObjectPath path, std::string language, std::string query) {
        Request request{Operation::execQuery, std::move(path)};
        request.language = std::move(language);
        request.query = std::move(query);
        return request;
    }
    static Request associators(ObjectPath path, AssociationFilter filter, PropertyList properties = {}) {
        return {Operation::associators, std::move(path), std::move(properties), {}, std::move(filter)};
    }
    static Request associatorNames(ObjectPath path, AssociationFilter filter) {
        return {Operation::associatorNames, std::move(path), {}, {}, std::move(filter)};
    }
    static Request references(ObjectPath path, AssociationFilter filter, PropertyList properties = {}) {
        return {Operation::references, std::move(path), std::move(properties), {}, std::move(filter)};
    }
    static Request referenceNames(ObjectPath path, AssociationFilter filter) {
        return {Operation::referenceNames, std::move(path), {}, {}, std::move(filter)};
    }
    static Request invokeMethod(ObjectPath path, std::string method, std::vector<NamedValue> input) {
        Request request{Operation::invokeMethod, std::move(path)};
        request.member = std::move(method);
        request.input = std::move(input);
        return request;
    }
    static Request setProperty(ObjectPath path, std::string property, Value value) {
        Request request{Operation::setProperty, std::move(path)};
        request.member = std::move(property);
        request.value = std::move(value);
        return request;
    }
    static Request getProperty(ObjectPath path, std::string property) {
        Request request{Operation::getProperty, std::move(path)};
        request.member = std::move(property);
        return request;
    }
    ///@}

    /** Returns a copy of the request with this context. */
    Request with(ContextEntries entries) const;
};

}  // namespace cimhost
