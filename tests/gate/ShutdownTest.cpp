#include <condition_variable>
#include <cstdlib>
#include <functional>
#include <mutex>
#include <optional>
#include <thread>

#include "GateFixture.h"
#include "broker/RequestScope.h"
#include "support/UnderTest.h"

// Shutdown of the object manager and the process, and destruction of the broker.

namespace gatetest {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Not;

/** A broker whose newInstance and enumerateInstances block, so that a test can act while a request is in progress. */
class WaitingBroker {
public:
    explicit WaitingBroker(const CMPIBroker& real) : services(*real.bft), factories(*real.eft), broker(real) {
        original = real;
        services.enumerateInstances = &enumerateInstances;
        factories.newInstance = &newInstance;
        broker.bft = &services;
        broker.eft = &factories;
        current = this;
    }
    WaitingBroker(const WaitingBroker&) = delete;
    WaitingBroker& operator=(const WaitingBroker&) = delete;

    const CMPIBroker* handle() const { return &broker; }

    void awaitArrival() {
        std::unique_lock<std::mutex> lock(mutex);
        changed.wait(lock, [&] { return hasArrived; });
    }

    void release() {
        const std::lock_guard<std::mutex> lock(mutex);
        isReleased = true;
        changed.notify_all();
    }

    std::function<void()> inUpCall;  ///< runs on the thread of the up-call, instead of blocking it

private:
    void wait() {
        std::unique_lock<std::mutex> lock(mutex);
        hasArrived = true;
        changed.notify_all();
        changed.wait(lock, [&] { return isReleased; });
    }

    static CMPIInstance* newInstance(const CMPIBroker* itsBroker, const CMPIObjectPath* path, CMPIStatus* rc) {
        current->wait();
        return original.eft->newInstance(itsBroker, path, rc);
    }

    static CMPIEnumeration* enumerateInstances(const CMPIBroker* itsBroker, const CMPIContext* context,
                                               const CMPIObjectPath* path, const char** properties, CMPIStatus* rc) {
        if (current->inUpCall) {
            current->inUpCall();
        } else {
            current->wait();
        }
        return original.bft->enumerateInstances(itsBroker, context, path, properties, rc);
    }

    static inline WaitingBroker* current = nullptr;
    static inline CMPIBroker original{};

    std::mutex mutex;
    std::condition_variable changed;
    bool hasArrived = false;
    bool isReleased = false;
    CMPIBrokerFT services;
    CMPIBrokerEncFT factories;
    CMPIBroker broker;
};

class ShutdownTest : public GateTest {
protected:
    /** Waits until the gate refuses all requests. The status of an invalid request changes then. */
    void awaitRefusal() {
        while (gate().getInstance(classPath("VELKO_Unserved")).rc != CMPI_RC_ERR_FAILED) {  // needs no lock
            std::this_thread::yield();
        }
    }

    /** Shuts the manager down while a request waits in the broker, then lets the request continue. */
    void shutDownDuring(
        WaitingBroker& waiting, const std::function<void()>& ask, const std::function<void()>& meanwhile = [] {}) {
        std::thread request(ask);
        waiting.awaitArrival();
        std::thread shutdown([&] {
            EXPECT_THAT(gate().cleanupInstanceMI(true), isDone());
            broker.forget();
        });
        awaitRefusal();
        meanwhile();
        waiting.release();
        shutdown.join();
        request.join();
        EXPECT_THAT(broker.functions(), IsEmpty()) << "after the shutdown";
    }

    /** Exits with 0 if a request whose up-call outlasts the shutdown is refused. */
    [[noreturn]] void outlastShutdown(bool isReopened) {
        create(firstNode);
        WaitingBroker waiting(*broker.handle());
        gate().createInstanceMI(waiting.handle(), nullptr);
        gate().createAssociationMI(waiting.handle(), nullptr);
        std::thread request([&] {
            EXPECT_THAT(gate().associatorNames(keyedPath(lease, firstNode), {}),
                        isRefused(CMPI_RC_ERR_FAILED, "shutting down"));
        });
        waiting.awaitArrival();
        EXPECT_THAT(gate().cleanupInstanceMI(true), isDone());
        std::optional<testsupport::RecordingBroker> next;  // records the calls to both brokers
        if (isReopened) {
            EXPECT_NE(gate().createInstanceMI(next.emplace().handle(), nullptr), nullptr);
            EXPECT_THAT(identifiers(), ElementsAre(firstNode)) << "the gate serves the next manager";
        }
        testsupport::RecordingBroker& latest = next ? *next : broker;
        latest.forget();
        waiting.release();
        request.join();
        EXPECT_THAT(latest.functions(), ElementsAre("CMPIBrokerFT.enumerateInstances")) << "the up-call itself";
        close();
        EXPECT_TRUE(isLoaded(testsupport::underTest(GATE_LIBRARY)))
            << "the library stays loaded, since a request may still use it";
        std::_Exit(testing::Test::HasFailure() ? 1 : 0);
    }

    static int cleanups(const std::string& function) {
        int count = 0;
        for (const auto& record : agentEnvironment::log()) {
            count += record.function == function && record.channel == "log" ? 1 : 0;
        }
        return count;
    }
};

TEST_F(ShutdownTest, RefusesRequestsAfterShutdownWithoutCallingTheBroker) {
    create("L1");
    gate().associationMI();
    EXPECT_THAT(gate().cleanupInstanceMI(true), isDone());
    EXPECT_THAT(gate().cleanupAssociationMI(true), isDone());
    broker.forget();
    const auto isRefusedAfterShutdown = isRefused(CMPI_RC_ERR_FAILED, "shutting down");
    EXPECT_THAT(gate().enumerateInstances(classPath(lease)), isRefusedAfterShutdown);
    EXPECT_THAT(create("L2"), isRefusedAfterShutdown);
    EXPECT_THAT(gate().associatorNames(keyedPath(lease, "L1"), {}), isRefusedAfterShutdown);
    EXPECT_THAT(gate().execQuery(classPath(lease), "WQL", "select"), isRefused(CMPI_RC_ERR_NOT_SUPPORTED, "queries"));
    EXPECT_THAT(gate().cleanupInstanceMI(false), isRefused(CMPI_RC_DO_NOT_UNLOAD, "memory"));
    EXPECT_THAT(broker.functions(), IsEmpty());
}

TEST_F(ShutdownTest, AcceptsRequestsAfterTheNextFactoryCall) {
    create("L1");
    gate().cleanupInstanceMI(true);
    CMPIStatus status{CMPI_RC_ERR_FAILED, nullptr};
    EXPECT_NE(gate().createInstanceMI(broker.handle(), &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
}

TEST_F(ShutdownTest, CleansUpTheProviderOncePerShutdown) {
    gate().instanceMI();
    gate().associationMI();
    agentEnvironment::forgetLog();
    for (int round = 0; round < 3; ++round) {
        gate().cleanupInstanceMI(true);
        gate().cleanupAssociationMI(true);
    }
    EXPECT_EQ(cleanups("LeaseAndWarranty_Cleanup"), 1);
    EXPECT_EQ(cleanups("LeaseAndWarranty_AssociationCleanup"), 1);
}

TEST_F(ShutdownTest, ShutdownWaitsForRequestsAndNoneCallsTheBrokerAfterwards) {
    create("L1");
    WaitingBroker waiting(*broker.handle());
    gate().createInstanceMI(waiting.handle(), nullptr);
    shutDownDuring(waiting, [&] { EXPECT_THAT(gate().enumerateInstances(classPath(lease)), isAnswered(1)); });
    unload();  // before the other broker is destroyed
}

TEST_F(ShutdownTest, CompletesARequestThatIsInAnUpCall) {
    create(firstNode);
    WaitingBroker waiting(*broker.handle());
    gate().createInstanceMI(waiting.handle(), nullptr);
    gate().createAssociationMI(waiting.handle(), nullptr);
    shutDownDuring(waiting,
                   [&] { EXPECT_THAT(gate().associatorNames(keyedPath(lease, firstNode), {}), isAnswered(1)); });
    unload();
}

/**
 * This test and the next one run in separate processes, since the library stays loaded. Both wait for the drain
 * timeout.
 */
TEST_F(ShutdownTest, RefusesARequestWhoseUpCallOutlastsTheShutdown) {
    testing::FLAGS_gtest_death_test_style = "threadsafe";
    EXPECT_EXIT(outlastShutdown(false), testing::ExitedWithCode(0), "");
}

TEST_F(ShutdownTest, RefusesARequestWhoseUpCallOutlastsTheShutdownEvenIfANewManagerIsConnected) {
    testing::FLAGS_gtest_death_test_style = "threadsafe";
    EXPECT_EXIT(outlastShutdown(true), testing::ExitedWithCode(0), "");
}

TEST_F(ShutdownTest, AFactoryCallDuringShutdownFailsWithAMessage) {
    create(firstNode);
    WaitingBroker waiting(*broker.handle());
    gate().createInstanceMI(waiting.handle(), nullptr);
    const auto enumerate = [&] { EXPECT_THAT(gate().enumerateInstances(classPath(lease)), isAnswered(1)); };
    shutDownDuring(waiting, enumerate, [&] {
        CMPIStatus status{CMPI_RC_OK, nullptr};
        EXPECT_EQ(gate().createInstanceMI(waiting.handle(), &status), nullptr);
        EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
        EXPECT_THAT(cimhost::statusFrom(status).message, testing::HasSubstr("shutting down"));
    });
    EXPECT_NE(gate().createInstanceMI(broker.handle(), nullptr), nullptr) << "after the shutdown";
    EXPECT_THAT(identifiers(), ElementsAre(firstNode));
    unload();
}

TEST_F(ShutdownTest, AFactoryCallAdoptsTheNewFunctionTablesOfABroker) {
    create("L1");
    CMPIBrokerEncFT fewer = *broker.handle()->eft;
    fewer.newInstance = nullptr;
    CMPIBroker changing = *broker.handle();
    changing.eft = &fewer;
    gate().createInstanceMI(&changing, nullptr);
    EXPECT_THAT(gate().enumerateInstances(classPath(lease)), Not(isAnswered(1)));
    changing.eft = broker.handle()->eft;
    gate().createInstanceMI(&changing, nullptr);
    EXPECT_THAT(gate().enumerateInstances(classPath(lease)), isAnswered(1));
    unload();  // before the other broker is destroyed
}

/**
 * Exits from another thread during an up-call, while the request waits. The status is 8 if the gate does not block the
 * exit.
 */
struct ExitInUpCall {
    static void run() {
        // Runs after the gate's static objects are destroyed. Skips the leak check, which does not support other
        // running threads.
        std::atexit([] { std::_Exit(8); });
        static auto& broker = *new testsupport::RecordingBroker;
        static auto& waiting = *new WaitingBroker(*broker.handle());
        static auto* library =
            new testsupport::ProviderLibrary(testsupport::underTest(GATE_LIBRARY), "LeaseAndWarrantyGate", broker);
        waiting.inUpCall = [] { std::thread([] { std::exit(0); }).join(); };
        library->createAssociationMI(waiting.handle(), nullptr);
        library->associatorNames(keyedPath(lease, firstNode), {});
    }
};

TEST_F(ShutdownTest, TheProcessCanExitFromAnotherThreadDuringAnUpCall) {
    testing::FLAGS_gtest_death_test_style = "threadsafe";
    EXPECT_EXIT(ExitInUpCall::run(), testing::ExitedWithCode(8), "");
}

}  // namespace
}  // namespace gatetest
