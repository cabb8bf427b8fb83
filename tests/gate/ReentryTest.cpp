#include <atomic>
#include <chrono>
#include <condition_variable>
#include <cstdio>
#include <cstdlib>
#include <mutex>
#include <thread>

#include "GateFixture.h"

// Providers that call the gate while the gate waits for their response to an up-call.

namespace gatetest {
namespace {

constexpr int clients = 8;
constexpr int roundsOfAClient = 20 / SHARES;

/** Aborts the program unless this object is destroyed within 100 seconds, since requests in a deadlock never end. */
class Deadline {
public:
    Deadline() : watch([this] { await(); }) {}
    ~Deadline() {
        {
            const std::lock_guard<std::mutex> lock(mutex);
            isMet = true;
        }
        changed.notify_all();
        watch.join();
    }
    Deadline(const Deadline&) = delete;
    Deadline& operator=(const Deadline&) = delete;

private:
    void await() {
        std::unique_lock<std::mutex> lock(mutex);
        if (!changed.wait_for(lock, std::chrono::seconds(100), [&] { return isMet; })) {
            std::fputs("deadlock: requests wait for each other\n", stderr);
            std::abort();
        }
    }

    std::mutex mutex;
    std::condition_variable changed;
    bool isMet = false;
    std::thread watch;
};

/** The thread on which an object manager calls the provider that serves an up-call. */
enum class UpCallThread { same, another };

/** A broker whose provider of computers reads and changes leases through the gate before it responds. */
class ReenteringBroker {
public:
    ReenteringBroker(const CMPIBroker& real, UpCallThread itsThread)
        : services(*real.bft), broker(real), thread(itsThread) {
        original = services.enumerateInstances;
        services.enumerateInstances = &enumerateInstances;
        broker.bft = &services;
        current = this;
    }
    ReenteringBroker(const ReenteringBroker&) = delete;
    ReenteringBroker& operator=(const ReenteringBroker&) = delete;

    const CMPIBroker* handle() const { return &broker; }

    testsupport::ProviderLibrary* library = nullptr;
    std::atomic<int> reentries{0};
    std::atomic<int> failures{0};

private:
    void reenter() {
        const ObjectPath path = keyedPath(lease, firstNode);
        const int number = ++reentries;
        const auto term = uint32(static_cast<unsigned>(number));
        const bool areGood =
            library->getInstance(path).rc == CMPI_RC_OK &&
            library->modifyInstance(path, testsupport::instance(path, {named("LeaseTerm", term)})).rc == CMPI_RC_OK &&
            library->enumerateInstances(classPath(lease)).instances().size() == 2;
        failures += areGood ? 0 : 1;
    }

    static CMPIEnumeration* enumerateInstances(const CMPIBroker* itsBroker, const CMPIContext* context,
                                               const CMPIObjectPath* path, const char** properties, CMPIStatus* rc) {
        if (current->thread == UpCallThread::same) {
            current->reenter();
        } else {
            std::thread([] { current->reenter(); }).join();
        }
        return original(itsBroker, context, path, properties, rc);
    }

    static inline ReenteringBroker* current = nullptr;
    static inline CMPIEnumeration* (*original)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*,
                                               const char**, CMPIStatus*) = nullptr;

    CMPIBrokerFT services;
    CMPIBroker broker;
    UpCallThread thread;
};

class ReentryTest : public GateTest, public testing::WithParamInterface<UpCallThread> {};

TEST_P(ReentryTest, ProvidersOfUpCallsCanCallTheGateUnderLoad) {
    const Deadline deadline;
    create(firstNode);
    create(secondNode);
    ReenteringBroker reentering(*broker.handle(), GetParam());
    reentering.library = &gate();
    gate().createInstanceMI(reentering.handle(), nullptr);
    gate().createAssociationMI(reentering.handle(), nullptr);
    std::atomic<int> wrong{0};
    std::vector<std::thread> threads;
    for (int client = 0; client < clients; ++client) {
        threads.emplace_back([&] {
            for (int round = 0; round < roundsOfAClient; ++round) {
                const Outcome names = gate().associatorNames(computerPath("alpha"), {leaseSetting, {}, {}, {}});
                const Outcome links = gate().enumerateInstances(classPath(leaseSetting));
                wrong += identifiersOf(names.paths()) == std::vector<std::string>{firstNode} ? 0 : 1;
                wrong += links.instances().size() == 2 ? 0 : 1;
            }
        });
    }
    for (std::thread& each : threads) {
        each.join();
    }
    EXPECT_EQ(wrong, 0);
    EXPECT_EQ(reentering.failures, 0);
    EXPECT_GE(reentering.reentries, 2 * clients * roundsOfAClient);
    unload();  // before the other broker is destroyed
}

INSTANTIATE_TEST_SUITE_P(Gate, ReentryTest, testing::Values(UpCallThread::same, UpCallThread::another),
                         [](const auto& parameter) {
                             return parameter.param == UpCallThread::same ? "OnTheSameThread" : "OnAnotherThread";
                         });

}  // namespace
}  // namespace gatetest
