// Kills processes in which 8 clients create, modify and delete leases through the gate, and checks the leases.
//
// Usage: gate_kill_run KILLS [SEED]
//
// Exits with status 1 if a response is wrong, an acknowledged change is lost, a refused change is stored, an unanswered
// change is stored in part, or a record appears twice or was created by no client.

#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <iostream>
#include <map>
#include <random>
#include <stdexcept>
#include <thread>

#include "ManagedGate.h"
#include "SharedMemory.h"
#include "lab/emulation/ManagerEmulation.h"
#include "support/AgentEnvironment.h"

extern const bool agentHasNoLog = true;

namespace gatetest {
namespace {

constexpr int clients = 8;
constexpr int leasesPerClient = 5;
constexpr int maximumDelay = 40000;  ///< microseconds after the first response

/**
 * State of a client's lease. A value is the number of the change that wrote it; 0 means that the lease does not exist.
 */
struct LeaseState {
    int acknowledged;
    int pending;  ///< the value after the current change
    bool isPending;
};

/** Knowledge of the clients, in memory that outlives their process. */
struct Knowledge {
    std::array<std::array<LeaseState, leasesPerClient>, clients> leases;
    std::array<int, clients> answered;
    int wrongResponses;
};

std::string identifierOf(int client, int number) {
    return "lease " + std::to_string(number) + " of client " + std::to_string(client);
}

std::string lessorOf(int value) {
    return "lessor of change " + std::to_string(value);
}

/** A client, which changes only its own leases and therefore knows their expected values. */
class Client {
public:
    Client(ManagedGate& itsGate, Knowledge& itsKnowledge, int itsNumber, unsigned int seed)
        : gate(itsGate), knowledge(itsKnowledge), number(itsNumber), random(seed) {}

    void work() {
        for (;;) {
            const int lease = upTo(leasesPerClient - 1);
            LeaseState& state = knowledge.leases[static_cast<std::size_t>(number)][static_cast<std::size_t>(lease)];
            change(identifierOf(number, lease), state);
            ++knowledge.answered[static_cast<std::size_t>(number)];
        }
    }

private:
    int upTo(int most) { return std::uniform_int_distribution<int>(0, most)(random); }

    /** Requests a change. On average, one of eight requests must be refused. */
    void change(const std::string& id, LeaseState& state) {
        const int value = 1 + upTo(1000000);
        const bool exists = state.acknowledged != 0;
        if (upTo(7) == 0) {
            const cimhost::Status status = exists ? gate.create(id, values(value)) : gate.remove(id);
            expect(status, exists ? CMPI_RC_ERR_ALREADY_EXISTS : CMPI_RC_ERR_NOT_FOUND);
            return;
        }
        const bool isDeletion = exists && upTo(2) == 0;
        state.pending = isDeletion ? 0 : value;
        __atomic_store_n(&state.isPending, true, __ATOMIC_SEQ_CST);
        const cimhost::Status status = isDeletion ? gate.remove(id)
                                       : exists   ? gate.modify(keyedPath(lease, id), values(value))
                                                  : gate.create(id, values(value));
        expect(status, CMPI_RC_OK);
        state.acknowledged = status.rc == CMPI_RC_OK ? state.pending : state.acknowledged;
        __atomic_store_n(&state.isPending, false, __ATOMIC_SEQ_CST);
    }

    static std::vector<NamedValue> values(int value) {
        return {named("Lessor", text(lessorOf(value))), named("LeaseTerm", uint32(static_cast<unsigned int>(value)))};
    }

    void expect(const cimhost::Status& status, CMPIrc expected) {
        if (status.rc != expected) {
            __atomic_add_fetch(&knowledge.wrongResponses, 1, __ATOMIC_SEQ_CST);
            std::cout << "client " << number << ": code " << status.rc << " instead of " << expected << ": "
                      << status.message << std::endl;
        }
    }

    ManagedGate& gate;
    Knowledge& knowledge;
    int number;
    std::mt19937 random;
};

/** Serves the clients until the process is killed. */
void serve(Knowledge& knowledge, unsigned int seed) {
    ManagedGate gate(cimhost::lab::Manager::standard);
    std::vector<std::thread> threads;
    for (int number = 0; number < clients; ++number) {
        threads.emplace_back([&, number] {
            Client(gate, knowledge, number, seed * clients + static_cast<unsigned int>(number)).work();
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
}

/** Returns the value of a lease; -1 if only a part of its values is stored. */
int valueOf(const Instance& instance) {
    const int value = std::atoi(valueIn(instance, "LeaseTerm").value_or("0").c_str());
    return value > 0 && valueIn(instance, "Lessor") == lessorOf(value) ? value : -1;
}

/**
 * Compares the leases with the knowledge of the clients, then sets the knowledge to the leases found. Returns the
 * number of errors.
 */
int check(Knowledge& knowledge) {
    ManagedGate gate(cimhost::lab::Manager::standard);
    const auto response = gate.manager().perform(cimhost::Request::enumerateInstances(classPath(lease)));
    std::map<std::string, int> found;
    int errors = response.ok() ? 0 : 1;
    for (const Instance& instance : response.instances) {
        const std::string id = valueIn(instance, "InstanceID").value_or("(none)");
        if (!found.emplace(id, valueOf(instance)).second) {
            std::cout << id << " occurs twice\n";
            ++errors;
        }
    }
    for (int client = 0; client < clients; ++client) {
        for (int number = 0; number < leasesPerClient; ++number) {
            LeaseState& state = knowledge.leases[static_cast<std::size_t>(client)][static_cast<std::size_t>(number)];
            const auto entry = found.find(identifierOf(client, number));
            const int value = entry == found.end() ? 0 : entry->second;
            if (value != state.acknowledged && !(state.isPending && value == state.pending)) {
                std::cout << identifierOf(client, number) << " has value " << value << ", acknowledged is "
                          << state.acknowledged << (state.isPending ? ", not answered " : "")
                          << (state.isPending ? std::to_string(state.pending) : "") << '\n';
                ++errors;
            }
            state = {value, 0, false};
            if (entry != found.end()) {
                found.erase(entry);
            }
        }
    }
    for (const auto& unknown : found) {
        std::cout << unknown.first << " was created by no client\n";
        ++errors;
    }
    std::cout.flush();
    return errors;
}

template <class Work>
pid_t startProcess(Work work) {
    const pid_t child = fork();
    if (child < 0) {
        throw std::runtime_error("no process can be started");
    }
    if (child == 0) {
        _exit(work());
    }
    return child;
}

/**
 * Runs clients, and kills their process at a random time after the first response. Returns false if no request was
 * answered, or if the process ended before.
 */
bool killClients(Knowledge& knowledge, std::mt19937& random) {
    knowledge.answered = {};
    const auto seed = static_cast<unsigned int>(random());
    const pid_t child = startProcess([&] {
        serve(knowledge, seed);
        return 0;
    });
    const auto answered = [&] {
        int sum = 0;
        for (const int& each : knowledge.answered) {
            sum += __atomic_load_n(&each, __ATOMIC_SEQ_CST);
        }
        return sum;
    };
    for (int wait = 0; answered() == 0 && wait < 20000; ++wait) {
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
    }
    std::this_thread::sleep_for(std::chrono::microseconds(std::uniform_int_distribution<int>(0, maximumDelay)(random)));
    kill(child, SIGKILL);
    int status = 0;
    return waitpid(child, &status, 0) == child && WIFSIGNALED(status) && WTERMSIG(status) == SIGKILL && answered() > 0;
}

int run(int kills, unsigned int seed) {
    auto& knowledge = sharedMemory<Knowledge>();
    std::mt19937 random(seed);
    int errors = 0;
    int answered = 0;
    for (int kill = 1; kill <= kills; ++kill) {
        if (!killClients(knowledge, random)) {
            std::cout << "kill " << kill << ": the clients were not served\n";
            ++errors;
        }
        for (const int each : knowledge.answered) {
            answered += each;
        }
        const pid_t checker = startProcess([&] { return std::min(check(knowledge), 100); });
        int status = 0;
        waitpid(checker, &status, 0);
        if (!WIFEXITED(status) || WEXITSTATUS(status) != 0) {
            std::cout << "kill " << kill << ": the leases are wrong\n";
            ++errors;
        }
    }
    std::cout << "kills " << kills << ", requests answered before them " << answered << ", wrong responses "
              << knowledge.wrongResponses << ", kills after which the leases were wrong " << errors << '\n';
    return errors == 0 && knowledge.wrongResponses == 0 ? 0 : 1;
}

}  // namespace
}  // namespace gatetest

int main(int count, char** arguments) {
    const int kills = count > 1 ? std::atoi(arguments[1]) : 0;
    if (kills < 1 || count > 3) {
        std::cerr << "Usage: gate_kill_run KILLS [SEED]\n";
        return 2;
    }
    return gatetest::run(kills, count > 2 ? static_cast<unsigned int>(std::atoi(arguments[2])) : 1);
}
