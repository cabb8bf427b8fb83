#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <future>
#include <thread>

#include "ServerFixture.h"
#include "TcpPair.h"
#include "server/RequestHandler.h"

using namespace cimhost;
using namespace cimhost::server;

namespace {

class RequestHandlerTest : public cimhost::server::test::ServerTest {
protected:
    /** The HTTP and the CIM status of a request. */
    std::string status(const HttpRequest& request, const std::string& content) {
        Exchange exchange;
        exchange.connection = &connection;
        return status(exchange, request, content);
    }

    std::string status(Exchange& exchange, const HttpRequest& request, const std::string& content) {
        exchange.rules = {false, settings.limits.requestBytes};
        if (const auto refused = handler().begin(exchange, request)) {
            return std::to_string(refused->status);
        }
        if (!handler().receive(exchange, content.data(), content.size())) {
            return "ended";
        }
        const Reply reply = handler().finish(exchange);
        const auto* performed = std::get_if<CimReply>(&reply);
        return performed == nullptr ? std::to_string(std::get<HttpResponse>(reply).status)
                                    : "200/" + std::to_string(performed->text->status());
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

    Connection connection{-1, false};
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

TEST_F(RequestHandlerTest, APasswordIsCheckedWithTheAddressOfTheClient) {
    for (const auto& [client, host] :
         {std::pair{"192.0.2.7:40312", "192.0.2.7"}, {"[2001:db8::7]:80", "2001:db8::7"}}) {
        Connection remote{-1, true, {client, ""}};
        Exchange exchange;
        exchange.connection = &remote;
        EXPECT_EQ(status(exchange, head("GetClass", reader), ""), "400");
        EXPECT_EQ(authenticator.client, host);
    }
}

TEST_F(RequestHandlerTest, TheDelayAfterAWrongPasswordIncludesTheTimeOfTheCheck) {
    settings.limits.failureDelay = std::chrono::hours(1);
    Exchange exchange;
    exchange.connection = &connection;
    exchange.rules = {false, settings.limits.requestBytes};
    exchange.start -= settings.limits.failureDelay;
    const auto refused = handler().begin(exchange, head("EnumerateInstanceNames", wrong));
    ASSERT_TRUE(refused);
    EXPECT_EQ(refused->status, 401U);
}

TEST_F(RequestHandlerTest, AWrongPasswordIsAnsweredAfterTheDelay) {
    settings.limits.failureDelay = std::chrono::milliseconds(200);
    Exchange exchange;
    exchange.connection = &connection;
    exchange.rules = {false, settings.limits.requestBytes};
    const auto refused = handler().begin(exchange, head("EnumerateInstanceNames", wrong));
    EXPECT_GE(std::chrono::steady_clock::now(), exchange.start + settings.limits.failureDelay);
    ASSERT_TRUE(refused);
    EXPECT_EQ(refused->status, 401U);
}

TEST_F(RequestHandlerTest, ThePasswordOfAnEndedConnectionIsNotChecked) {
    const test::TcpPair sockets;
    ConnectionTable table(settings.limits);
    Connection* ended = table.add(sockets.server.get(), false);
    table.endAll();
    Exchange exchange;
    exchange.connection = ended;
    exchange.rules = {false, settings.limits.requestBytes};
    const auto refused = handler().begin(exchange, head("EnumerateInstanceNames", reader));
    ASSERT_TRUE(refused);
    EXPECT_EQ(refused->status, 503U);
    EXPECT_EQ(authenticator.asked, 0);
}

TEST_F(RequestHandlerTest, ARefusalDoesNotWaitForTheBody) {
    for (const auto& [name, value, isIgnored] : {std::tuple{"Content-Length", "100", true},
                                                 {"Content-Length", "0", false},
                                                 {"Transfer-Encoding", "chunked", true},
                                                 {"Accept", "*/*", false}}) {
        HttpRequest request = head("EnumerateInstanceNames");
        Exchange exchange;
        exchange.connection = &connection;
        exchange.rules.largestBody = 1000;
        request.headers.emplace(name, value);
        const auto refused = handler().begin(exchange, request);
        ASSERT_TRUE(refused);
        EXPECT_EQ(refused->status, 401U);
        EXPECT_EQ(exchange.isBodyIgnored, isIgnored) << name << value;
    }
}

TEST_F(RequestHandlerTest, RequestsThatEndBeforeTheirResponseAreLogged) {
    Exchange exchange;
    exchange.connection = &connection;
    handler().begin(exchange, head("EnumerateInstanceNames", reader));
    handler().logIncomplete(exchange);
    handler().logIncomplete(connection);
    EXPECT_THAT(testsupport::readFile(directory.path() / "log"),
                testing::ContainsRegex(" reader EnumerateInstanceNames - 400/0 0 .*\n.* - - - 400/0 0 0.000\n$"));
}

TEST_F(RequestHandlerTest, RefusedRequestsAreLoggedWithTheirOperation) {
    for (const auto& [method, header, operation] : {std::tuple{"POST", "Origin", "GetClass"},
                                                    {"GET", "Accept", "GetClass"},
                                                    {"POST", "Expect", "Get%43lass"},
                                                    {"POST", "CIMMethod", "GetClass"},
                                                    {"POST", "Expect", "%4"}}) {
        Exchange exchange;
        exchange.connection = &connection;
        HttpRequest request = head(operation);
        request.method = method;
        request.headers.emplace(header, "other");
        const auto refused = handler().begin(exchange, request);
        ASSERT_TRUE(refused);
        handler().log(exchange, refused->status);
    }
    EXPECT_THAT(testsupport::readFile(directory.path() / "log"),
                testing::ContainsRegex("- GetClass - 403/0 .*\n.*- GetClass - 405/0 .*\n.*- GetClass - 417/0 .*\n"
                                       ".*- - - 400/0 .*\n.*- - - 417/0 "));
}

TEST_F(RequestHandlerTest, BodiesThatAreTooLargeAreIgnoredUpToALimit) {
    EXPECT_EQ(status(head("EnumerateInstanceNames", reader), std::string(2000, ' ')), "400");
    EXPECT_EQ(status(head("EnumerateInstanceNames", reader), std::string(2001, ' ')), "413");
    EXPECT_EQ(status(head("EnumerateInstanceNames", reader), std::string(8001, ' ')), "ended");
}

TEST_F(RequestHandlerTest, RunningListsAndOtherRequestsAreLimited) {
    settings.limits.runningLists = 1;
    settings.limits.queueTime = std::chrono::seconds(0);
    std::vector<std::string> during;
    manager.answerWith([&](const Request& request) {
        const bool isList = request.operation == Operation::enumerateInstanceNames;
        during.push_back(isList ? list(reader) : remove(writer));
        during.push_back(isList ? remove(writer) : list(reader));
        return Response{};
    });
    EXPECT_EQ(list(reader), "200/0");
    EXPECT_THAT(during, testing::ElementsAre("503", "503", "503", "200/0"));
}

TEST_F(RequestHandlerTest, PasswordsAndRequestsWaitForOthersBeforeTheyAreRefused) {
    settings.limits.runningLists = 1;
    settings.limits.queueTime = std::chrono::seconds(1);
    const auto waitInVain = [&] {
        const auto start = std::chrono::steady_clock::now();
        EXPECT_EQ(list(reader), "503");
        EXPECT_GE(std::chrono::steady_clock::now() - start, settings.limits.queueTime);
    };
    authenticator.beforeAnswer = waitInVain;
    manager.answerWith([&](const Request&) {
        waitInVain();
        return Response{};
    });
    EXPECT_EQ(list(reader), "200/0");
    EXPECT_EQ(authenticator.asked, 1);
}

TEST_F(RequestHandlerTest, ShortRequestsDoNotWaitForListsThatOthersReceive) {
    settings.limits.responseResults = 1;
    settings.limits.queueTime = std::chrono::seconds(10);
    const Instance large{{"", "root/test", "Thing", {{"Name", Value::of(std::string(100'000, 'a'))}}}, {}};
    manager.answerWith([&](const Request&) { return Response::ofInstances({large}); });
    const auto listFor = [&](Exchange& exchange) {
        return status(exchange, head("EnumerateInstances", reader),
                      body("EnumerateInstances", "ClassName", "<CLASSNAME NAME=\"Thing\"/>"));
    };
    Exchange slow;
    slow.connection = &connection;
    EXPECT_EQ(listFor(slow), "200/0");
    Connection other{-1, false};
    std::future<std::string> waiting = std::async(std::launch::async, [&] {
        Exchange exchange;
        exchange.connection = &other;
        return listFor(exchange);
    });
    while (!handler().isShortOfResults()) {
        std::this_thread::yield();
    }
    EXPECT_EQ(remove(writer), "200/0");
    EXPECT_EQ(waiting.wait_for(std::chrono::seconds(0)), std::future_status::timeout);
    slow.unfinished.resize(0);
    EXPECT_EQ(waiting.get(), "200/0");
}

TEST_F(RequestHandlerTest, AsManyListsAsConfiguredRunAtTheSameTime) {
    settings.limits.runningLists = 2;
    settings.limits.queueTime = std::chrono::seconds(0);
    std::vector<std::string> inner;
    manager.answerWith([&, depth = std::make_shared<int>(0)](const Request&) {
        if (++*depth < 4) {
            inner.push_back(list(reader));
        }
        return Response{};
    });
    EXPECT_EQ(list(reader), "200/0");
    EXPECT_THAT(inner, testing::ElementsAre("503", "200/0"));
}

TEST_F(RequestHandlerTest, DocumentsAreLimitedInDepthAndNumberOfElements) {
    settings.limits.xmlDepth = 6;  // as the request
    settings.limits.xmlElements = 9;
    EXPECT_EQ(list(reader), "200/0");
    settings.limits.xmlElements = 8;
    EXPECT_EQ(list(reader), "400");
    settings.limits.xmlElements = 9;
    settings.limits.xmlDepth = 5;
    EXPECT_EQ(list(reader), "400");
}

TEST_F(RequestHandlerTest, AServerThatStopsAcceptsNoRequests) {
    EXPECT_EQ(list(reader), "200/0");
    handler().stop();
    EXPECT_EQ(list(reader), "503");
}

}  // namespace
