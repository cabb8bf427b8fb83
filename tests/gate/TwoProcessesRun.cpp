// Two processes that make changes through the gate in one data directory at the same time.
//
// Usage: gate_two_processes_run CHANGES
//   CHANGES   number of changes of each process, which closes the gate after every 100 changes, so that the other
//             process can become the owner
//
// Exits with status 1 if an acknowledged change is lost, or if a change is refused for any reason except that the other
// process is the owner.

#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstdlib>
#include <iostream>

#include "ManagedGate.h"
#include "SharedMemory.h"
#include "lab/emulation/ManagerEmulation.h"
#include "support/AgentEnvironment.h"

extern const bool agentHasNoLog = true;

namespace gatetest {
namespace {

constexpr int leases = 5;
constexpr int changesPerOwner = 100;

/** Responses that a process has received. */
struct Result {
    std::array<int, leases> acknowledged;  ///< the last acknowledged change of each lease
    int refused;                           ///< because the other process was the owner
    int wrong;
};

using Results = std::array<Result, 2>;

std::string identifierOf(int process, int number) {
    return "lease " + std::to_string(number) + " of process " + std::to_string(process);
}

/** Requests one change, and repeats the request while the other process is the owner. */
void change(ManagedGate& gate, int process, int number, Result& result) {
    const int leaseNumber = number % leases;
    const std::string id = identifierOf(process, leaseNumber);
    const std::vector<NamedValue> values{named("LeaseTerm", uint32(static_cast<unsigned int>(number + 1)))};
    for (;;) {
        const bool exists = result.acknowledged[static_cast<std::size_t>(leaseNumber)] != 0;
        const cimhost::Status status = exists ? gate.modify(keyedPath(lease, id), values) : gate.create(id, values);
        if (status.rc == CMPI_RC_OK) {
            result.acknowledged[static_cast<std::size_t>(leaseNumber)] = number + 1;
            return;
        }
        if (status.rc != CMPI_RC_ERR_FAILED || status.message.find("is in use by process") == std::string::npos) {
            std::cout << id << ": code " << status.rc << ": " << status.message << std::endl;
            ++result.wrong;
            return;
        }
        ++result.refused;
    }
}

void work(int process, int changes, Result& result) {
    for (int done = 0; done < changes; done += changesPerOwner) {
        ManagedGate gate(cimhost::lab::Manager::standard);
        for (int number = done; number < std::min(done + changesPerOwner, changes); ++number) {
            change(gate, process, number, result);
        }
    }
}

/** Compares the leases with the responses that the processes have received. Returns the number of differences. */
int check(const Results& results) {
    ManagedGate gate(cimhost::lab::Manager::standard);
    int wrong = gate.paths(lease).size() == 2 * leases ? 0 : 1;
    for (int process = 0; process < 2; ++process) {
        for (int number = 0; number < leases; ++number) {
            const int expected =
                results[static_cast<std::size_t>(process)].acknowledged[static_cast<std::size_t>(number)];
            const Instance instance = gate.instanceOf(keyedPath(lease, identifierOf(process, number)));
            const std::string value = valueIn(instance, "LeaseTerm").value_or("(none)");
            if (value != std::to_string(expected)) {
                std::cout << identifierOf(process, number) << " is " << value << ", not " << expected << '\n';
                ++wrong;
            }
        }
    }
    return wrong;
}

int run(int changes) {
    auto& results = sharedMemory<Results>();
    for (int process = 0; process < 2; ++process) {
        if (fork() == 0) {
            work(process, changes, results[static_cast<std::size_t>(process)]);
            _exit(0);
        }
    }
    int errors = 0;
    for (int process = 0; process < 2; ++process) {
        int status = 0;
        errors += wait(&status) > 0 && WIFEXITED(status) && WEXITSTATUS(status) == 0 ? 0 : 1;
    }
    errors += check(results) + results[0].wrong + results[1].wrong;
    std::cout << "changes " << 2 * changes << ", refused because of the owner "
              << results[0].refused + results[1].refused << ", errors " << errors << '\n';
    return errors == 0 ? 0 : 1;
}

}  // namespace
}  // namespace gatetest

int main(int count, char** arguments) {
    const int changes = count == 2 ? std::atoi(arguments[1]) : 0;
    if (changes < 5) {
        std::cerr << "Usage: gate_two_processes_run CHANGES\n";
        return 2;
    }
    return gatetest::run(changes);
}
