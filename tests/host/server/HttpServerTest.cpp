#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <future>
#include <list>
#include <map>

#include "ServerFixture.h"
#include "TcpPair.h"
#include "server/HttpServer.h"

using namespace cimhost;
using namespace cimhost::server;
using namespace std::chrono_literals;
using cimhost::server::test::connectTo;
using cimhost::server::test::Socket;
using testing::HasSubstr;
using testing::StartsWith;

namespace {

class HttpServerTest : public test::ServerTest {
protected:
    HttpServerTest() {
        settings.listeners.push_back({"127.0.0.1", 0, false, -1});
        settings.limits.connections = 10;
        settings.limits.connectionsPerAddress = 10;
        settings.limits.failureDelay = 1h;  // for as long as a test takes
    }

    HttpServer& server() {
        if (!running) {
            running = std::make_unique<HttpServer>(settings, handler(), nullptr);
        }
        return *running;
    }

    Socket connect() { return connectTo(server().listeners().front().port); }

    /** A request with a header Content-Length, and the complete body or none. */
    static std::string requestOf(const std::string& credentials, bool hasBody = true,
                                 const std::string& operation = "EnumerateInstances") {
        const std::string content = body(operation, "ClassName", "<CLASSNAME NAME=\"Thing\"/>");
        std::string text = "POST /cimom HTTP/1.1\r\n";
        for (const auto& [name, value] : head(operation, credentials).headers) {
            text += name + ": " + value + "\r\n";
        }
        return text + "Content-Length: " + std::to_string(content.size()) + "\r\n\r\n" + (hasBody ? content : "");
    }

    /** The response to a client with a right password, on an open connection. */
    std::string served(const Socket& client) const {
        client.send(requestOf(reader));
        return client.receiveUntil("</CIM>\n");
    }

    /** A response that is larger than the buffers of both sockets. */
    static Response largeResponse() {
        Instance instance{{"", "root/test", "Thing", {{"Name", Value::of(std::string(20'000, 'a'))}}}, {}};
        return Response::ofInstances(std::vector<Instance>(2'000, instance));
    }

    /** A client that has received only the beginning of a large response. */
    Socket slowReader() {
        Socket client = connect();
        client.send(requestOf(reader));
        EXPECT_THAT(client.receiveUntil("\r\n\r\n"), StartsWith("HTTP/1.1 200 "));
        return client;
    }

    /** Whether an operation of another client is in progress while the test has this object. */
    class OtherOperation {
    public:
        explicit OtherOperation(HttpServerTest& test) : client(test.connect()) {
            test.manager.answerWith([this, isFinished = finished.get_future().share()](const Request&) {
                begun.set_value();
                isFinished.wait();
                return Response{};
            });
            client.send(requestOf(test.reader));
            begun.get_future().wait();
            test.manager.answerWith([](const Request&) { return Response{}; });
        }

        /** Its response. */
        std::string finish() {
            finished.set_value();
            return client.receiveUntil("</CIM>\n");
        }

    private:
        std::promise<void> begun;
        std::promise<void> finished;
        Socket client;
    };

    std::string log() const { return testsupport::readFile(directory.path() / "log"); }

    std::unique_ptr<HttpServer> running;
};

TEST_F(HttpServerTest, AFloodOfHalfRequestsLeavesOthersServed) {
    const Socket connected = connect();
    EXPECT_THAT(served(connected), StartsWith("HTTP/1.1 200 "));
    std::list<Socket> flood;
    for (int i = 0; i < 300; ++i) {
        flood.push_back(connect());
        flood.back().send(i % 2 == 0 ? "POST / HT" : requestOf("", false));
        if (i % 50 == 0) {
            EXPECT_THAT(served(connect()), StartsWith("HTTP/1.1 200 "));
            EXPECT_THAT(served(connected), StartsWith("HTTP/1.1 200 "));
        }
    }
}

TEST_F(HttpServerTest, AFloodOfBodiesThatDoNotArriveLeavesOthersServed) {
    settings.authenticates = false;
    const Socket connected = connect();
    EXPECT_THAT(served(connected), StartsWith("HTTP/1.1 200 "));
    std::list<Socket> flood;
    for (int i = 0; i < 300; ++i) {
        flood.push_back(connect());
        flood.back().send(requestOf("", false));
        if (i % 50 == 0) {
            EXPECT_THAT(served(connect()), StartsWith("HTTP/1.1 200 "));
            EXPECT_THAT(served(connected), StartsWith("HTTP/1.1 200 "));
        }
    }
}

TEST_F(HttpServerTest, AFloodOfWrongPasswordsLeavesOthersServed) {
    const Socket connected = connect();
    EXPECT_THAT(served(connected), StartsWith("HTTP/1.1 200 "));
    std::list<Socket> flood;
    for (int i = 0; i < 300; ++i) {
        flood.push_back(connect());
        flood.back().send(requestOf(wrong));
        if (i % 50 == 0) {
            EXPECT_THAT(served(connect()), StartsWith("HTTP/1.1 200 "));
            EXPECT_THAT(served(connected), StartsWith("HTTP/1.1 200 "));
        }
    }
}

TEST_F(HttpServerTest, AFloodOfSlowReadersLeavesOthersServed) {
    manager.answerWith([](const Request&) { return largeResponse(); });
    std::list<Socket> flood;
    for (std::size_t i = 0; i < settings.limits.connections; ++i) {
        flood.push_back(slowReader());
    }
    manager.answerWith([](const Request&) { return Response{}; });
    const auto end = std::chrono::steady_clock::now() + 60s;
    std::string response;
    const auto isServed = [&] { return response.rfind("HTTP/1.1 200 ", 0) == 0; };
    while (!isServed() && std::chrono::steady_clock::now() < end) {  // until a slow reader makes no progress
        response = served(connect());
    }
    EXPECT_TRUE(isServed()) << response;
}

TEST_F(HttpServerTest, ALongResponseWaitsForSlowReadersUntilTheyAreEnded) {
    settings.limits.responseResults = 2'000;
    settings.limits.queueTime = 1h;
    manager.answerWith([](const Request&) { return largeResponse(); });
    const Socket slow = slowReader();
    const Socket other = slowReader();  // its response begins after the other has ended
    slow.receive();
}

TEST_F(HttpServerTest, ResultsThatClientsHaveNotReceivedAreLimited) {
    settings.limits.responseResults = 2'000;
    settings.limits.queueTime = 0s;
    manager.answerWith([](const Request&) { return largeResponse(); });
    const Socket slow = slowReader();
    const Socket refused = connect();
    refused.send(requestOf(reader));
    EXPECT_THAT(refused.receiveUntil("have not received their results yet.\n"),
                testing::AllOf(StartsWith("HTTP/1.1 503 "), HasSubstr("Retry-After: 5\r\n")));
    manager.answerWith([](const Request&) { return Response{}; });
    refused.send(requestOf(reader, true, "GetClass"));
    EXPECT_THAT(refused.receiveUntil("</CIM>\n"), StartsWith("HTTP/1.1 200 "));
}

TEST_F(HttpServerTest, AMissingPasswordIsRefusedBeforeTheBodyArrives) {
    const Socket client = connect();
    client.send(requestOf("", false));
    EXPECT_THAT(client.receiveUntil("\r\n\r\n"),
                testing::AllOf(StartsWith("HTTP/1.1 401 "), HasSubstr("WWW-Authenticate: Basic "),
                               HasSubstr("Connection: close")));
}

TEST_F(HttpServerTest, ARefusalReachesAClientThatSendsItsBodyFirst) {
    settings.limits.requestBytes = std::size_t{1} << 20U;
    for (int i = 0; i < 20; ++i) {
        const Socket client = connect();
        std::string request = requestOf("", false);
        request.replace(request.find("Content-Length: ") + 16, 0, "1000");  // one million and more
        client.send(request);
        client.send(std::string(1'000'000, ' '));
        EXPECT_THAT(client.receiveUntil("\r\n\r\n"), StartsWith("HTTP/1.1 4"));
    }
}

TEST_F(HttpServerTest, ARequestWhoseEndIsAmbiguousIsRefusedAndEndsTheConnection) {
    const std::string request = requestOf(reader);
    const std::size_t size = request.size() - request.find("\r\n\r\n") - 4;
    const std::string length = std::to_string(size);
    std::map<std::string, Socket> clients;
    settings.limits.connections = settings.limits.connectionsPerAddress = 20;
    for (const std::string& headers : std::vector<std::string>{
             "Content-Length: " + length + "\r\nContent-Length: " + length,
             "Content-Length: " + length + "\r\nContent-Length: 0",
             "Content-Length: " + length + ", " + length,
             "Content-Length: +" + length,
             "Content-Length: 0x10",
             "Content-Length:",
             "Content-Length:\r\n " + length,
             "Content-Length : " + length,
             "Content-Length: " + length + "\r\nTransfer-Encoding: chunked",
             "Content-Length: " + length + "\r\nTransfer-Encoding : chunked",
             "Content-Length: " + length + "\r\nHost: localhost",
             "Transfer-Encoding: chunked\r\nTransfer-Encoding: identity",
             "Transfer-Encoding: gzip, chunked",
             "Transfer-Encoding: xchunked",
         }) {
        std::string ambiguous = request;
        const std::size_t at = ambiguous.find("Content-Length");
        ambiguous.replace(at, ambiguous.find("\r\n", at) - at, headers);
        const Socket& client = clients.emplace(headers, connect()).first->second;
        client.send(ambiguous);
        client.send(request);
    }
    for (const auto& [headers, client] : clients) {
        const std::string received = client.receive();
        EXPECT_THAT(received, StartsWith("HTTP/1.1 400 ")) << headers;
        EXPECT_THAT(received, testing::Not(HasSubstr("HTTP/1.1 2"))) << headers;
    }
}

TEST_F(HttpServerTest, HeadsThatAreTooLongAreRefusedAndLogged) {
    const std::string tooLong(100'000, 'a');
    for (const auto& [head, status] : {std::pair<std::string, std::string>{"POST /" + tooLong + " HTTP/1.1\r\n", "414"},
                                       {"POST / HTTP/1.1\r\nX: " + tooLong + "\r\n", "431"}}) {
        const Socket client = connect();
        client.send(head + "Host: localhost\r\n\r\n");
        EXPECT_THAT(client.receive(), StartsWith("HTTP/1.1 " + status));
    }
    running.reset();
    EXPECT_THAT(log(), testing::MatchesRegex("([^\n]* - - - 400/0 0 0.000\n){2}"));
}

TEST_F(HttpServerTest, IdleConnectionsEnd) {
    settings.limits.idleTime = 1s;
    const Socket client = connect();
    EXPECT_THAT(served(client), StartsWith("HTTP/1.1 200 "));
    EXPECT_EQ(client.receive(), "");
}

TEST_F(HttpServerTest, ARequestThatWaitsTooLongForOthersIsRefused) {
    settings.limits.runningLists = 1;
    settings.limits.queueTime = 0s;
    OtherOperation other(*this);
    const Socket client = connect();
    client.send(requestOf(reader));
    EXPECT_THAT(client.receiveUntil("too many requests"),
                testing::AllOf(StartsWith("HTTP/1.1 503 "), HasSubstr("Retry-After: 5\r\n")));
    EXPECT_THAT(other.finish(), StartsWith("HTTP/1.1 200 "));
    EXPECT_THAT(served(connect()), StartsWith("HTTP/1.1 200 "));
}

TEST_F(HttpServerTest, APasswordThatWaitsTooLongForOthersIsNotChecked) {
    settings.limits.queueTime = 0s;
    std::promise<void> begun;
    std::promise<void> finished;
    authenticator.beforeAnswer = [&, isFinished = finished.get_future().share()] {
        begun.set_value();
        isFinished.wait();
    };
    const Socket first = connect();
    first.send(requestOf(reader));
    begun.get_future().wait();
    const Socket second = connect();
    second.send(requestOf(writer));
    EXPECT_THAT(second.receiveUntil("too many passwords to check.\n"),
                testing::AllOf(StartsWith("HTTP/1.1 503 "), HasSubstr("Retry-After: 5\r\n")));
    EXPECT_EQ(authenticator.asked, 1);
    finished.set_value();
    EXPECT_THAT(first.receiveUntil("</CIM>\n"), StartsWith("HTTP/1.1 200 "));
}

TEST_F(HttpServerTest, ARequestWaitsForRunningOnes) {
    settings.limits.runningLists = 1;
    settings.limits.queueTime = 1h;
    OtherOperation other(*this);
    const Socket client = connect();
    client.send(requestOf(reader));
    EXPECT_TRUE(client.isSilent());
    EXPECT_THAT(other.finish(), StartsWith("HTTP/1.1 200 "));
    EXPECT_THAT(client.receiveUntil("</CIM>\n"), StartsWith("HTTP/1.1 200 "));
}

TEST_F(HttpServerTest, TheNumberOfOpenEnumerationsIsLimited) {
    settings.limits.enumerations.open = 2;
    manager.answerWith([](const Request&) {
        return Response::ofInstances({{{"", "root/test", "Thing", {{"Name", Value::of(std::string("a"))}}}, {}}});
    });
    const Socket client = connect();
    const auto open = [&](const std::string& credentials) {
        client.send(requestOf(credentials, true, "OpenEnumerateInstances"));
        return client.receiveUntil("</CIM>\n");
    };
    EXPECT_THAT(open(reader), HasSubstr("EnumerationContext"));
    EXPECT_THAT(open(writer), HasSubstr("EnumerationContext"));
    EXPECT_THAT(open(reader), testing::AllOf(StartsWith("HTTP/1.1 200 "), HasSubstr("<ERROR CODE=\"27\" ")));
}

TEST_F(HttpServerTest, IncompleteRequestsAreLogged) {
    settings.limits.bodyTime = 1s;
    const Socket slow = connect();
    slow.send(requestOf(reader, false));
    EXPECT_THAT(slow.receive(), StartsWith("HTTP/1.1 408 "));
    const Socket wrongHead = connect();
    wrongHead.send("NONSENSE\r\n\r\n");
    wrongHead.receive();
    const Socket longHead = connect();
    longHead.send("POST / HTTP/1.1\r\nX: " + std::string(100'000, 'a') + "\r\n\r\n");
    longHead.receive();
    const Socket closed = connect();
    EXPECT_THAT(served(closed), StartsWith("HTTP/1.1 200 "));
    running.reset();
    EXPECT_THAT(log(), HasSubstr(" reader EnumerateInstances - 408/0 0 "));
    EXPECT_THAT(log(), testing::ContainsRegex("( - - - 4../0 0 .*\n.*){2}"));
    const std::string lines = log();
    EXPECT_EQ(std::count(lines.begin(), lines.end(), '\n'), 4) << lines;
}

TEST_F(HttpServerTest, StopEndsSlowReadersAfterTheTimeLimit) {
    manager.answerWith([](const Request&) { return largeResponse(); });
    const Socket reading = slowReader();
    EXPECT_TRUE(server().drain(0s));
    reading.receive();  // the bytes that the server sent before it ended the connection
}

TEST_F(HttpServerTest, StopWaitsForOperationsAndReportsThoseThatStillRun) {
    std::promise<void> begun;
    std::promise<void> finish;
    manager.answerWith([&, isFinished = finish.get_future().share()](const Request&) {
        begun.set_value();
        isFinished.wait();
        return Response{};
    });
    const Socket client = connect();
    client.send(requestOf(reader));
    begun.get_future().wait();
    EXPECT_FALSE(server().drain(0s));
    finish.set_value();
    EXPECT_TRUE(server().drain(1h));
}

TEST_F(HttpServerTest, AServerThatStopsRefusesConnections) {
    const std::uint16_t port = server().listeners().front().port;
    EXPECT_TRUE(server().drain(0s));
    Socket client(::socket(AF_INET, SOCK_STREAM, 0));
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_port = htons(port);
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    EXPECT_NE(::connect(client.get(), reinterpret_cast<const sockaddr*>(&address), sizeof address), 0);
}

TEST_F(HttpServerTest, AWrongPasswordIsAnsweredAfterTheDelay) {
    settings.limits.failureDelay = 50ms;
    const Socket client = connect();
    const auto start = std::chrono::steady_clock::now();
    client.send(requestOf(wrong));
    EXPECT_THAT(client.receiveUntil("\r\n\r\n"), StartsWith("HTTP/1.1 401 "));
    EXPECT_GE(std::chrono::steady_clock::now() - start, settings.limits.failureDelay);
}

TEST_F(HttpServerTest, ResultsOfOpenEnumerationsAreLimited) {
    settings.limits.enumerations.results = 3;
    manager.answerWith([](const Request&) {
        const Instance instance{{"", "root/test", "Thing", {{"Name", Value::of(std::string("a"))}}}, {}};
        return Response::ofInstances({instance, instance});
    });
    const Socket client = connect();
    const auto open = [&] {
        client.send(requestOf(reader, true, "OpenEnumerateInstances"));
        return client.receiveUntil("</CIM>\n");
    };
    EXPECT_THAT(open(), HasSubstr("EnumerationContext"));
    EXPECT_THAT(open(), testing::AllOf(StartsWith("HTTP/1.1 200 "), HasSubstr("<ERROR CODE=\"27\" ")));
    EXPECT_THAT(served(client), testing::AllOf(StartsWith("HTTP/1.1 200 "), testing::Not(HasSubstr("<ERROR "))));
}

TEST_F(HttpServerTest, LongResponsesAreSentUpToTheLimitOfTheirResults) {
    settings.limits.responseResults = 4'000;
    settings.limits.queueTime = 0s;
    manager.answerWith([](const Request&) { return largeResponse(); });
    const Socket first = slowReader();
    const Socket second = slowReader();
    const Socket refused = connect();
    refused.send(requestOf(reader));
    EXPECT_THAT(refused.receiveUntil("\r\n\r\n"), StartsWith("HTTP/1.1 503 "));
}

TEST_F(HttpServerTest, AConnectionThatIsClosedWithoutARequestIsNotLogged) {
    for (int i = 0; i < 20; ++i) {
        connect().close();
        const Socket aborted = connect();
        const linger abort{1, 0};
        EXPECT_EQ(::setsockopt(aborted.get(), SOL_SOCKET, SO_LINGER, &abort, sizeof abort), 0);
    }
    const Socket halfClosed = connect();
    EXPECT_EQ(::shutdown(halfClosed.get(), SHUT_WR), 0);
    EXPECT_EQ(halfClosed.receive(), "");
    EXPECT_THAT(served(connect()), StartsWith("HTTP/1.1 200 "));
    running.reset();
    EXPECT_THAT(log(), testing::MatchesRegex("[^\n]* reader EnumerateInstances Thing 200/0 [^\n]*\n"));
}

TEST_F(HttpServerTest, ARefusedRequestWhoseBodyStillArrivesIsLoggedOnce) {
    constexpr int count = 40;
    settings.authenticates = false;
    for (int i = 0; i < count; ++i) {
        std::string request = requestOf("", false);
        const std::size_t length = request.find("Content-Length");
        request.replace(length, request.find("\r\n", length) - length,
                        i % 2 == 0 ? "Content-Length: 1000000000" : "Transfer-Encoding: chunked");
        const Socket client = connect();
        client.send(request + "3B9ACA00\r\n");
        const std::string part(100, ' ');
        while (::send(client.get(), part.data(), part.size(), MSG_NOSIGNAL) > 0) {
        }
    }
    running.reset();
    const std::string lines = log();
    EXPECT_EQ(std::count(lines.begin(), lines.end(), '\n'), count) << lines;
    EXPECT_THAT(lines, testing::Not(HasSubstr(" 400/0 ")));
}

}  // namespace
