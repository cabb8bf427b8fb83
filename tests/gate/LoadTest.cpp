#include "ManagedGate.h"

#include "support/Files.h"

#include <unistd.h>

#include <algorithm>
#include <condition_variable>
#include <cstdlib>
#include <fstream>
#include <map>
#include <mutex>
#include <set>
#include <sstream>
#include <thread>

// Many clients at a time: what they were told, what the tables hold and what the files hold are the same.

namespace gatetest {
namespace {

using cimhost::Manager;
using testing::IsEmpty;

constexpr int clientCount = 32;
constexpr int rounds = 3;

/** Runs a body on many threads, which start together. */
template <class Body>
void onThreads(int count, Body body) {
    std::mutex mutex;
    std::condition_variable changed;
    int arrived = 0;
    std::vector<std::thread> threads;
    for (int number = 0; number < count; ++number) {
        threads.emplace_back([&, number] {
            {
                std::unique_lock<std::mutex> lock(mutex);
                ++arrived;
                changed.notify_all();
                changed.wait(lock, [&] { return arrived == count; });
            }
            body(number);
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
}

/** What a client was told: the leases that are there because of it, with their lessor and term. */
using Told = std::map<std::string, std::pair<std::string, std::string>>;

/** One client. It notes what goes wrong instead of failing the test, which only the main thread may do. */
class Client {
public:
    Client(ManagedGate& itsGate, int itsNumber) : gate(itsGate), number(itsNumber) {}

    void work() {
        for (int round = 0; round < rounds; ++round) {
            const std::string id = "client " + std::to_string(number) + " round " + std::to_string(round);
            createOwn(id);
            createShared("shared " + std::to_string(round));
            readOwn(id);
            modifyOwn(id, static_cast<unsigned>(100 * number + round));
            enumerate();
            associate();
            if (round % 2 == 1) {
                removeOwn(id);
            }
        }
    }

    Told told;
    std::vector<std::string> problems;

private:
    void expect(bool holds, const std::string& what, const cimhost::Status& status = {}) {
        if (!holds) {
            problems.push_back(what + ": " + std::to_string(status.rc) + " " + status.message);
        }
    }

    void createOwn(const std::string& id) {
        const cimhost::Status status = create(id, "Lessor " + std::to_string(number));
        expect(status.ok(), "creating " + id, status);
        told[id] = {"Lessor " + std::to_string(number), "0"};
    }

    /** All clients create it; one of them succeeds. */
    void createShared(const std::string& id) {
        const std::string lessor = "Lessor " + std::to_string(number);
        const cimhost::Status status = create(id, lessor);
        expect(status.ok() || status.rc == CMPI_RC_ERR_ALREADY_EXISTS, "creating " + id, status);
        if (status.ok()) {
            told[id] = {lessor, "0"};
        }
    }

    cimhost::Status create(const std::string& id, const std::string& lessor) {
        const ObjectPath path = keyedPath(lease, id);
        const Instance sent =
            testsupport::instance(path, {named("InstanceID", text(id)), named("Lessor", text(lessor))});
        return gate.manager().createInstance({}, path, sent).status;
    }

    void readOwn(const std::string& id) {
        const auto answer = gate.manager().getInstance({}, keyedPath(lease, id), {});
        expect(answer.ok(), "getting " + id, answer.status);
        expect(valueIn(answer.value, "Lessor") == told[id].first, "the lessor of " + id);
    }

    void modifyOwn(const std::string& id, unsigned term) {
        const ObjectPath path = keyedPath(lease, id);
        const auto status = gate.manager().modifyInstance(
            {}, path, testsupport::instance(path, {named("LeaseTerm", uint32(term))}), {});
        expect(status.ok(), "modifying " + id, status);
        told[id].second = std::to_string(term);
    }

    void removeOwn(const std::string& id) {
        const auto status = gate.manager().deleteInstance({}, keyedPath(lease, id));
        expect(status.ok(), "deleting " + id, status);
        told.erase(id);
    }

    /** Everything that is this client's own is there, once, and as it was told. */
    void enumerate() {
        const auto answer = gate.manager().enumerateInstances({}, classPath(lease), {});
        expect(answer.ok(), "enumerating", answer.status);
        std::set<std::string> seen;
        for (const Instance& instance : answer.value) {
            const std::string id = valueIn(instance, "InstanceID").value_or("(none)");
            expect(seen.insert(id).second, id + " is there twice");
            const auto own = told.find(id);
            if (own != told.end()) {
                expect(valueIn(instance, "Lessor") == own->second.first, "the lessor of " + id);
                expect(valueIn(instance, "LeaseTerm") == own->second.second, "the term of " + id);
            }
        }
        for (const auto& [id, values] : told) {
            expect(seen.count(id) == 1, id + " is missing");
        }
    }

    /** An up-call in each: the computers are another provider's. */
    void associate() {
        const auto names = gate.manager().associatorNames({}, computerPath("alpha"), {leaseSetting, {}, {}, {}});
        expect(names.ok() && identifiersOf(names.value) == std::vector<std::string>{firstPlace}, "the lease of alpha",
               names.status);
        const auto computers =
            gate.manager().associators({}, keyedPath(lease, firstPlace), {leaseSetting, {}, {}, {}}, {});
        expect(computers.ok() && computers.value.size() == 1, "the computer of a lease", computers.status);
    }

    ManagedGate& gate;
    int number;
};

Told inTable(ManagedGate& gate) {
    Told told;
    const auto answer = gate.manager().enumerateInstances({}, classPath(lease), {});
    EXPECT_TRUE(answer.ok()) << answer.status.message;
    for (const Instance& instance : answer.value) {
        told[valueIn(instance, "InstanceID").value_or("")] = {valueIn(instance, "Lessor").value_or(""),
                                                              valueIn(instance, "LeaseTerm").value_or("")};
    }
    EXPECT_EQ(told.size(), answer.value.size()) << "an identifier is there twice";
    return told;
}

/** The identifiers, lessors and terms in the data file, line by line. */
Told inFile() {
    constexpr int linesOfRecord = 13;
    std::istringstream file(testsupport::readFile(agentEnvironment::dataDirectory() / "Lease.dat"));
    const auto nextLine = [&] {
        std::string line;
        std::getline(file, line);
        std::replace(line.begin(), line.end(), '_', ' ');
        return line == "*" ? std::string() : line;
    };
    Told told;
    const int count = std::stoi(nextLine());
    for (int record = 0; record < count; ++record) {
        std::vector<std::string> lines;
        for (int line = 0; line < linesOfRecord; ++line) {
            lines.push_back(nextLine());
        }
        told[lines[0]] = {lines[1], lines[3]};
    }
    EXPECT_EQ(told.size(), static_cast<std::size_t>(count));
    EXPECT_EQ(file.peek(), EOF) << "more lines than records";
    return told;
}

class LoadTest : public testing::TestWithParam<Manager> {
protected:
    LoadTest() { agentEnvironment::clear(); }
    ~LoadTest() override { agentEnvironment::clear(); }

    SilentLog silence;
};

TEST_P(LoadTest, ClientsTablesAndFilesAgreeAfterAMixedLoad) {
    Told expected{{firstPlace, {"", "0"}}};
    {
        ManagedGate gate(GetParam());
        ASSERT_TRUE(gate.create(firstPlace, {}).ok());
        std::vector<Client> clients;
        for (int number = 0; number < clientCount; ++number) {
            clients.emplace_back(gate, number);
        }
        onThreads(clientCount, [&](int number) { clients[static_cast<std::size_t>(number)].work(); });
        for (const Client& client : clients) {
            EXPECT_THAT(client.problems, IsEmpty());
            for (const auto& [id, values] : client.told) {
                EXPECT_TRUE(expected.emplace(id, values).second) << id << " was created twice";
            }
        }
        EXPECT_EQ(inTable(gate), expected);
    }
    EXPECT_EQ(inFile(), expected);
    ManagedGate again(GetParam());
    EXPECT_EQ(inTable(again), expected) << "loaded anew";
}

INSTANTIATE_TEST_SUITE_P(Gate, LoadTest, testing::Values(Manager::standard, Manager::sfcb, Manager::openPegasus),
                         [](const auto& parameter) { return std::string(cimhost::profileOf(parameter.param).name); });

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

private:
    static CMPIInstance* newInstance(const CMPIBroker* itsBroker, const CMPIObjectPath* path, CMPIStatus* rc) {
        InsideCounter& self = *current;
        std::unique_lock<std::mutex> lock(self.mutex);
        ++self.inside;
        self.most = std::max(self.most, self.inside);
        self.changed.notify_all();
        self.changed.wait(lock, [&] { return self.most >= self.awaitedInside && self.coming >= self.awaitedComing; });
        const std::vector<pid_t> others = self.awaitsSleep ? self.threads : std::vector<pid_t>{};
        self.awaitsSleep = false;
        lock.unlock();
        for (const pid_t thread : others) {
            while (thread != gettid() && !isAsleep(thread)) {
                std::this_thread::yield();
            }
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
    void load(const char* file, const char* name, int insideAtOnce) {
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
    load(GATE_LIBRARY, "LeaseAndWarrantyGate", 1);
}

TEST_F(SerialisingTest, WithoutItAllRequestsAreInsideAtOnce) {
    load(PROVIDER_LIBRARY, "LeaseAndWarrantyProvider", clientCount);
}

TEST_F(SerialisingTest, AFactoryCallDoesNotWaitForWhoIsInside) {
    testsupport::RecordingBroker broker;
    InsideCounter counter(*broker.handle());
    counter.awaitedComing = 1;
    testsupport::ProviderLibrary library(GATE_LIBRARY, "LeaseAndWarrantyGate", broker);
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
        static auto* library = new testsupport::ProviderLibrary(GATE_LIBRARY, "LeaseAndWarrantyGate", broker);
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
