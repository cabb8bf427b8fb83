#include "server/RequestHandler.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "schema/MofReader.h"
#include "support/Files.h"

using namespace cimhost;
using namespace cimhost::server;

namespace {

/** Counts how often it is asked, and accepts one password. */
class FakeAuthenticator : public Authenticator {
public:
    bool accepts(const Credentials& credentials) override {
        ++asked;
        return credentials.password == "right";
    }
    int asked = 0;
};

/** Keeps the principal of the last request. */
class FakeManager : public UpCalls {
public:
    Response perform(Request request) override {
        principal = std::get<std::string>(request.context.at(0).value.single);
        return {};
    }
    std::string principal{};
};

class RequestHandlerTest : public testing::Test {
protected:
    RequestHandlerTest() {
        MofReader(schema).readSource("class Thing { [Key] string Name; };", "test class");
        registry.add({"Thing", "Test", "Test", true, false, {"root/test"}, "", "", ""});
        settings.access = {{"reader"}, {"writer"}};
        settings.limits.failureDelay = std::chrono::milliseconds(0);
        settings.limits.requestBytes = 2000;
    }

    RequestHandler& handler() {
        if (!started) {
            operations = std::make_unique<cimxml::Operations>(schema, registry, manager,
                                                              cimxml::OperationsOptions{"host", "1", {}});
            started = std::make_unique<RequestHandler>(settings, *operations, authenticator, log);
        }
        return *started;
    }

    static HttpRequest head(const std::string& operation, const std::string& authorization = "") {
        HttpRequest request{"POST",
                            {{"Host", "localhost"},
                             {"Content-Type", "text/xml"},
                             {"CIMOperation", "MethodCall"},
                             {"CIMMethod", operation},
                             {"CIMObject", "root/test"}}};
        if (!authorization.empty()) {
            request.headers.emplace("Authorization", "Basic " + authorization);
        }
        return request;
    }

    static std::string body(const std::string& operation, const std::string& parameter, const std::string& value) {
        return "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"1\" PROTOCOLVERSION=\"1.0\"><SIMPLEREQ>"
               "<IMETHODCALL NAME=\"" +
               operation +
               "\"><LOCALNAMESPACEPATH><NAMESPACE NAME=\"root\"/><NAMESPACE NAME=\"test\"/></LOCALNAMESPACEPATH>"
               "<IPARAMVALUE NAME=\"" +
               parameter + "\">" + value + "</IPARAMVALUE></IMETHODCALL></SIMPLEREQ></MESSAGE></CIM>";
    }

    /** The HTTP and the CIM status of a request. */
    std::string status(const HttpRequest& request, const std::string& content) {
        Exchange exchange;
        exchange.connection = &connection;
        exchange.rules = {false, settings.limits.requestBytes};
        if (const auto refused = handler().begin(exchange, request)) {
            return std::to_string(refused->status);
        }
        if (!handler().receive(exchange, content.data(), content.size())) {
            return "ended";
        }
        const Reply reply = handler().finish(exchange);
        const auto* text = std::get_if<std::shared_ptr<cimxml::ResponseText>>(&reply);
        return text == nullptr ? std::to_string(std::get<HttpResponse>(reply).status)
                               : "200/" + std::to_string((*text)->status());
    }

    std::string list(const std::string& authorization) {
        return status(head("EnumerateInstanceNames", authorization),
                      body("EnumerateInstanceNames", "ClassName", "<CLASSNAME NAME=\"Thing\"/>"));
    }

    std::string remove(const std::string& authorization) {
        return status(head("DeleteInstance", authorization),
                      body("DeleteInstance", "InstanceName",
                           "<INSTANCENAME CLASSNAME=\"Thing\"><KEYVALUE>a</KEYVALUE></INSTANCENAME>"));
    }

    const std::string reader = "cmVhZGVyOnJpZ2h0";        // reader:right
    const std::string writer = "d3JpdGVyOnJpZ2h0";        // writer:right
    const std::string wrong = "d3JpdGVyOndyb25n";         // writer:wrong
    const std::string stranger = "c3RyYW5nZXI6cmlnaHQ=";  // stranger:right

    testsupport::TempDirectory directory;
    Schema schema;
    ProviderRegistry registry;
    FakeManager manager;
    FakeAuthenticator authenticator;
    Settings settings;
    AccessLog log{directory.path() / "log"};
    Connection connection{-1, false};
    std::unique_ptr<cimxml::Operations> operations;
    std::unique_ptr<RequestHandler> started;
};

TEST_F(RequestHandlerTest, UsersNeedAPasswordAndARight) {
    EXPECT_EQ(list(""), "401");
    EXPECT_EQ(list(wrong), "401");
    EXPECT_EQ(list(stranger), "401");
    EXPECT_EQ(list(reader), "200/0");
    EXPECT_EQ(manager.principal, "reader");
    EXPECT_EQ(list(writer), "200/0");
    EXPECT_EQ(manager.principal, "writer");
}

TEST_F(RequestHandlerTest, ReadersCannotWrite) {
    EXPECT_EQ(remove(reader), "200/2");
    EXPECT_EQ(remove(writer), "200/0");
}

TEST_F(RequestHandlerTest, APasswordIsCheckedOncePerConnection) {
    list(reader);
    list(reader);
    EXPECT_EQ(authenticator.asked, 1);
    list(writer);
    list(reader);
    EXPECT_EQ(authenticator.asked, 3);
    list(wrong);
    list(wrong);
    EXPECT_EQ(authenticator.asked, 5);
}

TEST_F(RequestHandlerTest, ARefusalWaitsForTheBodyOfAClientThatDoesNotWait) {
    HttpRequest request = head("EnumerateInstanceNames");
    Exchange exchange;
    exchange.connection = &connection;
    request.headers.emplace("Content-Length", "100");
    EXPECT_FALSE(handler().begin(exchange, request));
    request.headers.emplace("Expect", "100-continue");
    EXPECT_TRUE(handler().begin(exchange, request));
}

TEST_F(RequestHandlerTest, BodiesThatAreTooLargeAreIgnoredUpToALimit) {
    EXPECT_EQ(status(head("EnumerateInstanceNames", reader), std::string(2001, ' ')), "413");
    EXPECT_EQ(status(head("EnumerateInstanceNames", reader), std::string(8001, ' ')), "ended");
}

TEST_F(RequestHandlerTest, RequestsWithoutASlotAreUnavailable) {
    settings.limits.requestsAtWork = 0;
    settings.limits.queueTime = std::chrono::seconds(0);
    EXPECT_EQ(list(reader), "503");
}

TEST_F(RequestHandlerTest, AServerThatStopsAcceptsNoRequests) {
    EXPECT_EQ(list(reader), "200/0");
    handler().stop();
    EXPECT_EQ(list(reader), "503");
}

}  // namespace
