#include "cimxml/OperationArguments.h"

#include <algorithm>
#include <set>

#include "cim/Names.h"
#include "cimxml/Errors.h"
#include "schema/Errors.h"

namespace cimhost::cimxml {
namespace {

[[noreturn]] void invalid(std::string_view name, const std::string& why) {
    throw CimError(CMPI_RC_ERR_INVALID_PARAMETER, "Parameter " + std::string(name) + " " + why + ".");
}

/** Whether a name is in a list of names separated by spaces. */
bool isOneOf(std::string_view names, std::string_view name) {
    while (!names.empty()) {
        const std::string_view each = names.substr(0, names.find(' '));
        if (cim::sameName(each, name)) {
            return true;
        }
        names.remove_prefix(std::min(names.size(), each.size() + 1));
    }
    return false;
}

const std::string& valueOf(std::string_view name, const XmlElement& element) {
    if (element.name != "VALUE" || !element.children.empty()) {
        invalid(name, "is not a single value");
    }
    return element.characters;
}

}  // namespace

void OperationArguments::requireKnown(std::string_view names) const {
    std::set<std::string_view, cim::NameLess> found;
    for (const auto& [name, element] : message.parameters) {
        if (!isOneOf(names, name)) {
            invalid(name, "is not one of " + message.method);
        }
        if (!found.insert(name).second) {
            invalid(name, "is there twice");
        }
        if (isOneOf("LocalOnly DeepInheritance IncludeQualifiers IncludeClassOrigin", name)) {
            flag(name, false);  // must be a boolean even if the operation ignores it
        }
    }
}

bool OperationArguments::flag(std::string_view name, bool absent) const {
    const XmlElement* element = message.find(name);
    if (element == nullptr) {
        return absent;
    }
    try {
        return std::get<bool>(scalarFrom(valueOf(name, *element), CMPI_boolean));
    } catch (const ValueError& error) {
        invalid(name, std::string("is wrong: ") + error.what());
    }
}

std::optional<std::uint32_t> OperationArguments::number(std::string_view name) const {
    const XmlElement* element = message.find(name);
    if (element == nullptr) {
        return std::nullopt;
    }
    try {
        return std::get<std::uint32_t>(scalarFrom(valueOf(name, *element), CMPI_uint32));
    } catch (const ValueError& error) {
        invalid(name, std::string("is wrong: ") + error.what());
    }
}

std::optional<std::string> OperationArguments::string(std::string_view name) const {
    const XmlElement* element = message.find(name);
    return element == nullptr ? std::nullopt : std::optional(valueOf(name, *element));
}

PropertyList OperationArguments::strings(std::string_view name) const {
    const XmlElement* element = message.find(name);
    if (element == nullptr) {
        return std::nullopt;
    }
    if (element->name != "VALUE.ARRAY") {
        invalid(name, "is not an array");
    }
    requireFew(*element);
    std::vector<std::string> values;
    for (const XmlElement& each : element->children) {
        values.push_back(valueOf(name, each));
    }
    return values;
}

std::optional<std::string> OperationArguments::className(std::string_view name) const {
    const XmlElement* element = message.find(name);
    if (element == nullptr) {
        return std::nullopt;
    }
    if (element->name != "CLASSNAME") {
        invalid(name, "is not a class name");
    }
    return elements.path(*element).className;
}

std::string OperationArguments::requiredClassName(std::string_view name) const {
    required(name);
    return *className(name);
}

std::string OperationArguments::requiredString(std::string_view name) const {
    required(name);
    return *string(name);
}

ObjectPath OperationArguments::path(std::string_view name) const {
    const XmlElement& element = required(name);
    if (element.name != "INSTANCENAME" && element.name != "CLASSNAME") {
        invalid(name, "is neither an INSTANCENAME nor a CLASSNAME");
    }
    return elements.path(element);
}

AssociationFilter OperationArguments::filter() const {
    return {className("AssocClass"), className("ResultClass"), string("Role"), string("ResultRole")};
}

const XmlElement& OperationArguments::required(std::string_view name) const {
    const XmlElement* element = message.find(name);
    if (element == nullptr) {
        invalid(name, "is missing");
    }
    return *element;
}

}  // namespace cimhost::cimxml
