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

Request requestFor(Operation operation, ObjectPath path, PropertyList properties = {}) {
    Request request;
    request.operation = operation;
    request.path = std::move(path);
    request.properties = std::move(properties);
    return request;
}

Request withInstance(Request request, Instance instance) {
    request.instance = std::move(instance);
    return request;
}

Request filtered(Request request, AssociationFilter filter) {
    request.filter = std::move(filter);
    return request;
}

Request forMember(Request request, std::string member) {
    request.member = std::move(member);
    return request;
}

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
    return requestFor(Operation::enumerateInstances, std::move(path), std::move(properties));
}

Request Request::enumerateInstanceNames(ObjectPath path) {
    return requestFor(Operation::enumerateInstanceNames, std::move(path));
}

Request Request::getInstance(ObjectPath path, PropertyList properties) {
    return requestFor(Operation::getInstance, std::move(path), std::move(properties));
}

Request Request::createInstance(ObjectPath path, Instance instance) {
    return withInstance(requestFor(Operation::createInstance, std::move(path)), std::move(instance));
}

Request Request::modifyInstance(ObjectPath path, Instance instance, PropertyList properties) {
    return withInstance(requestFor(Operation::modifyInstance, std::move(path), std::move(properties)),
                        std::move(instance));
}

Request Request::deleteInstance(ObjectPath path) {
    return requestFor(Operation::deleteInstance, std::move(path));
}

Request Request::execQuery(ObjectPath path, std::string language, std::string query) {
    Request request = requestFor(Operation::execQuery, std::move(path));
    request.language = std::move(language);
    request.query = std::move(query);
    return request;
}

Request Request::associators(ObjectPath path, AssociationFilter filter, PropertyList properties) {
    return filtered(requestFor(Operation::associators, std::move(path), std::move(properties)), std::move(filter));
}

Request Request::associatorNames(ObjectPath path, AssociationFilter filter) {
    return filtered(requestFor(Operation::associatorNames, std::move(path)), std::move(filter));
}

Request Request::references(ObjectPath path, AssociationFilter filter, PropertyList properties) {
    return filtered(requestFor(Operation::references, std::move(path), std::move(properties)), std::move(filter));
}

Request Request::referenceNames(ObjectPath path, AssociationFilter filter) {
    return filtered(requestFor(Operation::referenceNames, std::move(path)), std::move(filter));
}

Request Request::invokeMethod(ObjectPath path, std::string method, std::vector<NamedValue> input) {
    Request request = forMember(requestFor(Operation::invokeMethod, std::move(path)), std::move(method));
    request.input = std::move(input);
    return request;
}

Request Request::setProperty(ObjectPath path, std::string property, Value value) {
    Request request = forMember(requestFor(Operation::setProperty, std::move(path)), std::move(property));
    request.value = std::move(value);
    return request;
}

Request Request::getProperty(ObjectPath path, std::string property) {
    return forMember(requestFor(Operation::getProperty, std::move(path)), std::move(property));
}

Request Request::with(ContextEntries entries) const {
    Request request = *this;
    request.context = std::move(entries);
    return request;
}

}  // namespace cimhost
