// Uses the provider for long, and fails when the process holds on to more and more. To be exact it wants the
// environment variable GLIBC_TUNABLES=glibc.malloc.tcache_count=0: the C library counts what its caches keep as in use.

#include "Soak.h"

#include <CLI/CLI.hpp>

#include <cstdio>
#include <exception>
#include <iostream>
#include <string>
#include <vector>

namespace {

/** What a record that was deleted may keep, its texts included. */
constexpr std::size_t bytesOfDeletion = 512;

/** Heap and memory in use go up and down a little with the lengths of the latest texts. */
constexpr std::size_t heapTolerance = 4096;
constexpr std::size_t residentTolerance = 2 * 1024 * 1024;

struct Sample {
    std::size_t done;
    bench::Holdings held;
};

class Report {
public:
    explicit Report(const char* what) {
        std::printf("%12s %14s %14s %8s %8s\n", what, "heap bytes", "resident KiB", "files", "threads");
    }

    void add(std::size_t done, const bench::Holdings& now) {
        samples.push_back({done, now});
        std::printf("%12zu %14zu %14zu %8zu %8zu\n", done, now.heap, now.resident / 1024, now.descriptors, now.threads);
        std::fflush(stdout);
    }

    /** Compares the first tenth with the last. @return whether nothing grew beyond what is allowed */
    bool hasNotGrown(std::size_t allowedBytes) const {
        const bench::Holdings& first = samples.front().held;
        const bench::Holdings& last = samples.back().held;
        return judge("heap", first.heap, last.heap, allowedBytes + heapTolerance) &&
               judge("memory", first.resident, last.resident, allowedBytes + residentTolerance) &&
               judge("open files", first.descriptors, last.descriptors, 0) &&
               judge("threads", first.threads, last.threads, 0);
    }

private:
    static bool judge(const char* what, std::size_t first, std::size_t last, std::size_t allowed) {
        if (last > first + allowed) {
            std::cerr << what << " grew from " << first << " to " << last << ", allowed are " << allowed << " more\n";
            return false;
        }
        return true;
    }

    std::vector<Sample> samples;
};

bool soak(std::size_t cycles, std::size_t requests, bool gated) {
    bench::Workbench workbench(bench::AgentStays::no);
    bench::Soak soak(workbench, gated);
    Report cycleReport("cycles");
    soak.cycle(cycles, [&](std::size_t done, const bench::Holdings& now) { cycleReport.add(done, now); });
    const std::size_t unloadedBefore = bench::holdings().heap;
    const std::size_t deletedBefore = soak.deletions();
    Report requestReport("requests");
    soak.request(requests, [&](std::size_t done, const bench::Holdings& now) { requestReport.add(done, now); });
    const std::size_t unloadedAfter = bench::holdings().heap;
    const std::size_t deletions = soak.deletions() - deletedBefore;
    std::printf("%zu records were deleted meanwhile; heap without the library: %zu bytes before, %zu after\n",
                deletions, unloadedBefore, unloadedAfter);
    if (unloadedAfter > unloadedBefore + heapTolerance) {
        std::cerr << "unloading the library does not give its memory back\n";
        return false;
    }
    return cycleReport.hasNotGrown(0) && requestReport.hasNotGrown(deletions * bytesOfDeletion);
}

}  // namespace

int main(int argc, char** argv) {
    CLI::App arguments("Uses the provider for long, and fails when the process holds on to more and more.");
    std::size_t cycles = 1000;
    std::size_t requests = 1000000;
    bool gated = false;
    arguments.add_option("--cycles", cycles, "How often the library is loaded, used and unloaded")
        ->check(CLI::Range(10, 1000000))
        ->capture_default_str();
    arguments.add_option("--requests", requests, "How many requests follow")
        ->check(CLI::Range(10, 1000000000))
        ->capture_default_str();
    arguments.add_flag("--gate", gated, "Put the gate before the provider");
    CLI11_PARSE(arguments, argc, argv);
    try {
        return soak(cycles, requests, gated) ? 0 : 1;
    } catch (const std::exception& failure) {
        std::cerr << failure.what() << '\n';
        return 1;
    }
}
