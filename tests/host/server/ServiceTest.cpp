#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <csignal>
#include <thread>

#include "ServerFixture.h"
#include "TcpPair.h"
#include "server/Service.h"

using namespace cimhost;
using namespace cimhost::server;
using namespace std::chrono_literals;

namespace {

class ServiceTest : public test::ServerTest {
protected:
    ServiceTest() {
        settings.listeners.push_back({"127.0.0.1", 0, false, -1});
        settings.authenticates = false;
        settings.limits.connections = 10;
    }

    /** Serves one operation that does not end, and receives SIGTERM during it. */
    void stopDuringAnOperation() {
        blockSignals();
        manager.answerWith([](const Request&) -> Response {
            ::kill(::getpid(), SIGTERM);
            for (;;) {
                ::pause();
            }
        });
        handler();
        serve(settings, *operations, authenticator, [](const std::string& listening) {
            const auto port = static_cast<std::uint16_t>(std::stoi(listening.substr(listening.rfind(':') + 1)));
            std::thread([port] {
                std::string request = "POST / HTTP/1.1\r\n";
                for (const auto& [name, value] : head("EnumerateInstances").headers) {
                    request += name + ": " + value + "\r\n";
                }
                const std::string content = body("EnumerateInstances", "ClassName", "<CLASSNAME NAME=\"Thing\"/>");
                const test::Socket client = test::connectTo(port);
                client.send(request + "Content-Length: " + std::to_string(content.size()) + "\r\n\r\n" + content);
                client.receive();
            }).detach();
        });
    }
};

using ServiceDeathTest = ServiceTest;

TEST_F(ServiceDeathTest, AnOperationThatOutlastsTheTimeToStopEndsWithTheProcess) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    settings.limits.stopTime = 3s;
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EXIT(stopDuringAnOperation(), testing::ExitedWithCode(EXIT_FAILURE), "operations still run after 3 seconds");
    const auto duration = std::chrono::steady_clock::now() - start;
    EXPECT_GE(duration, settings.limits.stopTime);
    EXPECT_LT(duration, Limits{}.stopTime);
}

}  // namespace
