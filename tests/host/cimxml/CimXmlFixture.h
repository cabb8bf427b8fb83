#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "cimxml/Errors.h"
#include "cimxml/Operations.h"
#include "cimxml/ResponseText.h"
#include "schema/MofReader.h"

namespace cimhost::cimxml::test {

constexpr auto testClasses = R"(
[Description("the base")] class Base {
    [Key, MaxLen(10)] string Name;
    uint32 Size = 7;
    uint32 Resize([In] uint32 Size);
};
[Description("derived")] class Derived : Base {
    [Write] boolean Flag;
    datetime When;
    string Tags[];
    [Override("Size"), Write] uint32 Size;
};
class Other { [Key] uint32 Id; real64 Ratio; char16 Letter; };
class Unserved { [Key] string Name; };
[Association] class Link { [Key] Base REF From; [Key] Other REF To; };
)";

/** Records the requests that it receives, and calls a function for the responses. */
class FakeManager : public UpCalls {
public:
    Response perform(Request request) override {
        requests.push_back(request);
        return answer(request);
    }

    std::vector<Request> requests{};
    std::function<Response(const Request&)> answer = [](const Request&) { return Response{}; };
};

inline ObjectPath pathOf(const std::string& className, const std::string& name) {
    return {"", "root/test", className, {{"Name", Value::of(name)}}};
}

inline Instance instanceOf(const std::string& className, const std::string& name,
                           std::vector<NamedValue> properties = {}) {
    Instance instance{pathOf(className, name), {{"Name", Value::of(name)}}};
    instance.properties.insert(instance.properties.end(), properties.begin(), properties.end());
    return instance;
}

/** The operations over a fake manager that serves Base, Derived, Other and Link in root/test. */
class CimXmlTest : public testing::Test {
protected:
    CimXmlTest() {
        MofReader(schema).readSource(testClasses, "test classes");
        for (const char* name : {"Base", "Derived", "Other", "Link"}) {
            registry.add({name, "Test", "Test", true, std::string(name) == "Link", {"root/test"}, "", "", ""});
        }
    }

    Operations& operations() {
        if (!started) {
            started = std::make_unique<Operations>(schema, registry, manager, options);
        }
        return *started;
    }

    /** A request for an operation, with elements IPARAMVALUE. */
    static std::string request(const std::string& operation, const std::string& parameters,
                               const std::string& nameSpace = "root/test") {
        std::string names;
        for (std::size_t at = 0; at != std::string::npos;) {
            const std::size_t end = nameSpace.find('/', at);
            names += "<NAMESPACE NAME=\"" + nameSpace.substr(at, end - at) + "\"/>";
            at = end == std::string::npos ? end : end + 1;
        }
        return "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"42\" PROTOCOLVERSION=\"1.0\"><SIMPLEREQ>"
               "<IMETHODCALL NAME=\"" +
               operation + "\"><LOCALNAMESPACEPATH>" + names + "</LOCALNAMESPACEPATH>" + parameters +
               "</IMETHODCALL></SIMPLEREQ></MESSAGE></CIM>";
    }

    static std::string parameter(const std::string& name, const std::string& value) {
        return "<IPARAMVALUE NAME=\"" + name + "\">" + value + "</IPARAMVALUE>";
    }
    static std::string value(const std::string& name, const std::string& characters) {
        return parameter(name, "<VALUE>" + characters + "</VALUE>");
    }
    static std::string className(const std::string& name, const std::string& className) {
        return parameter(name, "<CLASSNAME NAME=\"" + className + "\"/>");
    }
    static std::string instanceName(const std::string& className, const std::string& name) {
        return "<INSTANCENAME CLASSNAME=\"" + className +
               "\"><KEYBINDING NAME=\"Name\"><KEYVALUE VALUETYPE=\"string\">" + name +
               "</KEYVALUE></KEYBINDING></INSTANCENAME>";
    }
    static std::string properties(const std::vector<std::string>& names) {
        std::string array;
        for (const std::string& each : names) {
            array += "<VALUE>" + each + "</VALUE>";
        }
        return parameter("PropertyList", "<VALUE.ARRAY>" + array + "</VALUE.ARRAY>");
    }

    /** The complete response to a request message. */
    std::string respond(const std::string& document, const Caller& caller = {}) {
        const Message message = readMessage(document);
        std::string text;
        try {
            ResponseText response(message, operations().perform(message, caller));
            while (response.append(text, text.size() + 100)) {
            }
        } catch (const CimError& error) {
            ResponseText response(message, error);
            while (response.append(text, text.size() + 100)) {
            }
        }
        return text;
    }

    /** The element IMETHODRESPONSE of the response. */
    XmlElement response(const std::string& operation, const std::string& parameters,
                        const std::string& nameSpace = "root/test") {
        return respondedTo(request(operation, parameters, nameSpace));
    }

    XmlElement respondedTo(const std::string& document, const Caller& caller = {}) {
        const XmlElement root = parseXml(respond(document, caller));
        return root.child("MESSAGE")->child("SIMPLERSP")->children.front();
    }

    /** The CIM status of a response; 0 if it has no error. */
    static int statusOf(const XmlElement& methodResponse) {
        const XmlElement* error = methodResponse.child("ERROR");
        return error == nullptr ? 0 : std::stoi(*error->attribute("CODE"));
    }

    /** The elements of the return value. */
    static std::vector<XmlElement> returned(const XmlElement& methodResponse) {
        const XmlElement* value = methodResponse.child("IRETURNVALUE");
        return value == nullptr ? std::vector<XmlElement>{} : value->children;
    }

    /** The attribute NAME of all elements of that kind within an element. */
    static std::vector<std::string> namesIn(const XmlElement& element, const std::string& kind) {
        std::vector<std::string> names;
        for (const XmlElement& each : element.children) {
            if (each.name.rfind(kind, 0) == 0) {
                names.push_back(*each.attribute("NAME"));
            }
        }
        return names;
    }

    Schema schema;
    ProviderRegistry registry;
    FakeManager manager;
    OperationsOptions options{"testhost", "1.2.3", {}};
    std::unique_ptr<Operations> started;
};

}  // namespace cimhost::cimxml::test
