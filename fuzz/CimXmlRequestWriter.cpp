#include <algorithm>
#include <cctype>

#include "CimXmlMessages.h"
#include "Target.h"

namespace fuzz {

namespace {

using cimhost::Instance;
using cimhost::NamedValue;
using cimhost::ObjectPath;
using cimhost::Operation;
using cimhost::Value;

struct AsCharacters {
    std::string operator()(bool value) const { return value ? "TRUE" : "FALSE"; }
    std::string operator()(const std::string& value) const { return value; }
    std::string operator()(const cimhost::DateTime& value) const { return value.value; }
    template <class Other>
    std::string operator()(const Other& value) const {
        if constexpr (std::is_arithmetic_v<Other>) {
            return std::to_string(value);
        } else {
            return {};
        }
    }
};

/** Writes the elements of a request. */
class Writer {
public:
    explicit Writer(const Spelling& itsSpelling) : spelling(itsSpelling) {}

    std::string element(const std::string& name, const std::string& attributes, const std::string& content) const {
        const std::string gap = spelling.hasComments ? " <!-- > -->\n" : "";
        return gap + "<" + name + attributes + (content.empty() ? "/>" : ">" + content + "</" + name + ">");
    }

    static std::string attribute(const std::string& name, const std::string& value) {
        return " " + name + "=\"" + escaped(value) + "\"";
    }

    std::string characters(const std::string& value) const {
        const bool isPlain = value.find('\r') == std::string::npos && value.find("]]>") == std::string::npos;
        if (spelling.hasCdata && isPlain) {
            return "<![CDATA[" + value + "]]>";
        }
        return spelling.hasCharacterReferences ? references(value) : escaped(value);
    }

    std::string name(std::string name) const {
        if (spelling.hasOtherCase) {
            std::transform(name.begin(), name.end(), name.begin(),
                           [](unsigned char each) { return std::tolower(each); });
        }
        return name;
    }

    std::string parameter(const std::string& parameterName, const std::string& content) const {
        return element("IPARAMVALUE", attribute("NAME", name(parameterName)), content);
    }

    std::string value(const std::string& content) const { return element("VALUE", "", characters(content)); }

    std::string instanceName(const ObjectPath& path) const {
        std::string keys;
        for (const NamedValue& key : path.keys) {
            const std::string content = keyValue(key.value);
            const bool isNamed = spelling.namesSingleKey || path.keys.size() != 1;
            keys += isNamed ? element("KEYBINDING", attribute("NAME", name(key.name)), content) : content;
        }
        return element("INSTANCENAME", attribute("CLASSNAME", path.className), keys);
    }

    std::string instance(const Instance& instance) const {
        std::string properties;
        for (const NamedValue& each : instance.properties) {
            properties += property(each);
        }
        return element("INSTANCE", attribute("CLASSNAME", instance.path.className), properties);
    }

    std::string className(const std::string& parameterName, const std::string& className) const {
        return parameter(parameterName, element("CLASSNAME", attribute("NAME", className), ""));
    }

    std::string properties(const cimhost::PropertyList& list) const {
        std::string values;
        for (const std::string& each : list.value_or(std::vector<std::string>())) {
            values += value(each);
        }
        return list ? parameter("PropertyList", element("VALUE.ARRAY", "", values)) : "";
    }

    XmlRequest message(const std::string& operation, const std::string& nameSpace,
                       const std::string& parameters) const {
        std::string names;
        for (std::size_t at = 0; at < nameSpace.size();) {
            const std::size_t end = std::min(nameSpace.find('/', at), nameSpace.size());
            names += element("NAMESPACE", attribute("NAME", nameSpace.substr(at, end - at)), "");
            at = end + 1;
        }
        const std::string call = element("IMETHODCALL", attribute("NAME", name(operation)),
                                         element("LOCALNAMESPACEPATH", "", names) + parameters);
        return {name(operation),
                "<?xml version=\"1.0\" encoding=\"utf-8\"?>" +
                    element("CIM", R"( CIMVERSION="2.0" DTDVERSION="2.0")",
                            element("MESSAGE", attribute("ID", messageId) + R"( PROTOCOLVERSION="1.0")",
                                    element("SIMPLEREQ", "", call)))};
    }

private:
    static std::string escaped(const std::string& value) {
        std::string text;
        for (const char each : value) {
            switch (each) {
                case '&':
                    text += "&amp;";
                    break;
                case '<':
                    text += "&lt;";
                    break;
                case '"':
                    text += "&quot;";
                    break;
                case '>':
                    text += "&gt;";
                    break;
                case '\r':
                    text += "&#13;";
                    break;
                default:
                    text += each;
            }
        }
        return text;
    }

    static std::string references(const std::string& value) {
        std::string text;
        for (const char each : value) {
            const bool isAscii = static_cast<unsigned char>(each) < 0x80;
            text += isAscii ? "&#" + std::to_string(each) + ";" : std::string(1, each);
        }
        return text;
    }

    std::string typeOf(const Value& value) const {
        return spelling.hasTypes ? attribute("TYPE", std::string(cimhost::typeName(value.type))) : "";
    }

    std::string reference(const Value& value) const {
        const auto* path = std::get_if<std::shared_ptr<const ObjectPath>>(&value.single);
        return path == nullptr ? "" : element("VALUE.REFERENCE", "", instanceName(**path));
    }

    std::string keyValue(const Value& value) const {
        const auto content = charactersOf(value);
        return content ? element("KEYVALUE", typeOf(value), characters(*content)) : reference(value);
    }

    std::string property(const NamedValue& property) const {
        const std::string named = attribute("NAME", property.name);
        const Value& value = property.value;
        if (value.type == CMPI_ref) {
            return element("PROPERTY.REFERENCE", named, reference(value));
        }
        if (value.isArray) {
            return element("PROPERTY.ARRAY", named + typeOf(value), element("VALUE.ARRAY", "", ""));
        }
        const auto content = charactersOf(value);
        return element("PROPERTY", named + typeOf(value), content ? this->value(*content) : "");
    }

    const Spelling& spelling;
};

/** The parameters that the operation of a call and the corresponding Open operation have in common. */
std::string parametersOf(const Call& call, const Writer& writer, const char* pathParameter) {
    const cimhost::Request& request = call.request;
    const cimhost::AssociationFilter& filter = request.filter;
    std::string parameters;
    if (cimhost::isAssociationOperation(request.operation)) {
        const bool isReference = cimhost::isReferenceOperation(request.operation);
        parameters += writer.parameter(pathParameter, writer.instanceName(request.path));
        parameters +=
            filter.associationClass && !isReference ? writer.className("AssocClass", *filter.associationClass) : "";
        parameters += filter.resultClass ? writer.className("ResultClass", *filter.resultClass) : "";
        parameters += filter.role ? writer.parameter("Role", writer.value(*filter.role)) : "";
        parameters +=
            filter.resultRole && !isReference ? writer.parameter("ResultRole", writer.value(*filter.resultRole)) : "";
    } else {
        parameters += writer.className("ClassName", request.path.className);
    }
    return parameters + (cimhost::returnsPaths(request.operation) ? "" : writer.properties(request.properties));
}

std::string parametersOf(const Call& call, const Writer& writer) {
    const cimhost::Request& request = call.request;
    const std::string name = writer.instanceName(request.path);
    switch (request.operation) {
        case Operation::createInstance:
            return call.hasInstance ? writer.parameter("NewInstance", writer.instance(request.instance)) : "";
        case Operation::modifyInstance:
            return (call.hasInstance
                        ? writer.parameter("ModifiedInstance", writer.element("VALUE.NAMEDINSTANCE", "",
                                                                              name + writer.instance(request.instance)))
                        : "") +
                   writer.properties(request.properties);
        case Operation::getInstance:
            return writer.parameter("InstanceName", name) + writer.properties(request.properties);
        case Operation::deleteInstance:
            return writer.parameter("InstanceName", name);
        case Operation::execQuery:
            return "";
        default:
            return parametersOf(call, writer, "ObjectName");
    }
}

std::string number(std::size_t value) {
    return std::to_string(value);
}

const char* openingOperation(Operation operation) {
    switch (operation) {
        case Operation::enumerateInstances:
            return "OpenEnumerateInstances";
        case Operation::enumerateInstanceNames:
            return "OpenEnumerateInstancePaths";
        case Operation::associators:
            return "OpenAssociatorInstances";
        case Operation::associatorNames:
            return "OpenAssociatorInstancePaths";
        case Operation::references:
            return "OpenReferenceInstances";
        default:
            return "OpenReferenceInstancePaths";
    }
}

}  // namespace

std::optional<std::string> charactersOf(const Value& value) {
    const bool hasCharacters = !value.isNull && !value.isArray && !value.lacksCharacters && value.type != CMPI_ref;
    return hasCharacters ? std::optional(std::visit(AsCharacters{}, value.single)) : std::nullopt;
}

Spelling nextSpelling(Bytes& bytes) {
    const unsigned choice = bytes.byte();
    const auto has = [&](unsigned bit) { return (choice >> bit & 1U) != 0; };
    return {has(0), has(1), has(2), has(3), has(4), has(5)};
}

XmlRequest requestFor(const Call& call, const Spelling& spelling) {
    const Writer writer(spelling);
    return writer.message(cimhost::nameOf(call.request.operation), call.request.path.nameSpace,
                          parametersOf(call, writer));
}

XmlRequest openingRequest(const Call& call, const Spelling& spelling, std::size_t most) {
    const Writer writer(spelling);
    return writer.message(
        openingOperation(call.request.operation), call.request.path.nameSpace,
        parametersOf(call, writer, "InstanceName") + writer.parameter("MaxObjectCount", writer.value(number(most))));
}

XmlRequest pullRequest(bool ofPaths, const std::string& nameSpace, const std::string& context, std::size_t most) {
    const Spelling spelling;
    const Writer writer(spelling);
    return writer.message(ofPaths ? "PullInstancePaths" : "PullInstancesWithPath", nameSpace,
                          writer.parameter("EnumerationContext", writer.value(context)) +
                              writer.parameter("MaxObjectCount", writer.value(number(most))));
}

XmlRequest closingRequest(const std::string& nameSpace, const std::string& context) {
    const Spelling spelling;
    const Writer writer(spelling);
    return writer.message("CloseEnumeration", nameSpace, writer.parameter("EnumerationContext", writer.value(context)));
}

}  // namespace fuzz
