#include "Cases.h"
#include "Holdings.h"

#include <benchmark/benchmark.h>
#include <malloc.h>

#include <algorithm>
#include <exception>
#include <fstream>
#include <functional>
#include <iterator>
#include <limits>
#include <optional>
#include <stdexcept>

namespace bench {

namespace {

std::string fileText(const std::filesystem::path& file) {
    std::ifstream stream(file, std::ios::binary);
    if (!stream) {
        throw std::runtime_error("there is no " + file.string());
    }
    return {std::istreambuf_iterator<char>(stream), {}};
}

/** Performs a request once an iteration. @param interfaces gives what answers it @return the last outcome */
template <class GiveInterfaces>
Outcome measure(benchmark::State& state, Workbench& bench, const Request& request, GiveInterfaces interfaces) {
    Outcome outcome;
    for (auto _ : state) {
        outcome = {};
        outcome = perform(bench.broker(), request, interfaces());
        state.SetIterationTime(outcome.seconds);
        requireAnswered(request, outcome);
    }
    return outcome;
}

void measureFloor(benchmark::State& state, Workbench& bench, const Case& one) {
    std::unique_ptr<Floor> floor;
    measure(state, bench, one.request, [&] {
        if (floor == nullptr || !one.changedFile.empty()) {
            floor = one.floor(bench, bench.broker().handle());
        }
        return floor->interfaces();
    });
}

void measureProvider(benchmark::State& state, Workbench& bench, const Case& one) {
    const auto askFloor = [&] {
        return perform(bench.broker(), one.request, one.floor(bench, bench.broker().handle())->interfaces());
    };
    askFloor();  // the memory for the answer is now in the process, and no side pays for getting it
    const Outcome outcome = measure(state, bench, one.request, [&] { return one.provider(bench); });
    requireSame(outcome.events, askFloor().events);
    if (!one.changedFile.empty() &&
        fileText(bench.agent().data() / one.changedFile) != fileText(bench.agent().floorData() / one.changedFile)) {
        throw std::runtime_error("the record file is not what it should be after the change");
    }
}

/** The time of a request. @throws std::runtime_error unless the answer is the expected one */
double secondsOf(Workbench& bench, const Request& request, const Interfaces& interfaces, const Outcome& expected) {
    const Outcome outcome = perform(bench.broker(), request, interfaces);
    requireAnswered(request, outcome);
    requireSame(outcome.events, expected.events);
    return outcome.seconds;
}

/** The clock of a virtual machine may stand still over a short request: no time is no measurement. */
void keepBest(double& best, double seconds) {
    best = seconds > 0 ? std::min(best, seconds) : best;
}

/**
 * Performs a request on the provider alone and behind the gate in turn, so that what else the machine does falls on
 * both. The best time of each, in seconds, is told beside the mean.
 */
void measureGate(benchmark::State& state, Workbench& bench, const Case& one) {
    constexpr int turns = 10;  // in an iteration, of which there may be few
    const auto [alone, gated] = one.twice(bench);
    const std::unique_ptr<Floor> floor = one.floor(bench, bench.broker().handle());
    const Outcome expected = perform(bench.broker(), one.request, floor->interfaces());
    double bestAlone = std::numeric_limits<double>::max();
    double bestGated = bestAlone;
    for (auto _ : state) {
        double seconds = 0;
        for (int turn = 0; turn < turns; ++turn) {
            keepBest(bestAlone, secondsOf(bench, one.request, alone, expected));
            const double latest = secondsOf(bench, one.request, gated, expected);
            keepBest(bestGated, latest);
            seconds += latest / turns;
        }
        state.SetIterationTime(seconds);
    }
    state.counters["alone"] = bestAlone;
    state.counters["gated"] = bestGated;
}

/** Registers a benchmark that measures its own time; what it throws makes it fail. */
void registerBenchmark(const std::string& name, bool& failed, const std::function<void(benchmark::State&)>& body) {
    const auto guarded = [&failed, body](benchmark::State& state) {
        try {
            body(state);
        } catch (const std::exception& failure) {
            failed = true;
            state.SkipWithError(failure.what());
        }
    };
#ifndef __clang_analyzer__  // it takes the benchmark, which the library keeps, for a leak
    benchmark::RegisterBenchmark(name.c_str(), guarded)->UseManualTime()->Unit(benchmark::kMicrosecond);
#endif
}

template <class Row>
void measureLoading(benchmark::State& state, Workbench& bench, std::size_t size) {
    bench.unload();
    const std::filesystem::path file = bench.agent().data() / Row::fileName;
    writeRows(file, makeRows<Row>(size));
    const auto perRecord = [&](std::size_t bytes) { return static_cast<double>(bytes) / static_cast<double>(size); };
    state.counters["text_per_record"] = perRecord(std::filesystem::file_size(file));
    for (auto _ : state) {
        ::malloc_trim(0);  // what earlier iterations freed must not be there to be taken again
        const Holdings before = holdings();
        double begin = processorSeconds();
        std::optional<SharedLibrary> library(Entrance::provided().file);
        double seconds = processorSeconds() - begin;
        const Holdings after = holdings();
        state.counters["bytes_per_record"] = perRecord(after.resident - before.resident);
        state.counters["table_per_record"] = perRecord(after.mapped - before.mapped);
        state.counters["pieces_per_record"] = perRecord((after.heap - after.mapped) - (before.heap - before.mapped));
        begin = processorSeconds();
        library.reset();
        state.SetIterationTime(seconds + processorSeconds() - begin);
        if (SharedLibrary::isLoaded(Entrance::provided().file)) {
            throw std::runtime_error("the provider library stays in the process");
        }
    }
    const Request request = enumInstanceNames(Row::className, size);
    requireAnswered(request, perform(bench.broker(), request, bench.loaded<Row>(size)));
}

template <class Row>
void measureReading(benchmark::State& state, const Workbench& bench, std::size_t size) {
    const std::filesystem::path file = bench.agent().floorData() / Row::fileName;
    writeRows(file, makeRows<Row>(size));
    for (auto _ : state) {
        const double begin = processorSeconds();
        std::vector<Row> rows = readRows<Row>(file);
        const bool right = rows.size() == size && rows.back().instanceId == instanceIdOf(size - 1, size);
        rows = {};
        state.SetIterationTime(processorSeconds() - begin);
        if (!right) {
            throw std::runtime_error("the record file was not read");
        }
    }
}

template <class Row>
void registerLoadingOf(Workbench& workbench, const std::vector<std::size_t>& sizes, bool& failed) {
    const std::string name = std::string("Load/") + Row::className;
    for (const std::size_t size : sizes) {
        registerBenchmark(name + "/provider/" + std::to_string(size), failed,
                          [&workbench, size](benchmark::State& state) { measureLoading<Row>(state, workbench, size); });
        registerBenchmark(name + "/floor/" + std::to_string(size), failed,
                          [&workbench, size](benchmark::State& state) { measureReading<Row>(state, workbench, size); });
    }
}

}  // namespace

void registerCase(const Case& one, Workbench& workbench, bool& failed) {
    const std::string name = one.operation + '/' + one.className;
    const auto registerSide = [&](const char* side, auto measureSide) {
        registerBenchmark(name + side + std::to_string(one.size), failed,
                          [&workbench, one, measureSide](benchmark::State& state) {
                              workbench.computers().count = one.computers;
                              measureSide(state, workbench, one);
                          });
    };
    registerSide("/provider/", &measureProvider);
    if (one.twice) {
        registerSide("/gate/", &measureGate);
    }
    registerSide("/floor/", &measureFloor);
}

void registerLoading(Workbench& workbench, bool& failed) {
    std::vector<std::size_t> leaseSizes = readSizes;
    leaseSizes.push_back(largestSize);
    registerLoadingOf<LeaseRow>(workbench, leaseSizes, failed);
    registerLoadingOf<WarrantyRow>(workbench, readSizes, failed);
}

}  // namespace bench
