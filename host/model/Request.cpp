#include "model/Request.h"

namespace cimhost {
namespace {

constexpr const char* names[] = {"EnumerateInstances", "EnumerateInstanceNames",
                                 "GetInstance",        "CreateInstance",
                                 "ModifyInstance",     "DeleteInstance",
                                 "ExecQuery",          "Associators",
                                 "AssociatorNames",    "References",
                                 "ReferenceNames",     "InvokeMethod",
                                 "SetProperty",        "GetProperty"};

}  // namespace

const char* nameOf(Operation operation) {
    return names[static_cast<std::size_t>(operation)];
}

bool isAssociationOperation(Operation operation) {
    return operation >= Operation::associators && operation <= Operation::referenceNames;
}

bool isReferenceOperation(Operation operation) {
    return operation == Operation::references || operation == Operation::referenceNames;
}

bool returnsPaths(Operation operation) {
    return operation == Operation::enumerateInstanceNames || operation == Operation::createInstance ||
           operation == Operation::associatorNames || operation == Operation::referenceNames;
}

Request Request::enumerateInstances(ObjectPath path, PropertyList properties) {
    return {Operation::enumerateInstances, std::move(path), std::move(properties)};
}

Request Request::enumerateInstanceNames(ObjectPath path) {
    return {Operation::enumerateInstanceNames, std::move(path)};
}

Request Request::getInstance(ObjectPath path, PropertyList properties) {
    return {Operation::getInstance, std::move(path), std::move(properties)};
}

Request Request::createInstance(ObjectPath path, Instance instance) {
    return {Operation::createInstance, std::move(path), {}, std::move(instance)};
}

Request Request::modifyInstance(ObjectPath path, Instance instance, PropertyList properties) {
    return {Operation::modifyInstance, std::move(path), std::move(properties), std::move(instance)};
}

Request Request::deleteInstance(ObjectPath path) {
    return {Operation::deleteInstance, std::move(path)};
}

Request Request::execQuery(ObjectPath path, std::string language, std::string query) {
    Request request{Operation::execQuery, std::move(path)};
    request.language = std::move(language);
    request.query = std::move(query);
    return request;
}

Request Request::associators(ObjectPath path, AssociationFilter filter, PropertyList properties) {
    return {Operation::associators, std::move(path), std::move(properties), {}, std::move(filter)};
}

Request Request::associatorNames(ObjectPath path, AssociationFilter filter) {
    return {Operation::associatorNames, std::move(path), {}, {}, std::move(filter)};
}

Request Request::references(ObjectPath path, AssociationFilter filter, PropertyList properties) {
    return {Operation::references, std::move(path), std::move(properties), {}, std::move(filter)};
}

Request Request::referenceNames(ObjectPath path, AssociationFilter filter) {
    return {Operation::referenceNames, std::move(path), {}, {}, std::move(filter)};
}

Request Request::invokeMethod(ObjectPath path, std::string method, std::vector<NamedValue> input) {
    Request request{Operation::invokeMethod, std::move(path)};
    request.member = std::move(method);
    request.input = std::move(input);
    return request;
}

Request Request::setProperty(ObjectPath path, std::string property, Value value) {
    Request request{Operation::setProperty, std::move(path)};
    request.member = std::move(property);
    request.value = std::move(value);
    return request;
}

Request Request::getProperty(ObjectPath path, std::string property) {
    Request request{Operation::getProperty, std::move(path)};
    request.member = std::move(property);
    return request;
}

Request Request::with(ContextEntries entries) const {
    Request request = *this;
    request.context = std::move(entries);
    return request;
}

}  // namespace cimhost
