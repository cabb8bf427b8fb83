#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "server/HeaderCheck.h"

using namespace cimhost::server;

namespace {

class HeaderCheckTest : public testing::Test {
public:
    /** Changes a header; an empty value removes it. */
    HeaderCheckTest& with(const std::string& name, const std::string& value) {
        request.headers.erase(name);
        if (!value.empty()) {
            request.headers.emplace(name, value);
        }
        return *this;
    }

    std::variant<CimHeaders, HttpResponse> check() const { return checkHeaders(request, rules); }

    /** The HTTP status, with the CIMError; 200 for a request that is accepted. */
    std::string result() const {
        const auto checked = check();
        const auto* response = std::get_if<HttpResponse>(&checked);
        if (response == nullptr) {
            return "200";
        }
        const auto error = headerIn(response->headers, "CIMError");
        return std::to_string(response->status) + (error ? " " + *error : "");
    }

    HttpRequest request{"POST",
                        {{"Host", "localhost:5988"},
                         {"Content-Type", "application/xml; charset=\"utf-8\""},
                         {"Content-Length", "100"},
                         {"CIMOperation", "MethodCall"},
                         {"CIMMethod", "GetClass"},
                         {"CIMObject", "root%2Fcimv2"}}};
    HeaderRules rules{true, 1000};
};

TEST_F(HeaderCheckTest, AcceptsARequestAndDecodesItsHeaders) {
    const auto checked = check();
    ASSERT_TRUE(std::holds_alternative<CimHeaders>(checked));
    EXPECT_EQ(std::get<CimHeaders>(checked).object, "root/cimv2");
    EXPECT_EQ(std::get<CimHeaders>(checked).method, "GetClass");
}

TEST_F(HeaderCheckTest, OtherMethodsAreNotAllowed) {
    for (const char* method : {"GET", "DELETE", "PUT", "HEAD", "TRACE", "NONSENSE"}) {
        request.method = method;
        const auto checked = check();
        const auto& response = std::get<HttpResponse>(checked);
        EXPECT_EQ(response.status, 405U) << method;
        EXPECT_EQ(headerIn(response.headers, "Allow"), "POST, M-POST, OPTIONS");
    }
}

TEST_F(HeaderCheckTest, OptionsReportTheProtocol) {
    request.method = "OPTIONS";
    const auto checked = check();
    const auto& response = std::get<HttpResponse>(checked);
    EXPECT_EQ(response.status, 200U);
    EXPECT_EQ(headerIn(response.headers, "CIMProtocolVersion"), "1.0");
    EXPECT_TRUE(headerIn(response.headers, "CIMSupportedFunctionalGroups"));
}

TEST_F(HeaderCheckTest, WebPagesReceiveNoAnswer) {
    EXPECT_EQ(with("CIMOperation", "").result(), "400");
    with("CIMOperation", "MethodCall");
    EXPECT_EQ(with("Origin", "http://evil.example").result(), "403");
    request.method = "OPTIONS";
    EXPECT_EQ(result(), "403");
}

TEST_F(HeaderCheckTest, OnlyNamesOfTheLoopbackInterfaceAreHostsWithoutAuthentication) {
    for (const char* host : {"localhost", "LOCALHOST:1", "127.0.0.1", "127.1.2.3:5988", "[::1]", "[::1]:5988"}) {
        EXPECT_EQ(with("Host", host).result(), "200") << host;
    }
    for (const char* host : {"", "evil.example", "localhost.evil.example", "127.0.0.1.evil.example", "10.0.0.1"}) {
        EXPECT_EQ(with("Host", host).result(), "403") << host;
    }
    rules.requiresLocalHost = false;
    EXPECT_EQ(with("Host", "server.example").result(), "200");
}

TEST_F(HeaderCheckTest, HeadersOfTheOperationAreRequired) {
    EXPECT_EQ(with("CIMOperation", "MethodResponse").result(), "400 unsupported-operation");
    EXPECT_EQ(with("CIMOperation", "methodcall").result(), "200");
    EXPECT_EQ(with("CIMMethod", "").result(), "400 header-mismatch");
    EXPECT_EQ(with("CIMMethod", "GetClass").with("CIMObject", "").result(), "400 header-mismatch");
    EXPECT_EQ(with("CIMObject", "root%2").result(), "400 header-mismatch");
    EXPECT_EQ(with("CIMObject", "root%zz").result(), "400 header-mismatch");
    with("CIMObject", "root");
    request.headers.emplace("CIMObject", "interop");
    EXPECT_EQ(result(), "400 header-mismatch");
}

TEST_F(HeaderCheckTest, UnknownProtocolVersionsAndGroupsAreRefused) {
    EXPECT_EQ(with("CIMProtocolVersion", "1.4").result(), "200");
    for (const char* version : {"2.0", "1.", "1.x", "11.0"}) {
        EXPECT_EQ(with("CIMProtocolVersion", version).result(), "400 unsupported-protocol-version") << version;
    }
    EXPECT_EQ(with("CIMProtocolVersion", "1.0").with("CIMBatch", "x").result(), "501 multiple-requests-unsupported");
    EXPECT_EQ(with("CIMBatch", "").with("CIMExport", "x").result(), "501 unsupported-operation");
}

TEST_F(HeaderCheckTest, DuplicateHeadersAreRefused) {
    with("CIMProtocolVersion", "1.0");
    request.headers.emplace("CIMProtocolVersion", "2.0");
    EXPECT_EQ(result(), "400 unsupported-protocol-version");
    with("CIMProtocolVersion", "").with("Content-Encoding", "identity");
    request.headers.emplace("Content-Encoding", "gzip");
    EXPECT_EQ(result(), "415");
}

TEST_F(HeaderCheckTest, OnlyXmlInUtf8IsAccepted) {
    for (const char* type : {"text/xml", "application/xml", "TEXT/XML; charset=UTF-8", "text/xml;charset=utf-8"}) {
        EXPECT_EQ(with("Content-Type", type).result(), "200") << type;
    }
    for (const char* type : {"", "application/json", "text/xml; charset=utf-16", "text/xmlx"}) {
        EXPECT_EQ(with("Content-Type", type).result(), "415") << type;
    }
    EXPECT_EQ(with("Content-Type", "text/xml").with("Content-Encoding", "gzip").result(), "415");
}

TEST_F(HeaderCheckTest, TheOnlyExpectationIsToContinue) {
    EXPECT_EQ(with("Expect", "100-continue").result(), "200");
    EXPECT_EQ(with("Expect", "100-Continue").result(), "200");
    for (const char* expectation : {"other", "100-continue, other", "200-ok"}) {
        EXPECT_EQ(with("Expect", expectation).result(), "417") << expectation;
    }
    with("Expect", "100-continue");
    request.headers.emplace("Expect", "100-continue");
    EXPECT_EQ(result(), "417");
}

TEST_F(HeaderCheckTest, AmbiguousHeadsAreRefused) {
    const HttpRequest accepted = request;
    for (const auto& [name, value] : {std::pair{"Content-Length ", "100"},
                                      {"Content-Length", "100"},
                                      {"Host", "localhost"},
                                      {"Transfer-Encoding", "chunked"},
                                      {"X", "a\rTransfer-Encoding: chunked"}}) {
        request.headers.emplace(name, value);
        EXPECT_EQ(result(), "400") << name << ": " << value;
        EXPECT_TRUE(mayHaveBody(request.headers)) << name << ": " << value;
        request = accepted;
    }
    with("Content-Length", "");
    for (const char* encoding : {"identity", "gzip, chunked", "chunked, identity", "xchunked"}) {
        EXPECT_EQ(with("Transfer-Encoding", encoding).result(), "400") << encoding;
    }
    EXPECT_EQ(with("Transfer-Encoding", "Chunked").result(), "200");
    request.method = "OPTIONS";
    request.headers.emplace("Transfer-Encoding", "chunked");
    EXPECT_EQ(result(), "400");
}

TEST_F(HeaderCheckTest, TheLengthIsLimitedAndUnambiguous) {
    EXPECT_EQ(with("Content-Length", "1000").result(), "200");
    EXPECT_EQ(with("Content-Length", "1001").result(), "413");
    EXPECT_EQ(with("Content-Length", "99999999999999999999999").result(), "413");
    EXPECT_EQ(with("Content-Length", "-1").result(), "400");
    EXPECT_EQ(with("Content-Length", "5").with("Transfer-Encoding", "chunked").result(), "400");
    EXPECT_EQ(with("Content-Length", "").result(), "200");
    with("Transfer-Encoding", "").with("Content-Length", "5");
    request.headers.emplace("Content-Length", "6");
    EXPECT_EQ(result(), "400");
}

TEST_F(HeaderCheckTest, ExtensionRequestsHavePrefixedHeaders) {
    request.method = "M-POST";
    EXPECT_EQ(result(), "510");
    with("Man", "http://www.dmtf.org/cim/mapping/http/v1.0 ; ns=73");
    EXPECT_EQ(result(), "400");
    with("73-CIMOperation", "MethodCall").with("73-CIMMethod", "GetClass").with("73-CIMObject", "root");
    const auto checked = check();
    ASSERT_TRUE(std::holds_alternative<CimHeaders>(checked));
    EXPECT_EQ(extensionPrefixOf(request), "73-");
    EXPECT_EQ(std::get<CimHeaders>(checked).object, "root");
    EXPECT_EQ(with("Man", "http://example.com/other ; ns=73").result(), "510");
}

TEST_F(HeaderCheckTest, RefusalsOfExtensionRequestsHavePrefixedHeaders) {
    const HttpResponse response = withExtension(refusal(400, "why", "header-mismatch"), "73-");
    EXPECT_EQ(headerIn(response.headers, "73-CIMError"), "header-mismatch");
    EXPECT_EQ(headerIn(response.headers, "Man"), "http://www.dmtf.org/cim/mapping/http/v1.0 ; ns=73");
    EXPECT_EQ(response.headers.count("Ext"), 1U);
    EXPECT_EQ(response.headers.count("CIMError"), 0U);
    EXPECT_EQ(withExtension(refusal(400, "why", "header-mismatch"), "").headers.count("CIMError"), 1U);
}

TEST(HeaderAgreementTest, HeadersMustAgreeWithTheBody) {
    cimhost::cimxml::Message message;
    message.method = "GetClass";
    message.object = "root/cimv2";
    const auto agrees = [&](const std::string& method, const std::string& object) {
        return !checkAgreement({method, object}, message);
    };
    EXPECT_TRUE(agrees("GetClass", "root/cimv2"));
    EXPECT_TRUE(agrees("getclass", "ROOT/cimv2"));
    EXPECT_TRUE(agrees("GetClass", "/root/cimv2"));
    EXPECT_FALSE(agrees("GetInstance", "root/cimv2"));
    EXPECT_FALSE(agrees("GetClass", "root"));
    message.isIntrinsic = false;
    message.object = "root/cimv2:Base";
    EXPECT_TRUE(agrees("GetClass", "root/cimv2:Base.Name=\"a\""));
    EXPECT_FALSE(agrees("GetClass", "root/cimv2:Other"));
}

}  // namespace
