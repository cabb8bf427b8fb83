// Sends many requests to the provider, and fails if the process's resources grow. Set the environment variable
// GLIBC_TUNABLES=glibc.malloc.tcache_count=0 for exact figures; otherwise, they include the C library's caches.

#include <CLI/CLI.hpp>
#include <cstdio>
#include <exception>
#include <iostream>
#include <string>
#include <vector>

#include "Soak.h"

namespace {

/** The memory that a deleted record and its strings may keep. */
constexpr std::size_t bytesOfDeletion = 512;

/** Heap and resident memory vary with the lengths of the current strings. */
constexpr std::size_t heapTolerance = 4096;
constexpr std::size_t residentTolerance = 2 * 1024 * 1024;

struct Sample {
    std::size_t done;
    bench::ProcessResources resources;
};

class Report {
public:
    explicit Report(const char* what) {
        std::printf("%12s %14s %14s %8s %8s\n", what, "heap bytes", "resident KiB", "files", "threads");
    }

    void add(std::size_t done, const bench::ProcessResources& now) {
        samples.push_back({done, now});
        std::printf("%12zu %14zu %14zu %8zu %8zu\n", done, now.heap, now.resident / 1024, now.descriptors, now.threads);
        std::fflush(stdout);
    }

    /** Compares the first sample with the last. @return whether no resource grew by more than allowed */
    bool hasNotGrown(std::size_t allowedBytes) const {
        const bench::ProcessResources& first = samples.front().resources;
        const bench::ProcessResources& last = samples.back().resources;
        return isWithin("heap", first.heap, last.heap, allowedBytes + heapTolerance) &&
               isWithin("memory", first.resident, last.resident, allowedBytes + residentTolerance) &&
               isWithin("open files", first.descriptors, last.descriptors, 0) &&
               isWithin("threads", first.threads, last.threads, 0);
    }

private:
    static bool isWithin(const char* what, std::size_t first, std::size_t last, std::size_t allowed) {
        if (last > first + allowed) {
            std::cerr << what << " grew from " << first << " to " << last << ", more than by the allowed " << allowed
                      << "\n";
            return false;
        }
        return true;
    }

    std::vector<Sample> samples;
};

bool soak(std::size_t cycles, std::size_t requests, bool gated) {
    bench::Environment environment(bench::AgentStays::no);
    bench::Soak soak(environment, gated);
    Report cycleReport("cycles");
    soak.cycle(cycles, [&](std::size_t done, const bench::ProcessResources& now) { cycleReport.add(done, now); });
    const std::size_t unloadedBefore = bench::processResources().heap;
    const std::size_t deletedBefore = soak.deletions();
    Report requestReport("requests");
    soak.request(requests, [&](std::size_t done, const bench::ProcessResources& now) { requestReport.add(done, now); });
    const std::size_t unloadedAfter = bench::processResources().heap;
    const std::size_t deletions = soak.deletions() - deletedBefore;
    std::printf("%zu records were deleted; heap without the library: %zu bytes before, %zu after\n", deletions,
                unloadedBefore, unloadedAfter);
    if (unloadedAfter > unloadedBefore + heapTolerance) {
        std::cerr << "unloading the library did not free its memory\n";
        return false;
    }
    return cycleReport.hasNotGrown(0) && requestReport.hasNotGrown(deletions * bytesOfDeletion);
}

}  // namespace

int main(int argc, char** argv) {
    CLI::App arguments("Sends many requests to the provider, and fails if the process's resources grow.");
    std::size_t cycles = 1000;
    std::size_t requests = 1000000;
    bool gated = false;
    arguments.add_option("--cycles", cycles, "Number of times to load, use and unload the library")
        ->check(CLI::Range(10, 1000000))
        ->capture_default_str();
    arguments.add_option("--requests", requests, "Number of requests after the cycles")
        ->check(CLI::Range(10, 1000000000))
        ->capture_default_str();
    arguments.add_flag("--gate", gated, "Send the requests through the gate");
    CLI11_PARSE(arguments, argc, argv);
    try {
        return soak(cycles, requests, gated) ? 0 : 1;
    } catch (const std::exception& failure) {
        std::cerr << failure.what() << '\n';
        return 1;
    }
}
