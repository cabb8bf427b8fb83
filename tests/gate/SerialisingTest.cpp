#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <condition_variable>
#include <cstdlib>
#include <fstream>
#include <functional>
#include <mutex>
#include <thread>
#include <utility>

#include "ManagedGate.h"
#include "Threads.h"
#include "broker/RequestScope.h"
#include "support/Files.h"
#include "support/UnderTest.h"

// Checks how many requests run concurrently in the provider.

namespace gatetest {
namespace {

/** Returns whether a thread of this process sleeps or has ended. */
bool isAsleep(pid_t thread) {
    std::ifstream file("/proc/self/task/" + std::to_string(thread) + "/stat");
    std::string stat;
    return !std::getline(file, stat) || stat.compare(stat.rfind(')') + 1, 2, " S") == 0;
}

/** Counts the threads that execute the broker's newInstance and are therefore in the provider. */
class InsideCounter {
public:
    explicit InsideCounter(const CMPIBroker& real) : factories(*real.eft), broker(real) {
        original = factories.newInstance;
        factories.newInstance = &newInstance;
        broker.eft = &factories;
        current = this;
    }
    InsideCounter(const InsideCounter&) = delete;
    InsideCounter& operator=(const InsideCounter&) = delete;

    const CMPIBroker* handle() const { return &broker; }

    /** Registers a thread that is about to send its request. */
    void arrive() {
        const std::lock_guard<std::mutex> lock(mutex);
        ++arrived;
        threads.push_back(gettid());
        changed.notify_all();
    }

    /** Waits until a request is in the provider. */
    void awaitInside() {
        std::unique_lock<std::mutex> lock(mutex);
        changed.wait(lock, [&] { return inside > 0; });
    }

    /** Returns whether a request is in the provider, or none has entered it yet. */
    bool isBusy() {
        const std::lock_guard<std::mutex> lock(mutex);
        return inside > 0 || most == 0;
    }

    /**
     * newInstance continues when `most` reaches awaitedInside and the number of arrived threads reaches
     * awaitedArrivals.
     */
    int awaitedInside = 0;
    int awaitedArrivals = 0;
    int most = 0;
    bool awaitsSleep = false;  ///< the next newInstance also waits until all other arrived threads sleep
    std::function<void()> whenOthersSleep = [] {};

private:
    static CMPIInstance* newInstance(const CMPIBroker* itsBroker, const CMPIObjectPath* path, CMPIStatus* rc) {
        InsideCounter& self = *current;
        std::unique_lock<std::mutex> lock(self.mutex);
        ++self.inside;
        self.most = std::max(self.most, self.inside);
        self.changed.notify_all();
        self.changed.wait(lock,
                          [&] { return self.most >= self.awaitedInside && self.arrived >= self.awaitedArrivals; });
        const bool hasWaited = std::exchange(self.awaitsSleep, false);
        const std::vector<pid_t> others = hasWaited ? self.threads : std::vector<pid_t>{};
        lock.unlock();
        for (const pid_t thread : others) {
            while (thread != gettid() && !isAsleep(thread)) {
                std::this_thread::yield();
            }
        }
        if (hasWaited) {
            self.whenOthersSleep();
        }
        lock.lock();
        --self.inside;
        lock.unlock();
        return original(itsBroker, path, rc);
    }

    static inline InsideCounter* current = nullptr;
    static inline CMPIInstance* (*original)(const CMPIBroker*, const CMPIObjectPath*, CMPIStatus*) = nullptr;

    std::mutex mutex;
    std::condition_variable changed;
    int inside = 0;
    int arrived = 0;
    std::vector<pid_t> threads;
    CMPIBrokerEncFT factories;
    CMPIBroker broker;
};

class SerialisingTest : public testing::Test {
protected:
    SerialisingTest() {
        agentEnvironment::clear();
        testsupport::writeFile(agentEnvironment::dataDirectory() / "Warranty.dat",
                               "1\nW1\nACME\n00000000000000.000000-000\n0\n");
    }
    ~SerialisingTest() override { agentEnvironment::clear(); }

    /**
     * Lets all clients enumerate the only warranty concurrently. Expects the maximum number of requests in the
     * provider.
     */
    void load(const std::string& file, const char* name, int insideAtOnce) {
        testsupport::RecordingBroker broker;
        InsideCounter counter(*broker.handle());
        counter.awaitedInside = insideAtOnce;
        counter.awaitedArrivals = clientCount;
        counter.awaitsSleep = insideAtOnce == 1;
        testsupport::ProviderLibrary library(file, name, broker);
        ASSERT_NE(library.createInstanceMI(counter.handle(), nullptr), nullptr);
        std::vector<Outcome> outcomes(clientCount);
        onThreads(clientCount, [&](int number) {
            counter.arrive();
            outcomes[static_cast<std::size_t>(number)] = library.enumerateInstances(classPath(warranty));
        });
        for (const Outcome& outcome : outcomes) {
            EXPECT_THAT(outcome, isAnswered(1));
        }
        EXPECT_EQ(counter.most, insideAtOnce);
    }

    SilentLog silence;
};

TEST_F(SerialisingTest, TheGateSerializesRequests) {
    load(testsupport::underTest(GATE_LIBRARY), "LeaseAndWarrantyGate", 1);
}

TEST_F(SerialisingTest, TheGateReadsNoArgumentsWhileAnotherRequestIsInTheProvider) {
    const ObjectPath path = keyedPath(warranty, "W1");
    const ObjectPath association =
        testsupport::objectPath(nameSpace, warrantySetting,
                                {named("Antecedent", testsupport::reference(computerPath("alpha"))),
                                 named("Dependent", testsupport::reference(path))});
    const Instance sent = testsupport::instance(path, {named("Warrantor", text("Other"))});
    using Library = testsupport::ProviderLibrary;
    const std::function<void(Library&)> requests[] = {
        [&](Library& library) { library.getInstance(path); },
        [&](Library& library) { library.createInstance(keyedPath(warranty, "W2"), sent); },
        [&](Library& library) { library.modifyInstance(path, sent); },
        [&](Library& library) { library.deleteInstance(path); },
        [&](Library& library) { library.getInstance(association); },
        [&](Library& library) { library.associators(path, {}); },
        [&](Library& library) { library.associatorNames(path, {}); },
        [&](Library& library) { library.references(path, {}); },
        [&](Library& library) { library.referenceNames(path, {}); },
    };
    for (const auto& request : requests) {
        testsupport::RecordingBroker broker;
        InsideCounter counter(*broker.handle());
        Library library(testsupport::underTest(GATE_LIBRARY), "LeaseAndWarrantyGate", broker);
        ASSERT_NE(library.createInstanceMI(counter.handle(), nullptr), nullptr);
        counter.awaitedArrivals = 2;
        counter.awaitsSleep = true;
        int readBehindLock = -1;
        counter.whenOthersSleep = [&] {
            readBehindLock = broker.count("CMPIInstanceFT.getProperty") + broker.count("CMPIInstanceFT.getPropertyAt") +
                             broker.count("CMPIObjectPathFT.getKey") + broker.count("CMPIObjectPathFT.getKeyAt");
        };
        std::thread inside([&] {
            counter.arrive();
            library.enumerateInstances(classPath(warranty));
        });
        counter.awaitInside();
        std::thread second([&] {
            counter.arrive();
            request(library);
        });
        inside.join();
        second.join();
        EXPECT_EQ(readBehindLock, 0);
    }
}

/** A result that runs a function before it accepts a path. */
class WorkingResult {
public:
    WorkingResult(const CMPIResult& real, std::function<void()> itsWork) : functions(*real.ft), result(real) {
        work = std::move(itsWork);
        original = functions.returnObjectPath;
        functions.returnObjectPath = [](const CMPIResult* self, const CMPIObjectPath* path) {
            work();
            return original(self, path);
        };
        result.ft = &functions;
    }
    WorkingResult(const WorkingResult&) = delete;
    WorkingResult& operator=(const WorkingResult&) = delete;

    const CMPIResult* handle() const { return &result; }

private:
    static inline std::function<void()> work{};
    static inline CMPIStatus (*original)(const CMPIResult*, const CMPIObjectPath*) = nullptr;

    CMPIResultFT functions;
    CMPIResult result;
};

TEST_F(SerialisingTest, ADeletionWaitsUntilTheCreationHasReturnedItsPath) {
    testsupport::RecordingBroker broker;
    testsupport::ProviderLibrary library(testsupport::underTest(GATE_LIBRARY), "LeaseAndWarrantyGate", broker);
    CMPIInstanceMI* mi = library.instanceMI();
    const ObjectPath path = keyedPath(lease, "L1");
    std::atomic<pid_t> deleter{0};
    std::atomic<bool> isDeleted{false};
    std::thread deletion;
    const auto deleteMeanwhile = [&] {
        deletion = std::thread([&] {
            deleter = gettid();
            EXPECT_THAT(library.deleteInstance(path), isDone());
            isDeleted = true;
        });
        while (deleter == 0 || !isAsleep(deleter)) {
            std::this_thread::yield();
        }
        EXPECT_FALSE(isDeleted);
    };
    const Outcome created =
        library.call([&](cimhost::RequestScope& scope, const CMPIContext* context, const CMPIResult* result) {
            const WorkingResult working(*result, deleteMeanwhile);
            return mi->ft->createInstance(mi, context, working.handle(), scope.objectPath(path),
                                          scope.instance(testsupport::instance(path, {})));
        });
    EXPECT_THAT(created, isAnswered(1));
    deletion.join();
    EXPECT_TRUE(isDeleted);
    EXPECT_THAT(library.enumerateInstanceNames(classPath(lease)), isAnswered(0));
}

TEST_F(SerialisingTest, WithoutTheGateRequestsAreConcurrent) {
    load(testsupport::underTest(PROVIDER_LIBRARY), "LeaseAndWarrantyProvider", clientCount);
}

TEST_F(SerialisingTest, AFactoryCallDoesNotWaitForRequests) {
    testsupport::RecordingBroker broker;
    InsideCounter counter(*broker.handle());
    counter.awaitedArrivals = 1;
    testsupport::ProviderLibrary library(testsupport::underTest(GATE_LIBRARY), "LeaseAndWarrantyGate", broker);
    CMPIInstanceMI* first = library.createInstanceMI(counter.handle(), nullptr);
    std::thread request([&] { EXPECT_THAT(library.enumerateInstances(classPath(warranty)), isAnswered(1)); });
    counter.awaitInside();
    EXPECT_EQ(library.createInstanceMI(counter.handle(), nullptr), first);
    counter.arrive();
    request.join();
}

/**
 * Exits while a request is in the provider. The status is 9 if static objects are destroyed before the request ends.
 */
struct ExitWhileInside {
    static inline InsideCounter* counter = nullptr;

    static void run() {
        // These objects are never destroyed, since the other thread uses them until the process ends.
        static auto& broker = *new testsupport::RecordingBroker;
        static auto& inside = *new InsideCounter(*broker.handle());
        counter = &inside;
        inside.awaitedArrivals = 1;
        // Runs after the destruction of the gate's static objects, which are constructed later.
        std::atexit([] {
            if (counter->isBusy()) {
                std::_Exit(9);
            }
        });
        static auto* library =
            new testsupport::ProviderLibrary(testsupport::underTest(GATE_LIBRARY), "LeaseAndWarrantyGate", broker);
        library->createInstanceMI(inside.handle(), nullptr);
        // Runs before the destruction of the gate's static objects.
        std::atexit([] { counter->arrive(); });
        std::thread([] { library->enumerateInstances(classPath(warranty)); }).detach();
        inside.awaitInside();
        std::exit(0);
    }
};

TEST_F(SerialisingTest, ProcessExitWaitsForRequests) {
    testing::FLAGS_gtest_death_test_style = "threadsafe";
    EXPECT_EXIT(ExitWhileInside::run(), testing::ExitedWithCode(0), "");
}

}  // namespace
}  // namespace gatetest
