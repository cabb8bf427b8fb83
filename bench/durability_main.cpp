// Measures the cost of durable storage for a modification of one of 100 leases.
//
// Usage: durability_benchmark [CHANGES]
//
// Prints microseconds per modification, as medians of one run: by the provider alone, through the gate without syncs,
// through the gate, and through the gate on a disk on which each sync takes a millisecond.

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

bench::ExpectedRequest modification(int number) {
    return {bench::modification(bench::recordPath("VELKO_Lease", bench::instanceIdOf(7, leases)),
                                bench::namedString("Lessor", "Lessor " + std::to_string(1000 + number)))};
}

void measure(bench::Environment& environment, const Case& tested, int changes) {
    syncs = Syncs::real;
    const auto entry = tested.isGated ? bench::ProviderEntry::ofGate() : bench::ProviderEntry::ofProvider();
    const bench::Interfaces interfaces = environment.loadBoth(leases, entry);
    syncs = tested.syncs;
    std::vector<double> values;
    for (int index = -2; index < changes; ++index) {
        const bench::ExpectedRequest expected = modification(index + 2);
        const double time = timeOf([&] {
            bench::requireExpected(expected, bench::perform(environment.broker(), expected.request, interfaces));
        });
        if (index >= 0) {
            values.push_back(time);  // without the first two, which also create the saved copies
        } else {
            syncCount = 0;
        }
    }
    syncs = Syncs::real;
    std::printf("%-34s %10.0f %8.1f\n", tested.name, median(values), static_cast<double>(syncCount) / changes);
}

void run(int changes) {
    bench::Environment environment;
    std::printf("%-34s %10s %8s\n", "modification of one of 100 leases", "us", "syncs");
    for (const Case& each :
         {Case{"provider alone", false, Syncs::real}, Case{"gate, syncs omitted", true, Syncs::omitted},
          Case{"gate", true, Syncs::real}, Case{"gate, each sync takes 1 ms", true, Syncs::slow}}) {
        measure(environment, each, changes);
    }
    std::printf("%-34s %10.0f\n", "one sync on this disk", syncTime(environment.agent().data(), changes));
    environment.unload();
}

}  // namespace

/** Counts syncs, and omits or delays them. Used instead of the system's function, by the libraries too. */
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
    const int changes = count > 1 ? std::atoi(arguments[1]) : 500;
    if (changes < 1 || count > 2) {
        std::fputs("Usage: durability_benchmark [CHANGES]\n", stderr);
        return 2;
    }
    try {
        run(changes);
    } catch (const std::exception& failure) {
        std::fprintf(stderr, "durability_benchmark: %s\n", failure.what());
        return 1;
    }
    return 0;
}
