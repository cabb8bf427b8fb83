#include "CimXmlFixture.h"

namespace cimhost::cimxml::test {
namespace {

using testing::HasSubstr;

std::string replaced(std::string string, const std::string& from, const std::string& to) {
    const std::size_t at = string.find(from);
    EXPECT_NE(at, std::string::npos) << from;
    return string.replace(at, from.size(), to);
}

class MessageTest : public CimXmlTest {
protected:
    /** The status and the CIMError for a document. */
    static std::string refusalOf(const std::string& document) {
        try {
            readMessage(document);
        } catch (const RequestRefused& refused) {
            return std::to_string(refused.httpStatus) + " " + refused.cimError;
        }
        return "accepted";
    }

    const std::string valid = request("EnumerateInstanceNames", className("ClassName", "Base"));
};

TEST_F(MessageTest, ReadsOperationNamespaceAndParameters) {
    const Message message = readMessage(valid);
    EXPECT_EQ(message.id, "42");
    EXPECT_EQ(message.method, "EnumerateInstanceNames");
    EXPECT_EQ(message.nameSpace, "root/test");
    EXPECT_EQ(message.object, "root/test");
    ASSERT_NE(message.find("classname"), nullptr);
    EXPECT_EQ(*message.find("ClassName")->attribute("NAME"), "Base");
    EXPECT_EQ(message.find("Other"), nullptr);
}

TEST_F(MessageTest, RefusesOtherVersions) {
    EXPECT_EQ(refusalOf(replaced(valid, "CIMVERSION=\"2.0\"", "CIMVERSION=\"3.0\"")), "400 unsupported-cim-version");
    EXPECT_EQ(refusalOf(replaced(valid, "DTDVERSION=\"2.0\"", "DTDVERSION=\"x\"")), "400 unsupported-dtd-version");
    EXPECT_EQ(refusalOf(replaced(valid, "PROTOCOLVERSION=\"1.0\"", "PROTOCOLVERSION=\"2.0\"")),
              "400 unsupported-protocol-version");
    EXPECT_EQ(refusalOf(replaced(valid, "DTDVERSION=\"2.0\"", "DTDVERSION=\"2.4\"")), "accepted");
    EXPECT_EQ(refusalOf(replaced(valid, "PROTOCOLVERSION=\"1.0\"", "PROTOCOLVERSION=\"1.4\"")), "accepted");
}

TEST_F(MessageTest, RefusesDocumentsThatAreNoRequest) {
    EXPECT_EQ(refusalOf("{}"), "400 request-not-well-formed");
    EXPECT_EQ(refusalOf("<A/>"), "400 request-not-loosely-valid");
    EXPECT_EQ(refusalOf("<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"/>"), "400 request-not-loosely-valid");
    EXPECT_EQ(refusalOf(replaced(valid, "ID=\"42\" ", "")), "400 request-not-loosely-valid");
    EXPECT_EQ(refusalOf(replaced(valid, "<NAMESPACE NAME=\"root\"/><NAMESPACE NAME=\"test\"/>", "")),
              "400 request-not-loosely-valid");
}

TEST_F(MessageTest, RefusesDuplicateElements) {
    const std::string nameSpace = "<LOCALNAMESPACEPATH><NAMESPACE NAME=\"root\"/></LOCALNAMESPACEPATH>";
    const std::string call = "<IMETHODCALL NAME=\"GetClass\">" + nameSpace + "</IMETHODCALL>";
    for (const std::string& second : {call, "<METHODCALL NAME=\"x\"><LOCALCLASSPATH>" + nameSpace +
                                                "<CLASSNAME NAME=\"x\"/></LOCALCLASSPATH></METHODCALL>"}) {
        EXPECT_EQ(refusalOf(replaced(valid, "</SIMPLEREQ>", second + "</SIMPLEREQ>")), "400 request-not-loosely-valid");
    }
    EXPECT_EQ(refusalOf(replaced(valid, "</IMETHODCALL>", nameSpace + "</IMETHODCALL>")),
              "400 request-not-loosely-valid");
    EXPECT_EQ(
        refusalOf(replaced(valid, "<CLASSNAME NAME=\"Base\"/>", "<CLASSNAME NAME=\"Base\"/><CLASSNAME NAME=\"x\"/>")),
        "400 request-not-loosely-valid");
    EXPECT_EQ(refusalOf(replaced(valid, "</MESSAGE>", "<SIMPLEREQ>" + call + "</SIMPLEREQ></MESSAGE>")),
              "400 request-not-loosely-valid");
}

TEST_F(MessageTest, IgnoresUnknownElementsAndAttributes) {
    EXPECT_EQ(refusalOf(replaced(valid, "<SIMPLEREQ>", "<SIMPLEREQ EXTRA=\"1\"><EXTRA/>")), "accepted");
}

TEST_F(MessageTest, RefusesSeveralOperationsAndExports) {
    EXPECT_EQ(refusalOf(replaced(replaced(valid, "<SIMPLEREQ>", "<MULTIREQ>"), "</SIMPLEREQ>", "</MULTIREQ>")),
              "501 multiple-requests-unsupported");
    EXPECT_EQ(refusalOf(replaced(replaced(valid, "<SIMPLEREQ>", "<SIMPLEEXPREQ>"), "</SIMPLEREQ>", "</SIMPLEEXPREQ>")),
              "501 unsupported-operation");
}

TEST_F(MessageTest, UnknownOperationsAreNotImplemented) {
    const Message message = readMessage(request("Reboot", ""));
    try {
        operations().perform(message, {});
        FAIL();
    } catch (const RequestRefused& refused) {
        EXPECT_EQ(refused.httpStatus, 501U);
        EXPECT_EQ(refused.cimError, "unsupported-operation");
    }
}

TEST_F(MessageTest, OperationsThatChangeClassesAreNotSupported) {
    for (const char* operation : {"CreateClass", "ModifyClass", "DeleteClass", "SetQualifier", "DeleteQualifier",
                                  "ExecQuery", "GetProperty", "SetProperty", "OpenQueryInstances", "PullInstances"}) {
        EXPECT_EQ(statusOf(response(operation, "")), CMPI_RC_ERR_NOT_SUPPORTED) << operation;
    }
}

TEST_F(MessageTest, MethodsAreFoundButNotAvailable) {
    const auto call = [&](const std::string& method, const std::string& className) {
        return statusOf(respondedTo(
            "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"1\" PROTOCOLVERSION=\"1.0\"><SIMPLEREQ>"
            "<METHODCALL NAME=\"" +
            method +
            "\"><LOCALCLASSPATH><LOCALNAMESPACEPATH><NAMESPACE NAME=\"root\"/>"
            "<NAMESPACE NAME=\"test\"/></LOCALNAMESPACEPATH><CLASSNAME NAME=\"" +
            className + "\"/></LOCALCLASSPATH></METHODCALL></SIMPLEREQ></MESSAGE></CIM>"));
    };
    EXPECT_EQ(call("resize", "derived"), CMPI_RC_ERR_METHOD_NOT_AVAILABLE);
    EXPECT_EQ(call("Explode", "Base"), CMPI_RC_ERR_METHOD_NOT_FOUND);
    EXPECT_EQ(call("Resize", "Nothing"), CMPI_RC_ERR_INVALID_CLASS);
}

TEST_F(MessageTest, WriteOperationsRequireTheRightToWrite) {
    const Caller reader{"reader", false};
    EXPECT_EQ(statusOf(respondedTo(valid, reader)), 0);
    const std::string deletion = request("DeleteInstance", parameter("InstanceName", instanceName("Base", "a")));
    EXPECT_EQ(statusOf(respondedTo(deletion, reader)), CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(statusOf(respondedTo(deletion, {"writer", true})), 0);
    ASSERT_EQ(manager.requests.size(), 3U);  // two classes are enumerated
    const Request& last = manager.requests.back();
    ASSERT_EQ(last.context.size(), 1U);
    EXPECT_EQ(last.context[0].name, "CMPIPrincipal");
    EXPECT_EQ(std::get<std::string>(last.context[0].value.single), "writer");
}

TEST_F(MessageTest, UnknownNamespacesAndParametersAreRefused) {
    EXPECT_EQ(statusOf(response("EnumerateInstanceNames", className("ClassName", "Base"), "root/none")),
              CMPI_RC_ERR_INVALID_NAMESPACE);
    EXPECT_EQ(statusOf(response("EnumerateInstanceNames", className("ClassName", "Base") + value("Colour", "x"))),
              CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(statusOf(response("EnumerateInstanceNames", "")), CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(MessageTest, TheSubjectIsTheClassOfTheRequest) {
    EXPECT_EQ(Operations::subjectOf(readMessage(valid)), "Base");
    EXPECT_EQ(Operations::subjectOf(
                  readMessage(request("DeleteInstance", parameter("InstanceName", instanceName("Derived", "a"))))),
              "Derived");
    EXPECT_EQ(Operations::subjectOf(readMessage(request("EnumerateQualifiers", ""))), "");
}

}  // namespace
}  // namespace cimhost::cimxml::test
