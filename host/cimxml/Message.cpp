#include "cimxml/Message.h"

#include <algorithm>
#include <cctype>

#include "cim/Names.h"
#include "cimxml/Errors.h"

namespace cimhost::cimxml {
namespace {

constexpr unsigned badRequest = 400;

[[noreturn]] void notLooselyValid(const std::string& why) {
    throw RequestRefused(badRequest, "request-not-loosely-valid", why);
}

/** The only child element of a name. @throws RequestRefused if there is none, or more than one */
const XmlElement& onlyChild(const XmlElement& parent, std::string_view name) {
    const XmlElement* child = parent.child(name);
    if (child == nullptr) {
        notLooselyValid("Element " + parent.name + " has no " + std::string(name) + ".");
    }
    const auto isSame = [&](const XmlElement& each) { return each.name == name; };
    if (std::count_if(parent.children.begin(), parent.children.end(), isSame) > 1) {
        notLooselyValid("Element " + parent.name + " has more than one " + std::string(name) + ".");
    }
    return *child;
}

const std::string& requiredAttribute(const XmlElement& element, std::string_view name) {
    const std::string* value = element.attribute(name);
    if (value == nullptr) {
        notLooselyValid("Element " + element.name + " has no attribute " + std::string(name) + ".");
    }
    return *value;
}

/** Requires a version with the given major number, such as 2.x: all its minor versions are compatible. */
void checkVersion(const XmlElement& element, std::string_view attribute, char major, const char* error) {
    const std::string& version = requiredAttribute(element, attribute);
    const bool isKnown = version.size() > 2 && version[0] == major && version[1] == '.' &&
                         std::all_of(version.begin() + 2, version.end(),
                                     [](unsigned char digit) { return std::isdigit(digit) != 0 || digit == '.'; });
    if (!isKnown) {
        throw RequestRefused(badRequest, error,
                             std::string(attribute) + " " + version + " is not supported; send " + major + ".0.");
    }
}

const XmlElement& requestOf(const XmlElement& message) {
    if (message.child("MULTIREQ") != nullptr) {
        throw RequestRefused(notImplemented, "multiple-requests-unsupported",
                             "Several operations in one message are not supported.");
    }
    if (message.child("SIMPLEEXPREQ") != nullptr || message.child("MULTIEXPREQ") != nullptr) {
        throw RequestRefused(notImplemented, "unsupported-operation", "Export messages are not supported.");
    }
    return onlyChild(message, "SIMPLEREQ");
}

void readParameters(Message& message, const XmlElement& call, std::string_view elementName) {
    for (const XmlElement& each : call.children) {
        if (each.name != elementName) {
            continue;
        }
        const std::string& name = requiredAttribute(each, "NAME");
        if (each.children.size() > 1) {
            notLooselyValid("Parameter " + name + " has more than one value.");
        }
        message.parameters.emplace_back(name, each.children.empty() ? XmlElement{} : each.children.front());
    }
}

/** Reads the target of a method: LOCALCLASSPATH or LOCALINSTANCEPATH. */
void readTarget(Message& message, const XmlElement& call) {
    const XmlElement* path = call.child("LOCALCLASSPATH");
    const bool isClass = path != nullptr;
    if (!isClass) {
        path = &onlyChild(call, "LOCALINSTANCEPATH");
    }
    message.nameSpace = nameSpaceOf(onlyChild(*path, "LOCALNAMESPACEPATH"));
    message.target = onlyChild(*path, isClass ? "CLASSNAME" : "INSTANCENAME");
    message.object = message.nameSpace + ":" + requiredAttribute(message.target, isClass ? "NAME" : "CLASSNAME");
}

void readCall(Message& message, const XmlElement& request) {
    message.isIntrinsic = request.child("IMETHODCALL") != nullptr;
    if (message.isIntrinsic && request.child("METHODCALL") != nullptr) {
        notLooselyValid("Element SIMPLEREQ has more than one operation.");
    }
    const XmlElement& call = onlyChild(request, message.isIntrinsic ? "IMETHODCALL" : "METHODCALL");
    message.method = requiredAttribute(call, "NAME");
    if (message.isIntrinsic) {
        message.nameSpace = nameSpaceOf(onlyChild(call, "LOCALNAMESPACEPATH"));
        message.object = message.nameSpace;
        readParameters(message, call, "IPARAMVALUE");
        return;
    }
    readTarget(message, call);
    readParameters(message, call, "PARAMVALUE");
}

}  // namespace

const XmlElement* Message::find(std::string_view parameter) const {
    const auto found = std::find_if(parameters.begin(), parameters.end(),
                                    [&](const auto& each) { return cim::sameName(each.first, parameter); });
    return found == parameters.end() || found->second.name.empty() ? nullptr : &found->second;
}

std::string nameSpaceOf(const XmlElement& localNameSpacePath) {
    std::string nameSpace;
    for (const XmlElement& each : localNameSpacePath.children) {
        if (each.name == "NAMESPACE") {
            nameSpace += (nameSpace.empty() ? "" : "/") + requiredAttribute(each, "NAME");
        }
    }
    if (nameSpace.empty()) {
        notLooselyValid("A LOCALNAMESPACEPATH has no NAMESPACE.");
    }
    return nameSpace;
}

Message readMessage(std::string_view document, const XmlLimits& limits) {
    XmlElement root;
    try {
        root = parseXml(document, limits);
    } catch (const XmlError& error) {
        throw RequestRefused(badRequest, "request-not-well-formed", error.what());
    }
    if (root.name != "CIM") {
        notLooselyValid("The root element is " + root.name + ", not CIM.");
    }
    checkVersion(root, "CIMVERSION", '2', "unsupported-cim-version");
    checkVersion(root, "DTDVERSION", '2', "unsupported-dtd-version");
    const XmlElement& element = onlyChild(root, "MESSAGE");
    checkVersion(element, "PROTOCOLVERSION", '1', "unsupported-protocol-version");
    Message message;
    message.id = requiredAttribute(element, "ID");
    message.protocolVersion = requiredAttribute(element, "PROTOCOLVERSION");
    readCall(message, requestOf(element));
    return message;
}

}  // namespace cimhost::cimxml
