#include "cimxml/Operations.h"

#include <algorithm>

#include "cim/Names.h"
#include "cimxml/Errors.h"
#include "cimxml/Interop.h"

namespace cimhost::cimxml {
namespace {

const std::string* findName(const std::vector<std::string>& names, std::string_view name) {
    const auto found =
        std::find_if(names.begin(), names.end(), [&](const std::string& each) { return cim::sameName(each, name); });
    return found == names.end() ? nullptr : &*found;
}

}  // namespace

// clang-format off
const Operations::Row Operations::rows[] = {
    {"EnumerateInstances", false, &Operations::enumerateInstances,
     "ClassName LocalOnly DeepInheritance IncludeQualifiers IncludeClassOrigin PropertyList",
     Operation::enumerateInstances, ObjectForm::namedInstance},
    {"EnumerateInstanceNames", false, &Operations::enumerateInstances, "ClassName",
     Operation::enumerateInstanceNames, ObjectForm::instanceName},
    {"GetInstance", false, &Operations::getInstance,
     "InstanceName LocalOnly IncludeQualifiers IncludeClassOrigin PropertyList"},
    {"CreateInstance", true, &Operations::createInstance, "NewInstance"},
    {"ModifyInstance", true, &Operations::modifyInstance, "ModifiedInstance IncludeQualifiers PropertyList"},
    {"DeleteInstance", true, &Operations::deleteInstance, "InstanceName"},
    {"Associators", false, &Operations::traverse,
     "ObjectName AssocClass ResultClass Role ResultRole IncludeQualifiers IncludeClassOrigin PropertyList",
     Operation::associators, ObjectForm::objectWithPath},
    {"AssociatorNames", false, &Operations::traverse, "ObjectName AssocClass ResultClass Role ResultRole",
     Operation::associatorNames, ObjectForm::objectPath},
    {"References", false, &Operations::traverse,
     "ObjectName ResultClass Role IncludeQualifiers IncludeClassOrigin PropertyList",
     Operation::references, ObjectForm::objectWithPath},
    {"ReferenceNames", false, &Operations::traverse, "ObjectName ResultClass Role",
     Operation::referenceNames, ObjectForm::objectPath},
    {"GetClass", false, &Operations::getClass,
     "ClassName LocalOnly IncludeQualifiers IncludeClassOrigin PropertyList"},
    {"EnumerateClasses", false, &Operations::enumerateClasses,
     "ClassName DeepInheritance LocalOnly IncludeQualifiers IncludeClassOrigin"},
    {"EnumerateClassNames", false, &Operations::enumerateClassNames, "ClassName DeepInheritance"},
    {"GetQualifier", false, &Operations::getQualifier, "QualifierName"},
    {"EnumerateQualifiers", false, &Operations::enumerateQualifiers, ""},
    {"OpenEnumerateInstances", false, &Operations::openEnumeration,
     "ClassName DeepInheritance IncludeClassOrigin PropertyList FilterQueryLanguage FilterQuery OperationTimeout "
     "ContinueOnError MaxObjectCount", Operation::enumerateInstances, ObjectForm::instanceWithPath},
    {"OpenEnumerateInstancePaths", false, &Operations::openEnumeration,
     "ClassName FilterQueryLanguage FilterQuery OperationTimeout ContinueOnError MaxObjectCount",
     Operation::enumerateInstanceNames, ObjectForm::instancePath},
    {"OpenAssociatorInstances", false, &Operations::openTraversal,
     "InstanceName AssocClass ResultClass Role ResultRole IncludeClassOrigin PropertyList FilterQueryLanguage "
     "FilterQuery OperationTimeout ContinueOnError MaxObjectCount",
     Operation::associators, ObjectForm::instanceWithPath},
    {"OpenAssociatorInstancePaths", false, &Operations::openTraversal,
     "InstanceName AssocClass ResultClass Role ResultRole FilterQueryLanguage FilterQuery OperationTimeout "
     "ContinueOnError MaxObjectCount", Operation::associatorNames, ObjectForm::instancePath},
    {"OpenReferenceInstances", false, &Operations::openTraversal,
     "InstanceName ResultClass Role IncludeClassOrigin PropertyList FilterQueryLanguage FilterQuery OperationTimeout "
     "ContinueOnError MaxObjectCount", Operation::references, ObjectForm::instanceWithPath},
    {"OpenReferenceInstancePaths", false, &Operations::openTraversal,
     "InstanceName ResultClass Role FilterQueryLanguage FilterQuery OperationTimeout ContinueOnError MaxObjectCount",
     Operation::referenceNames, ObjectForm::instancePath},
    {"PullInstancesWithPath", false, &Operations::pull, "EnumerationContext MaxObjectCount",
     {}, ObjectForm::instanceWithPath},
    {"PullInstancePaths", false, &Operations::pull, "EnumerationContext MaxObjectCount", {}, ObjectForm::instancePath},
    {"CloseEnumeration", false, &Operations::closeEnumeration, "EnumerationContext"},
    {"PullInstances", false, nullptr},
    {"OpenQueryInstances", false, nullptr},
    {"EnumerationCount", false, nullptr},
    {"ExecQuery", false, nullptr},
    {"GetProperty", false, nullptr},
    {"SetProperty", true, nullptr},
    {"CreateClass", true, nullptr},
    {"ModifyClass", true, nullptr},
    {"DeleteClass", true, nullptr},
    {"SetQualifier", true, nullptr},
    {"DeleteQualifier", true, nullptr},
};
// clang-format on

Operations::Operations(const Schema& itsSchema, const ProviderRegistry& itsRegistry, UpCalls& itsManager,
                       OperationsOptions itsOptions)
    : schema(itsSchema),
      registry(itsRegistry),
      manager(itsManager),
      options(std::move(itsOptions)),
      nameSpaces(registry.nameSpaces()),
      interop(interopSchema(options.host, options.version, nameSpaces)),
      interopInstances(interop),
      enumerations(options.limits) {}

const std::string* Operations::findNameSpace(std::string_view name, bool& isInterop) const {
    const std::string* found = findName(interopNameSpaces(), name);
    isInterop = found != nullptr;
    return isInterop ? found : findName(nameSpaces, name);
}

OperationResult Operations::perform(const Message& message, const Caller& caller) {
    const auto* row = std::find_if(std::begin(rows), std::end(rows),
                                   [&](const Row& each) { return cim::sameName(each.name, message.method); });
    if (message.isIntrinsic && row == std::end(rows)) {
        throw RequestRefused(notImplemented, "unsupported-operation", "There is no operation " + message.method + ".");
    }
    bool isInterop = false;
    if (findNameSpace(message.nameSpace, isInterop) == nullptr) {
        throw CimError(CMPI_RC_ERR_INVALID_NAMESPACE, "There is no namespace " + message.nameSpace + ".");
    }
    const Schema& itsSchema = isInterop ? interop : schema;
    if (!caller.mayWrite && (!message.isIntrinsic || row->writes)) {
        throw CimError(CMPI_RC_ERR_ACCESS_DENIED, "This user may read, but not change anything.");
    }
    if (!message.isIntrinsic) {
        return performMethod(message, itsSchema);
    }
    if (row->handler == nullptr) {
        throw CimError(CMPI_RC_ERR_NOT_SUPPORTED, std::string(row->name) + " is not supported.");
    }
    const OperationArguments arguments(message, itsSchema);
    arguments.requireKnown(row->parameters);
    UpCalls& target = isInterop ? static_cast<UpCalls&>(interopInstances) : manager;
    return (this->*row->handler)({arguments, caller, itsSchema, target, isInterop, row->operation, row->form});
}

OperationResult Operations::performMethod(const Message& message, const Schema& itsSchema) const {
    const std::string* name = message.target.attribute(message.target.name == "CLASSNAME" ? "NAME" : "CLASSNAME");
    const Class* known = itsSchema.findClass(*name);
    if (known == nullptr) {
        throw CimError(CMPI_RC_ERR_INVALID_CLASS, "There is no class " + *name + ".");
    }
    const auto isMethod = [&](const Method& each) { return cim::sameName(each.name, message.method); };
    if (std::none_of(known->methods.begin(), known->methods.end(), isMethod)) {
        throw CimError(CMPI_RC_ERR_METHOD_NOT_FOUND, "Class " + known->name + " has no method " + message.method + ".");
    }
    throw CimError(CMPI_RC_ERR_METHOD_NOT_AVAILABLE, "Methods are not supported.");
}

bool Operations::returnsList(std::string_view method) {
    const auto isFirst = [&](std::string_view word) { return cim::sameName(method.substr(0, word.size()), word); };
    return isFirst("Enumerate") || isFirst("Associator") || isFirst("Reference") || isFirst("Open") || isFirst("Pull");
}

std::string Operations::subjectOf(const Message& message) {
    if (!message.isIntrinsic) {
        return message.object.substr(message.object.find(':') + 1);
    }
    for (const auto& [name, element] : message.parameters) {
        const XmlElement* object = &element;
        if (object->name == "VALUE.NAMEDINSTANCE") {
            object = object->child("INSTANCENAME");
        }
        const bool isClass = object != nullptr && object->name == "CLASSNAME";
        const std::string* found = object == nullptr ? nullptr : object->attribute(isClass ? "NAME" : "CLASSNAME");
        if (found != nullptr) {
            return *found;
        }
    }
    return {};
}

const Class& Operations::classOf(const Call& call, const std::string& name) const {
    const Class* known = call.schema.findClass(name);
    if (known == nullptr) {
        throw CimError(CMPI_RC_ERR_INVALID_CLASS, "There is no class " + name + ".");
    }
    return *known;
}

/** The filter of a traversal. @throws CimError if a class of the filter does not exist */
AssociationFilter Operations::filterOf(const Call& call) const {
    AssociationFilter filter = call.arguments.filter();
    for (const auto& name : {filter.resultClass, filter.associationClass}) {
        if (name && call.schema.findClass(*name) == nullptr) {
            throw CimError(CMPI_RC_ERR_INVALID_PARAMETER, "There is no class " + *name + ".");
        }
    }
    return filter;
}

}  // namespace cimhost::cimxml
