#include <algorithm>

#include "CimXmlMessages.h"
#include "CimXmlServer.h"
#include "Target.h"
#include "support/Values.h"

namespace fuzz {

namespace {

using cimhost::NamedValue;
using cimhost::ObjectPath;
using cimhost::Value;
using cimhost::cimxml::XmlElement;

const std::string& requiredAttribute(const XmlElement& element, const char* name) {
    const std::string* value = element.attribute(name);
    require(value != nullptr, element.name + " has the attribute " + name);
    return *value;
}

/** The only child of an element. */
const XmlElement& onlyChild(const XmlElement& element, const std::string& name) {
    require(element.children.size() == 1, element.name + " has one element");
    requireSame(element.children.front().name, name, "element of " + element.name);
    return element.children.front();
}

/** The two children of an element. */
std::pair<const XmlElement&, const XmlElement&> twoChildren(const XmlElement& element, const std::string& first,
                                                            const std::string& second) {
    require(element.children.size() == 2, element.name + " has two elements");
    requireSame(element.children[0].name, first, "first element of " + element.name);
    requireSame(element.children[1].name, second, "second element of " + element.name);
    return {element.children[0], element.children[1]};
}

Value typedValue(const XmlElement& element, const std::string& type) {
    require(element.children.empty(), "a value has no elements");
    const std::string& characters = element.characters;
    if (type == "boolean") {
        require(characters == "TRUE" || characters == "FALSE", "a boolean value is TRUE or FALSE");
        return testsupport::boolean(characters == "TRUE");
    }
    if (type == "datetime") {
        return testsupport::dateTime(characters);
    }
    if (type == "uint32") {
        require(!characters.empty() && characters.find_first_not_of("0123456789") == std::string::npos,
                "a number has digits");
        return testsupport::uint32(static_cast<std::uint32_t>(std::stoul(characters)));
    }
    requireSame(type, std::string("string"), "type of a value");
    return testsupport::text(characters);
}

ObjectPath pathIn(const XmlElement& instanceName, const std::string& nameSpace);

std::string nameSpaceIn(const XmlElement& localNameSpacePath) {
    requireSame(localNameSpacePath.name, std::string("LOCALNAMESPACEPATH"), "element");
    std::string nameSpace;
    for (const XmlElement& each : localNameSpacePath.children) {
        requireSame(each.name, std::string("NAMESPACE"), "element");
        nameSpace += (nameSpace.empty() ? "" : "/") + requiredAttribute(each, "NAME");
    }
    return nameSpace;
}

/** Reads INSTANCEPATH, which must have the server's host. */
ObjectPath fullPathIn(const XmlElement& instancePath) {
    const auto [place, name] = twoChildren(instancePath, "NAMESPACEPATH", "INSTANCENAME");
    const auto [host, nameSpace] = twoChildren(place, "HOST", "LOCALNAMESPACEPATH");
    requireSame(host.characters, std::string(CimXmlServer::host), "host");
    return pathIn(name, nameSpaceIn(nameSpace));
}

Value referenceIn(const XmlElement& reference) {
    const auto [nameSpace, name] =
        twoChildren(onlyChild(reference, "LOCALINSTANCEPATH"), "LOCALNAMESPACEPATH", "INSTANCENAME");
    return testsupport::reference(pathIn(name, nameSpaceIn(nameSpace)));
}

ObjectPath pathIn(const XmlElement& instanceName, const std::string& nameSpace) {
    requireSame(instanceName.name, std::string("INSTANCENAME"), "element");
    ObjectPath path{"", nameSpace, requiredAttribute(instanceName, "CLASSNAME"), {}};
    for (const XmlElement& binding : instanceName.children) {
        requireSame(binding.name, std::string("KEYBINDING"), "element");
        require(binding.children.size() == 1, "a key has one value");
        const XmlElement& value = binding.children.front();
        path.keys.push_back({requiredAttribute(binding, "NAME"),
                             value.name == "VALUE.REFERENCE" ? referenceIn(value)
                                                             : typedValue(value, requiredAttribute(value, "TYPE"))});
    }
    return path;
}

NamedValue propertyIn(const XmlElement& property) {
    const std::string& name = requiredAttribute(property, "NAME");
    if (property.name == "PROPERTY.REFERENCE") {
        return {name, referenceIn(onlyChild(property, "VALUE.REFERENCE"))};
    }
    requireSame(property.name, std::string("PROPERTY"), "element");
    const std::string& type = requiredAttribute(property, "TYPE");
    if (property.children.empty()) {
        return {name, testsupport::nullOf(*cimhost::intrinsicType(type))};
    }
    const XmlElement& value = onlyChild(property, "VALUE");
    const bool isModelled = type == "string" || type == "boolean" || type == "datetime" || type == "uint32";
    return {name, isModelled ? typedValue(value, type) : testsupport::text(value.characters)};
}

/** Reads INSTANCE. Adds the keys of its path if the call's list of properties omits them. */
cimhost::Instance instanceIn(const XmlElement& element, ObjectPath path, const Call& call) {
    requireSame(requiredAttribute(element, "CLASSNAME"), path.className, "class of an instance");
    cimhost::Instance instance{std::move(path), {}};
    for (const XmlElement& each : element.children) {
        instance.properties.push_back(propertyIn(each));
        require(isListed(call, instance.properties.back().name), "only listed properties are returned");
    }
    for (const NamedValue& key : instance.path.keys) {
        const bool isThere = testsupport::find(instance.properties, key.name) != nullptr;
        require(isThere == isListed(call, key.name), "a key is a property unless the list omits it");
        if (!isThere) {
            instance.properties.push_back(key);
        }
    }
    return instance;
}

/** The name of the elements that an operation returns. */
std::string elementFor(const cimhost::Request& request, bool isPulled) {
    const bool isAssociation = cimhost::isAssociationOperation(request.operation);
    if (cimhost::returnsPaths(request.operation)) {
        return isPulled ? "INSTANCEPATH" : isAssociation ? "OBJECTPATH" : "INSTANCENAME";
    }
    if (isPulled) {
        return "VALUE.INSTANCEWITHPATH";
    }
    switch (request.operation) {
        case cimhost::Operation::getInstance:
            return "INSTANCE";
        case cimhost::Operation::createInstance:
            return "INSTANCENAME";
        default:
            return isAssociation ? "VALUE.OBJECTWITHPATH" : "VALUE.NAMEDINSTANCE";
    }
}

cimhost::ResultEvent eventIn(const XmlElement& element, const Call& call) {
    const std::string& nameSpace = call.request.path.nameSpace;
    if (element.name == "INSTANCENAME") {
        return std::make_shared<ObjectPath>(pathIn(element, nameSpace));
    }
    if (element.name == "INSTANCEPATH") {
        return std::make_shared<ObjectPath>(fullPathIn(element));
    }
    if (element.name == "OBJECTPATH") {
        return std::make_shared<ObjectPath>(fullPathIn(onlyChild(element, "INSTANCEPATH")));
    }
    if (element.name == "INSTANCE") {
        ObjectPath path = call.request.path;
        path.className = requiredAttribute(element, "CLASSNAME");
        return std::make_shared<cimhost::Instance>(instanceIn(element, std::move(path), call));
    }
    const bool isNamed = element.name == "VALUE.NAMEDINSTANCE";
    const auto [name, instance] = twoChildren(element, isNamed ? "INSTANCENAME" : "INSTANCEPATH", "INSTANCE");
    return std::make_shared<cimhost::Instance>(
        instanceIn(instance, isNamed ? pathIn(name, nameSpace) : fullPathIn(name), call));
}

}  // namespace

XmlResponse responseIn(const XmlElement& root, const std::string& operation) {
    requireSame(root.name, std::string("CIM"), "root of the response");
    const XmlElement& message = onlyChild(root, "MESSAGE");
    requireSame(requiredAttribute(message, "ID"), std::string(messageId), "identifier of the response");
    const XmlElement& element = onlyChild(onlyChild(message, "SIMPLERSP"), "IMETHODRESPONSE");
    requireSame(requiredAttribute(element, "NAME"), operation, "operation of the response");
    XmlResponse response;
    for (const XmlElement& each : element.children) {
        if (each.name == "ERROR") {
            response.status = {std::stoi(requiredAttribute(each, "CODE")), requiredAttribute(each, "DESCRIPTION")};
            require(response.status.rc > 0 && element.children.size() == 1, "an error is the only result");
        } else if (each.name == "IRETURNVALUE") {
            require(!response.hasReturnValue, "there is one return value");
            response.hasReturnValue = true;
            response.results = each.children;
        } else {
            requireSame(each.name, std::string("PARAMVALUE"), "element of the response");
            response.parameters[requiredAttribute(each, "NAME")] = onlyChild(each, "VALUE").characters;
        }
    }
    return response;
}

cimhost::ResultEvents eventsIn(const std::vector<XmlElement>& results, const Call& call, bool isPulled) {
    cimhost::ResultEvents events;
    for (const XmlElement& each : results) {
        requireSame(each.name, elementFor(call.request, isPulled), "result");
        events.push_back(eventIn(each, call));
    }
    return events;
}

}  // namespace fuzz
