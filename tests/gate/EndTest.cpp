#include "GateFixture.h"

#include <condition_variable>
#include <cstdlib>
#include <functional>
#include <mutex>
#include <optional>
#include <thread>

#include "broker/RequestScope.h"
#include "support/UnderTest.h"

// The end of the object manager, of the process, and of the broker.

namespace gatetest {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Not;

/** A broker one of whose functions waits inside, for a test to look at what others do meanwhile. */
class WaitingBroker {
public:
    explicit WaitingBroker(const CMPIBroker& real) : services(*real.bft), makers(*real.eft), broker(real) {
        original = real;
        services.enumerateInstances = &enumerateInstances;
        makers.newInstance = &newInstance;
        broker.bft = &services;
        broker.eft = &makers;
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

    std::function<void()> inUpCall;  ///< is run in the up-call, on its thread, in the place of waiting

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
    CMPIBrokerEncFT makers;
    CMPIBroker broker;
};

class EndTest : public GateTest {
protected:
    /** Goes on when the gate refuses requests: one that is wrong anyway is refused for another reason then. */
    void awaitRefusal() {
        while (gate().getInstance(classPath("VELKO_Unserved")).rc != CMPI_RC_ERR_FAILED) {  // needs no lock
            std::this_thread::yield();
        }
    }

    /** Ends the manager while a request waits in the broker, which then goes on. */
    void endDuring(
        WaitingBroker& waiting, const std::function<void()>& ask, const std::function<void()>& meanwhile = [] {}) {
        std::thread request(ask);
        waiting.awaitArrival();
        std::thread end([&] {
            EXPECT_THAT(gate().cleanupInstanceMI(true), isDone());
            broker.forget();
        });
        awaitRefusal();
        meanwhile();
        waiting.release();
        end.join();
        request.join();
        EXPECT_THAT(broker.functions(), IsEmpty()) << "after the end";
    }

    /** Ends the process: with 0 if all goes as it should. */
    [[noreturn]] void outlastTheEnd(bool isOpenedAgain) {
        create(firstPlace);
        WaitingBroker waiting(*broker.handle());
        gate().createInstanceMI(waiting.handle(), nullptr);
        gate().createAssociationMI(waiting.handle(), nullptr);
        std::thread request([&] {
            EXPECT_THAT(gate().associatorNames(keyedPath(lease, firstPlace), {}),
                        isRefused(CMPI_RC_ERR_FAILED, "shutting down"));
        });
        waiting.awaitArrival();
        EXPECT_THAT(gate().cleanupInstanceMI(true), isDone());
        std::optional<testsupport::RecordingBroker> next;  // which then records for both
        if (isOpenedAgain) {
            EXPECT_NE(gate().createInstanceMI(next.emplace().handle(), nullptr), nullptr);
            EXPECT_THAT(identifiers(), ElementsAre(firstPlace)) << "the next manager is served";
        }
        testsupport::RecordingBroker& latest = next ? *next : broker;
        latest.forget();
        waiting.release();
        request.join();
        EXPECT_THAT(latest.functions(), ElementsAre("CMPIBrokerFT.enumerateInstances")) << "the up-call itself";
        close();
        EXPECT_TRUE(isLoaded(testsupport::underTest(GATE_LIBRARY))) << "a request may still have been in it";
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

TEST_F(EndTest, AfterTheManagersEndRequestsAreRefusedWithoutACallOfItsBroker) {
    create("L1");
    gate().associationMI();
    EXPECT_THAT(gate().cleanupInstanceMI(true), isDone());
    EXPECT_THAT(gate().cleanupAssociationMI(true), isDone());
    broker.forget();
    const auto isRefusedForTheEnd = isRefused(CMPI_RC_ERR_FAILED, "shutting down");
    EXPECT_THAT(gate().enumerateInstances(classPath(lease)), isRefusedForTheEnd);
    EXPECT_THAT(create("L2"), isRefusedForTheEnd);
    EXPECT_THAT(gate().associatorNames(keyedPath(lease, "L1"), {}), isRefusedForTheEnd);
    EXPECT_THAT(gate().execQuery(classPath(lease), "WQL", "select"), isRefused(CMPI_RC_ERR_NOT_SUPPORTED, "queries"));
    EXPECT_THAT(gate().cleanupInstanceMI(false), isRefused(CMPI_RC_DO_NOT_UNLOAD, "memory"));
    EXPECT_THAT(broker.functions(), IsEmpty());
}

TEST_F(EndTest, AManagerThatGoesOnOpensTheGateByAFactory) {
    create("L1");
    gate().cleanupInstanceMI(true);
    CMPIStatus status{CMPI_RC_ERR_FAILED, nullptr};
    EXPECT_NE(gate().createInstanceMI(broker.handle(), &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
}

TEST_F(EndTest, TheProviderIsToldOnceAnEnd) {
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

TEST_F(EndTest, TheManagersEndWaitsForRequestsAndNoneCallsItsBrokerAfterIt) {
    create("L1");
    WaitingBroker waiting(*broker.handle());
    gate().createInstanceMI(waiting.handle(), nullptr);
    endDuring(waiting, [&] { EXPECT_THAT(gate().enumerateInstances(classPath(lease)), isAnswered(1)); });
    unload();  // before the other broker goes
}

TEST_F(EndTest, ARequestInAnUpCallIsServedWhenTheManagerEnds) {
    create(firstPlace);
    WaitingBroker waiting(*broker.handle());
    gate().createInstanceMI(waiting.handle(), nullptr);
    gate().createAssociationMI(waiting.handle(), nullptr);
    endDuring(waiting, [&] { EXPECT_THAT(gate().associatorNames(keyedPath(lease, firstPlace), {}), isAnswered(1)); });
    unload();
}

/** In processes of their own, since the library stays in them. Both wait as long as the gate has patience. */
TEST_F(EndTest, ARequestWhoseUpCallOutlastsTheEndIsRefusedWithoutACallOfTheBroker) {
    testing::FLAGS_gtest_death_test_style = "threadsafe";
    EXPECT_EXIT(outlastTheEnd(false), testing::ExitedWithCode(0), "");
}

TEST_F(EndTest, ARequestWhoseUpCallOutlastsTheEndIsRefusedAlsoAfterTheNextManagerHasCome) {
    testing::FLAGS_gtest_death_test_style = "threadsafe";
    EXPECT_EXIT(outlastTheEnd(true), testing::ExitedWithCode(0), "");
}

TEST_F(EndTest, AFactoryWhileTheManagerEndsGivesNothingAndSaysWhy) {
    create(firstPlace);
    WaitingBroker waiting(*broker.handle());
    gate().createInstanceMI(waiting.handle(), nullptr);
    const auto enumerate = [&] { EXPECT_THAT(gate().enumerateInstances(classPath(lease)), isAnswered(1)); };
    endDuring(waiting, enumerate, [&] {
        CMPIStatus status{CMPI_RC_OK, nullptr};
        EXPECT_EQ(gate().createInstanceMI(waiting.handle(), &status), nullptr);
        EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
        EXPECT_THAT(cimhost::statusFrom(status).message, testing::HasSubstr("shutting down"));
    });
    EXPECT_NE(gate().createInstanceMI(broker.handle(), nullptr), nullptr) << "the manager goes on";
    EXPECT_THAT(identifiers(), ElementsAre(firstPlace));
    unload();
}

TEST_F(EndTest, ABrokerWithOtherTablesIsConnectedAnew) {
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
    unload();  // before the other broker goes
}

/** Ends the process from the thread of an up-call while the request waits for it; with 8 if the gate lets it end. */
struct EndInUpCall {
    static void run() {
        // After the gate's static objects. Leaks are not looked for then: the search stumbles over the other threads.
        std::atexit([] { std::_Exit(8); });
        static auto& broker = *new testsupport::RecordingBroker;
        static auto& waiting = *new WaitingBroker(*broker.handle());
        static auto* library =
            new testsupport::ProviderLibrary(testsupport::underTest(GATE_LIBRARY), "LeaseAndWarrantyGate", broker);
        waiting.inUpCall = [] { std::thread([] { std::exit(0); }).join(); };
        library->createAssociationMI(waiting.handle(), nullptr);
        library->associatorNames(keyedPath(lease, firstPlace), {});
    }
};

TEST_F(EndTest, TheProcessMayEndFromTheThreadOfAnUpCall) {
    testing::FLAGS_gtest_death_test_style = "threadsafe";
    EXPECT_EXIT(EndInUpCall::run(), testing::ExitedWithCode(8), "");
}

}  // namespace
}  // namespace gatetest
