#pragma once

#include <gtest/gtest.h>

#include <atomic>
#include <functional>
#include <memory>
#include <mutex>
#include <string>

#include "schema/MofReader.h"
#include "server/RequestHandler.h"
#include "support/TemporaryDirectory.h"

namespace cimhost::server::test {

/** Accepts one password, counts the checks, and records the client's address. */
class FakeAuthenticator : public Authenticator {
public:
    bool accepts(const Credentials& credentials, const std::string& host) override {
        ++asked;
        client = host;
        beforeAnswer();
        return credentials.password == "right";
    }
    std::atomic<int> asked = 0;
    std::string client{};
    std::function<void()> beforeAnswer = [] {};
};

/** Records the principal of the last request, and calls a function for the response. */
class FakeManager : public UpCalls {
public:
    using Answer = std::function<Response(const Request&)>;

    Response perform(Request request) override {
        Answer current;
        {
            const std::lock_guard<std::mutex> lock(mutex);
            principal =
                request.context.empty() ? std::string{} : std::get<std::string>(request.context.front().value.single);
            current = answer;
        }
        return current(request);
    }

    void answerWith(Answer next) {
        const std::lock_guard<std::mutex> lock(mutex);
        answer = std::move(next);
    }

    std::string principal{};

private:
    std::mutex mutex;
    Answer answer = [](const Request&) { return Response{}; };
};

/** A request handler over a fake manager that serves class Thing in root/test. */
class ServerTest : public testing::Test {
protected:
    ServerTest() {
        MofReader(schema).readSource("class Thing { [Key] string Name; };", "test class");
        registry.add({"Thing", "Test", "Test", true, false, {"root/test"}, "", "", ""});
        settings.access = {{"reader"}, {"writer"}};
        settings.limits.failureDelay = std::chrono::milliseconds(0);
        settings.limits.requestBytes = 2000;
    }

    RequestHandler& handler() {
        if (!started) {
            operations = std::make_unique<cimxml::Operations>(
                schema, registry, manager, cimxml::OperationsOptions{"host", "1", settings.limits.enumerations});
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

    const std::string reader = "cmVhZGVyOnJpZ2h0";        // reader:right
    const std::string writer = "d3JpdGVyOnJpZ2h0";        // writer:right
    const std::string wrong = "d3JpdGVyOndyb25n";         // writer:wrong
    const std::string stranger = "c3RyYW5nZXI6cmlnaHQ=";  // stranger:right

    testsupport::TemporaryDirectory directory;
    Schema schema;
    ProviderRegistry registry;
    FakeManager manager;
    FakeAuthenticator authenticator;
    Settings settings;
    AccessLog log{directory.path() / "log"};
    std::unique_ptr<cimxml::Operations> operations;
    std::unique_ptr<RequestHandler> started;
};

}  // namespace cimhost::server::test
