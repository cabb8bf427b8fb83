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

// How many requests are inside the provider at a time.

namespace gatetest {
namespace {

/** Whether a thread of this process sleeps, or has ended: it has come as far as it can. */
bool isAsleep(pid_t thread) {
    std::ifstream file("/proc/self/task/" + std::to_string(thread) + "/stat");
    std::string stat;
    return !std::getline(file, stat) || stat.compare(stat.rfind(')') + 1, 2, " S") == 0;
}

/** Counts the threads that are in the broker's newInstance, that is, inside the provider. */
class InsideCounter {
public:
    explicit InsideCounter(const CMPIBroker& real) : makers(*real.eft), broker(real) {
        original = makers.newInstance;
        makers.newInstance = &newInstance;
        broker.eft = &makers;
        current = this;
    }
    InsideCounter(const InsideCounter&) = delete;
    InsideCounter& operator=(const InsideCounter&) = delete;

    const CMPIBroker* handle() const { return &broker; }

    /** A thread is about to make its request. */
    void comes() {
        const std::lock_guard<std::mutex> lock(mutex);
        ++coming;
        threads.push_back(gettid());
        changed.notify_all();
    }

    /** Waits until somebody is inside. */
    void awaitInside() {
        std::unique_lock<std::mutex> lock(mutex);
        changed.wait(lock, [&] { return inside > 0; });
    }

    /** Whether somebody is inside, or nobody ever was. */
    bool isBusy() {
        const std::lock_guard<std::mutex> lock(mutex);
        return inside > 0 || most == 0;
    }

    /** Inside, wait for so many threads inside (or for all to come); for what is to be shown. */
    int awaitedInside = 0;
    int awaitedComing = 0;
    int most = 0;
    bool awaitsSleep = false;  ///< inside, wait also until all others have come as far as they can
    std::function<void()> whenOthersSleep = [] {};

private:
    static CMPIInstance* newInstance(const CMPIBroker* itsBroker, const CMPIObjectPath* path, CMPIStatus* rc) {
        InsideCounter& self = *current;
        std::unique_lock<std::mutex> lock(self.mutex);
        ++self.inside;
        self.most = std::max(self.most, self.inside);
        self.changed.notify_all();
        self.changed.wait(lock, [&] { return self.most >= self.awaitedInside && self.coming >= self.awaitedComing; });
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
    int coming = 0;
    std::vector<pid_t> threads;
    CMPIBrokerEncFT makers;
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

    /** All clients enumerate the one warranty at a time. */
    void load(const std::string& file, const char* name, int insideAtOnce) {
        testsupport::RecordingBroker broker;
        InsideCounter counter(*broker.handle());
        counter.awaitedInside = insideAtOnce;
        counter.awaitedComing = clientCount;
        counter.awaitsSleep = insideAtOnce == 1;
        testsupport::ProviderLibrary library(file, name, broker);
        ASSERT_NE(library.createInstanceMI(counter.handle(), nullptr), nullptr);
        std::vector<Outcome> outcomes(clientCount);
        onThreads(clientCount, [&](int number) {
            counter.comes();
            outcomes[static_cast<std::size_t>(number)] = library.enumerateInstances(classPath(warranty));
        });
        for (const Outcome& outcome : outcomes) {
            EXPECT_THAT(outcome, isAnswered(1));
        }
        EXPECT_EQ(counter.most, insideAtOnce);
    }

    SilentLog silence;
};

TEST_F(SerialisingTest, ThroughTheGateOneRequestAtATimeIsInside) {
    load(testsupport::underTest(GATE_LIBRARY), "LeaseAndWarrantyGate", 1);
}

TEST_F(SerialisingTest, NoKeyOrValueOfAClientIsReadWhileAnotherRequestIsInside) {
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
        counter.awaitedComing = 2;
        counter.awaitsSleep = true;
        int readBehindLock = -1;
        counter.whenOthersSleep = [&] {
            readBehindLock = broker.count("CMPIInstanceFT.getProperty") + broker.count("CMPIInstanceFT.getPropertyAt") +
                             broker.count("CMPIObjectPathFT.getKey") + broker.count("CMPIObjectPathFT.getKeyAt");
        };
        std::thread inside([&] {
            counter.comes();
            library.enumerateInstances(classPath(warranty));
        });
        counter.awaitInside();
        std::thread second([&] {
            counter.comes();
            request(library);
        });
        inside.join();
        second.join();
        EXPECT_EQ(readBehindLock, 0);
    }
}

/** A result that runs some work before it accepts a path. */
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

TEST_F(SerialisingTest, WithoutItAllRequestsAreInsideAtOnce) {
    load(testsupport::underTest(PROVIDER_LIBRARY), "LeaseAndWarrantyProvider", clientCount);
}

TEST_F(SerialisingTest, AFactoryCallDoesNotWaitForWhoIsInside) {
    testsupport::RecordingBroker broker;
    InsideCounter counter(*broker.handle());
    counter.awaitedComing = 1;
    testsupport::ProviderLibrary library(testsupport::underTest(GATE_LIBRARY), "LeaseAndWarrantyGate", broker);
    CMPIInstanceMI* first = library.createInstanceMI(counter.handle(), nullptr);
    std::thread request([&] { EXPECT_THAT(library.enumerateInstances(classPath(warranty)), isAnswered(1)); });
    counter.awaitInside();
    EXPECT_EQ(library.createInstanceMI(counter.handle(), nullptr), first);
    counter.comes();
    request.join();
}

/** Ends the process while a request is inside the provider; with 9 if static objects went before it. */
struct EndWhileInside {
    static inline InsideCounter* counter = nullptr;

    static void run() {
        // Never destroyed: the other thread uses them to the very end.
        static auto& broker = *new testsupport::RecordingBroker;
        static auto& inside = *new InsideCounter(*broker.handle());
        counter = &inside;
        inside.awaitedComing = 1;
        // After the gate's static objects, which are not there yet.
        std::atexit([] {
            if (counter->isBusy()) {
                std::_Exit(9);
            }
        });
        static auto* library =
            new testsupport::ProviderLibrary(testsupport::underTest(GATE_LIBRARY), "LeaseAndWarrantyGate", broker);
        library->createInstanceMI(inside.handle(), nullptr);
        // Before them.
        std::atexit([] { counter->comes(); });
        std::thread([] { library->enumerateInstances(classPath(warranty)); }).detach();
        inside.awaitInside();
        std::exit(0);
    }
};

TEST_F(SerialisingTest, TheEndOfTheProcessWaitsForWhoIsInside) {
    testing::FLAGS_gtest_death_test_style = "threadsafe";
    EXPECT_EXIT(EndWhileInside::run(), testing::ExitedWithCode(0), "");
}

}  // namespace
}  // namespace gatetest
