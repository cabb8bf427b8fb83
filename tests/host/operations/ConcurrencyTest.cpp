#include <atomic>
#include <thread>

#include "OperationsFixture.h"
#include "lab/emulation/ManagerEmulation.h"

// Concurrent clients, under each manager: providers are started, call each other, fail and throw, and every client
// receives the responses to its own requests.

namespace {

using cimhost::Request;
using cimhost::lab::Manager;
using testsupport::stringOf;

constexpr int clients = 8;
constexpr int rounds = 25;

class ConcurrencyTest : public OperationsTest, public testing::WithParamInterface<Manager> {
protected:
    ConcurrencyTest() { options.behaviour = cimhost::lab::emulationOf(GetParam()); }

    void TearDown() override { started.reset(); }  // while there is something to log to

    /** The manager, with a thread-safe log. */
    cimhost::ObjectManager& shared() {
        if (!started) {
            options.libraries.searchPath = {TEST_PROVIDERS};
            options.log = [this](const cimhost::LogRecord&) { ++logged; };
            started = std::make_unique<cimhost::ObjectManager>(options, registry);
        }
        return *started;
    }

    void runClient(int number) {
        const int depth = number % 4 + 1;
        const auto nested =
            manager().perform(Request::getInstance(named("Sample_Recursive", std::to_string(depth).c_str())));
        const std::string expected = std::to_string(depth) + ">Below=" + std::to_string(depth - 1);
        EXPECT_EQ(stringOf(nested.instance().properties, "Below").value_or("").substr(0, expected.size()), expected);
        const auto other = manager().perform(Request::enumerateInstances(classPath("Sample_CallsOther_Thing")));
        ASSERT_EQ(other.instances.size(), 1U) << other.status.message;
        EXPECT_EQ(other.instance().path.className, "Other_Thing");
        EXPECT_EQ(manager().perform(Request::enumerateInstances(classPath("Sample_Failing"))).status.message,
                  "not for you");
        EXPECT_EQ(manager().perform(Request::enumerateInstances(classPath("Sample_Throwing"))).status.rc,
                  CMPI_RC_ERR_FAILED);
        const std::string role = "role " + std::to_string(number);
        const auto target =
            manager().perform(Request::associators(named("Sample_Thing", "x"), {"Sample_Link", {}, role, {}}));
        ASSERT_EQ(target.instances.size(), 1U) << target.status.message;
        EXPECT_EQ(stringOf(target.instance().properties, "Asked"), "Sample_Link,none," + role + ",none");
    }

    std::atomic<int> logged{0};
};

TEST_P(ConcurrencyTest, EachClientReceivesItsOwnResponses) {
    shared();
    std::vector<std::thread> threads;
    for (int client = 0; client < clients; ++client) {
        threads.emplace_back([this, client] {
            for (int round = 0; round < rounds; ++round) {
                runClient(client);
            }
        });
    }
    for (std::thread& each : threads) {
        each.join();
    }
    EXPECT_GT(logged, 0) << "factories log";
}

INSTANTIATE_TEST_SUITE_P(Managers, ConcurrencyTest, testing::ValuesIn(cimhost::lab::everyManager),
                         cimhost::lab::ManagerName());

}  // namespace
