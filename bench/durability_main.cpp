// Measures the cost of durable storage: modifies, creates with values and reads one of 100 leases.
//
// Usage: durability_benchmark [REQUESTS]
//
// Prints per request the median time in microseconds and the mean number of syncs: of the provider alone, of the gate
// without syncs, of the gate, and of the gate on a disk on which each sync takes a millisecond. The provider ignores
// the values of a creation, so without the gate a creation with values is a creation and a modification.

#include <dlfcn.h>
#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include "Environment.h"

namespace {

using Clock = std::chrono::steady_clock;
using Microseconds = std::chrono::duration<double, std::micro>;

enum class Syncs { omitted, real, slow };

Syncs syncs = Syncs::real;
int syncCount = 0;

double median(std::vector<double> values) {
    std::sort(values.begin(), values.end());
    return values.at(values.size() / 2);
}

template <class Work>
double timeOf(Work work) {
    const auto start = Clock::now();
    work();
    return Microseconds(Clock::now() - start).count();
}

/** The time of one sync of a small file in a directory. */
double syncTime(const std::string& directory, int times) {
    const int file = open((directory + "/sync").c_str(), O_WRONLY | O_CREAT, 0600);
    std::vector<double> values;
    for (int index = 0; index < times; ++index) {
        if (file < 0 || pwrite(file, &index, sizeof index, 0) != sizeof index) {
            throw std::runtime_error("cannot write in " + directory);
        }
        values.push_back(timeOf([&] { fsync(file); }));
    }
    close(file);
    return median(values);
}

struct Case {
    const char* name;
    bool isGated;
    Syncs syncs;
};

constexpr std::size_t leases = 100;

using Requests = std::vector<bench::ExpectedRequest>;

/** A kind of request. Its values contain a number that differs per request. */
struct TimedRequests {
    const char* name;
    Requests (*timed)(int number, bool isGated);
    Requests (*after)();  ///< restores the number of leases
};

cimhost::ObjectPath pathOf(std::size_t number) {
    return bench::recordPath("VELKO_Lease", bench::instanceIdOf(number, leases));
}

const cimhost::ObjectPath& newPath() {
    static const cimhost::ObjectPath path = bench::recordPath("VELKO_Lease", "new lease");
    return path;
}

cimhost::NamedValue lessor(int number) {
    return bench::namedString("Lessor", "Lessor " + std::to_string(1000 + number));
}

Requests noRequests() {
    return {};
}

Requests read(int, bool) {
    return {{cimhost::Request::getInstance(pathOf(7)), 1}};
}

Requests modification(int number, bool) {
    return {{bench::modification(pathOf(7), lessor(number))}};
}

Requests creation(int number, bool isGated) {
    if (isGated) {
        return {{cimhost::Request::createInstance(newPath(), {newPath(), {lessor(number)}}), 1}};
    }
    return {{bench::creation(newPath()), 1}, {bench::modification(newPath(), lessor(number))}};
}

Requests deletion() {
    return {{cimhost::Request::deleteInstance(newPath())}};
}

constexpr TimedRequests allRequests[] = {
    {"read", read, noRequests},
    {"modification", modification, noRequests},
    {"creation with a value", creation, deletion},
};

void perform(bench::Environment& environment, const bench::Interfaces& interfaces, const Requests& requests) {
    for (const bench::ExpectedRequest& each : requests) {
        bench::requireExpected(each, bench::perform(environment.broker(), each.request, interfaces));
    }
}

void measure(bench::Environment& environment, const Case& tested, const TimedRequests& requests, int count) {
    syncs = Syncs::real;
    const auto entry = tested.isGated ? bench::ProviderEntry::ofGate() : bench::ProviderEntry::ofProvider();
    const bench::Interfaces interfaces = environment.loadBoth(leases, entry);
    syncs = tested.syncs;
    std::vector<double> values;
    int timedSyncs = 0;
    for (int index = -2; index < count; ++index) {
        const Requests timed = requests.timed(index + 2, tested.isGated);
        const int syncsBefore = syncCount;
        const double time = timeOf([&] { perform(environment, interfaces, timed); });
        if (index >= 0) {
            values.push_back(time);  // excludes the first two requests, which also create the saved copies
            timedSyncs += syncCount - syncsBefore;
        }
        perform(environment, interfaces, requests.after());
    }
    syncs = Syncs::real;
    std::printf("%-24s %-28s %8.0f %8.1f\n", requests.name, tested.name, median(values),
                static_cast<double>(timedSyncs) / count);
}

void run(int count) {
    bench::Environment environment;
    std::printf("%-24s %-28s %8s %8s\n", "one among 100 leases", "", "us", "syncs");
    for (const TimedRequests& requests : allRequests) {
        for (const Case& each :
             {Case{"provider alone", false, Syncs::real}, Case{"gate, syncs omitted", true, Syncs::omitted},
              Case{"gate", true, Syncs::real}, Case{"gate, each sync takes 1 ms", true, Syncs::slow}}) {
            measure(environment, each, requests, count);
        }
    }
    environment.unload();
    std::printf("%-53s %8.0f\n", "one sync on this disk", syncTime(environment.agent().data(), count));
}

}  // namespace

/** Replaces the system's fsync in this program and its libraries. Counts syncs, and omits or delays them. */
extern "C" __attribute__((visibility("default"))) int fsync(int file) {
    static const auto next = reinterpret_cast<int (*)(int)>(dlsym(RTLD_NEXT, "fsync"));
    ++syncCount;
    if (syncs == Syncs::omitted) {
        return 0;
    }
    const auto end = Clock::now() + std::chrono::milliseconds(1);
    const int result = next(file);
    if (syncs == Syncs::slow) {
        std::this_thread::sleep_until(end);
    }
    return result;
}

int main(int count, char** arguments) {
    const int requests = count > 1 ? std::atoi(arguments[1]) : 500;
    if (requests < 1 || count > 2) {
        std::fputs("Usage: durability_benchmark [REQUESTS]\n", stderr);
        return 2;
    }
    try {
        run(requests);
    } catch (const std::exception& failure) {
        std::fprintf(stderr, "durability_benchmark: %s\n", failure.what());
        return 1;
    }
    return 0;
}
