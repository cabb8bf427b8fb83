#include <algorithm>

#include "broker/NamedValues.h"
#include "cim/Names.h"
#include "cimxml/Errors.h"
#include "cimxml/Operations.h"
#include "schema/ObjectPathText.h"

namespace cimhost::cimxml {
namespace {

/** @throws CimError unless the path has a value for each key of its class */
void requireKeys(const ObjectPath& path, const Schema& schema) {
    const Class* known = schema.findClass(path.className);
    for (const Property* key : known != nullptr ? known->keys() : std::vector<const Property*>()) {
        if (findNamed(path.keys, key->name) == nullptr) {
            throw CimError(CMPI_RC_ERR_INVALID_PARAMETER, "Key " + key->name + " of the path is missing.");
        }
    }
}

/** @throws CimError if XML cannot represent a result */
ResultCursor cursorOf(Response results, ObjectForm form, InstanceParts parts = {}) {
    for (const Instance& each : results.instances) {
        requireRepresentable(each, parts);
    }
    for (const ObjectPath& each : results.paths) {
        requireRepresentable(each);
    }
    return {std::move(results), form, std::move(parts)};
}

template <class Result>
void moveAll(std::vector<Result>& source, std::vector<Result>& target) {
    if (target.empty()) {
        target.swap(source);
    } else {
        std::move(source.begin(), source.end(), std::back_inserter(target));
    }
}

/** Removes properties that are not in the list of properties to change. Keeps keys, which identify the instance. */
void removeUnlisted(Instance& modified, const PropertyList& list) {
    const auto isIgnored = [&](const NamedValue& each) {
        const auto isSame = [&](const std::string& name) { return cim::sameName(name, each.name); };
        return std::none_of(list->begin(), list->end(), isSame) && findNamed(modified.path.keys, each.name) == nullptr;
    };
    if (list) {
        auto& all = modified.properties;
        all.erase(std::remove_if(all.begin(), all.end(), isIgnored), all.end());
    }
}

}  // namespace

Response Operations::send(const Call& call, Request request) const {
    ContextEntries context;
    if (!call.caller.principal.empty()) {
        context.push_back({CMPIPrincipal, Value::of(call.caller.principal)});
    }
    Response response = call.target.perform(request.with(std::move(context)));
    if (!response.ok()) {
        throw CimError(response.status);
    }
    response.providers.clear();
    return response;
}

/** @throws CimError for a class of the schema without a provider, which has no instances */
void Operations::requireProvider(const Call& call, const ObjectPath& path, int code) const {
    const bool isServed =
        call.isInterop || registry.find(path.nameSpace, path.className, InterfaceKind::instance) != nullptr;
    if (!isServed && call.schema.findClass(path.className) != nullptr) {
        throw CimError(code, "No provider serves instances of class " + path.className + ".");
    }
}

Response Operations::enumerate(const Call& call, const std::string& className, const PropertyList& properties) const {
    const std::string& nameSpace = call.arguments.nameSpace();
    std::vector<std::string> names{className};
    for (const Class* subclass : call.schema.subclasses(className)) {
        names.push_back(subclass->name);
    }
    Response all;
    bool isServed = call.schema.findClass(className) != nullptr;
    for (const std::string& name : names) {
        const bool hasProvider = registry.find(nameSpace, name, InterfaceKind::instance) != nullptr;
        if (!hasProvider && !call.isInterop) {
            continue;
        }
        isServed = isServed || hasProvider;
        Request request;
        request.operation = call.operation;
        request.path = {"", nameSpace, name, {}};
        request.properties = properties;
        Response response = send(call, std::move(request));
        moveAll(response.instances, all.instances);
        moveAll(response.paths, all.paths);
    }
    if (!isServed) {
        throw CimError(CMPI_RC_ERR_INVALID_CLASS, "There is no class " + className + ".");
    }
    return all;
}

ResultCursor Operations::enumeration(const Call& call) const {
    const std::string className = call.arguments.requiredClassName("ClassName");
    InstanceParts parts = partsOf(call);
    if (!call.arguments.flag("DeepInheritance", true)) {
        parts.onlyOf = call.schema.findClass(className);
    }
    Response results = enumerate(call, className, parts.properties);
    return cursorOf(std::move(results), call.form, std::move(parts));
}

InstanceParts Operations::partsOf(const Call& call) const {
    InstanceParts parts;
    parts.properties = call.arguments.strings("PropertyList");
    parts.origins = call.arguments.flag("IncludeClassOrigin", false) ? &call.schema : nullptr;
    return parts;
}

OperationResult Operations::streamed(const Call& call, ResultCursor cursor) const {
    OperationResult result;
    result.count = cursor.left();
    result.next = [writer = writerFor(call),
                   cursor = std::make_shared<ResultCursor>(std::move(cursor))](std::string& xml) {
        if (cursor->left() == 0) {
            return false;
        }
        cursor->append(xml, writer);
        return true;
    };
    return result;
}

OperationResult Operations::enumerateInstances(const Call& call) {
    return streamed(call, enumeration(call));
}

OperationResult Operations::getInstance(const Call& call) {
    const InstanceParts parts = partsOf(call);
    const ObjectPath path = call.arguments.path("InstanceName");
    requireKeys(path, call.schema);
    requireProvider(call, path, CMPI_RC_ERR_NOT_FOUND);
    Response found = send(call, Request::getInstance(path, parts.properties));
    return streamed(call, cursorOf(std::move(found), ObjectForm::instance, parts));
}

OperationResult Operations::createInstance(const Call& call) {
    const Instance instance = call.arguments.reader().instance(call.arguments.required("NewInstance"));
    requireProvider(call, instance.path, CMPI_RC_ERR_NOT_SUPPORTED);
    Response created = send(call, Request::createInstance(instance.path, instance));
    return streamed(call, cursorOf(std::move(created), ObjectForm::instanceName));
}

OperationResult Operations::modifyInstance(const Call& call) {
    Instance modified = call.arguments.reader().namedInstance(call.arguments.required("ModifiedInstance"));
    requireKeys(modified.path, call.schema);
    requireProvider(call, modified.path, CMPI_RC_ERR_NOT_SUPPORTED);
    const PropertyList list = call.arguments.strings("PropertyList");
    removeUnlisted(modified, list);
    send(call, Request::modifyInstance(modified.path, modified, list));
    return {};
}

OperationResult Operations::deleteInstance(const Call& call) {
    const ObjectPath path = call.arguments.path("InstanceName");
    requireKeys(path, call.schema);
    requireProvider(call, path, CMPI_RC_ERR_NOT_SUPPORTED);
    send(call, Request::deleteInstance(path));
    return {};
}

/** Returns no results if no matching association class has a provider. */
Response Operations::associate(const Call& call, Request request) const {
    const bool isReference = isReferenceOperation(request.operation);
    const auto& wanted = isReference ? request.filter.resultClass : request.filter.associationClass;
    const std::vector<const ServedClass*> served = registry.associations(request.path.nameSpace);
    const bool hasProvider = std::any_of(served.begin(), served.end(), [&](const ServedClass* each) {
        return !wanted || call.schema.isA(each->className, *wanted);
    });
    return hasProvider ? send(call, std::move(request)) : Response{};
}

ResultCursor Operations::traversal(const Call& call, const ObjectPath& path) const {
    requireKeys(path, call.schema);
    classOf(call, path.className);
    Request request;
    request.operation = call.operation;
    request.path = path;
    request.filter = filterOf(call);
    request.properties = call.arguments.strings("PropertyList");
    return cursorOf(associate(call, std::move(request)), call.form, partsOf(call));
}

OperationResult Operations::traverse(const Call& call) {
    const ObjectPath path = call.arguments.path("ObjectName");
    const bool isClass = call.arguments.required("ObjectName").name == "CLASSNAME";
    return isClass ? traverseClasses(call, path) : streamed(call, traversal(call, path));
}

}  // namespace cimhost::cimxml
