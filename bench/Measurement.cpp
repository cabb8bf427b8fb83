#include "Cases.h"
#include "Holdings.h"

#include <benchmark/benchmark.h>
#include <malloc.h>

#include <algorithm>
#include <cstddef>
#include <exception>
#include <fstream>
#include <functional>
#include <iterator>
#include <optional>
#include <stdexcept>
#include <utility>
#include <vector>

namespace bench {

namespace {

std::string fileText(const std::filesystem::path& file) {
    std::ifstream stream(file, std::ios::binary);
    if (!stream) {
        throw std::runtime_error("there is no " + file.string());
    }
    return {std::istreambuf_iterator<char>(stream), {}};
}

/** @throws std::runtime_error unless a change by the provider left what the floor's left */
void requireSameFile(const Workbench& bench, const Case& one) {
    if (!one.changedFile.empty() &&
        fileText(bench.agent().data() / one.changedFile) != fileText(bench.agent().floorData() / one.changedFile)) {
        throw std::runtime_error("the record file is not what it should be after the change");
    }
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
    requireSameFile(bench, one);
}

/** The time of a request. @throws std::runtime_error unless the answer is the expected one */
double secondsOf(Workbench& bench, const Request& request, const Interfaces& interfaces, const Outcome& expected) {
    const Outcome outcome = perform(bench.broker(), request, interfaces);
    requireAnswered(request, outcome);
    requireSame(outcome.events, expected.events);
    return outcome.seconds;
}

/** The middle of some times: neither what disturbs some of them nor a clock that goes in leaps counts. */
double middle(std::vector<double> seconds) {
    const auto half = seconds.begin() + static_cast<std::ptrdiff_t>(seconds.size() / 2);
    std::nth_element(seconds.begin(), half, seconds.end());
    if (*half <= 0) {
        throw std::runtime_error("the clock stands still");
    }
    return *half;
}

/** Times two sides in turn, so that what else the machine does falls on both. The middle time of each is told. */
void measureInTurn(benchmark::State& state, int turns, const char* firstName, const std::function<double()>& first,
                   const char* secondName, const std::function<double()>& second) {
    std::vector<double> firstTimes;
    std::vector<double> secondTimes;
    for (auto _ : state) {
        double seconds = 0;
        for (int turn = 0; turn < turns; ++turn) {
            firstTimes.push_back(first());
            secondTimes.push_back(second());
            seconds += firstTimes.back() + secondTimes.back();
        }
        state.SetIterationTime(seconds);
    }
    state.counters[firstName] = middle(std::move(firstTimes));
    state.counters[secondName] = middle(std::move(secondTimes));
}

/** How often each side has its turn in an iteration, of which there may be one only. */
int turnsFor(const Case& one) {
    return one.size < largestSize ? 10 : 3;
}

void measureBoth(benchmark::State& state, Workbench& bench, const Case& one) {
    std::unique_ptr<Floor> floor;
    const auto askFloor = [&] {
        if (floor == nullptr || !one.changedFile.empty()) {
            floor = one.floor(bench, bench.broker().handle());
        }
        return perform(bench.broker(), one.request, floor->interfaces());
    };
    Outcome latest;
    const auto timeFloor = [&] {
        latest = {};  // both sides find the same memory in the process, and free
        const Outcome outcome = askFloor();
        requireAnswered(one.request, outcome);
        return outcome.seconds;
    };
    const auto timeProvider = [&] {
        latest = perform(bench.broker(), one.request, one.provider(bench));
        requireAnswered(one.request, latest);
        return latest.seconds;
    };
    timeFloor();
    measureInTurn(state, turnsFor(one), "floor", timeFloor, "provider", timeProvider);
    requireSame(latest.events, askFloor().events);
    requireSameFile(bench, one);
}

/** The provider alone and behind the gate. */
void measureGate(benchmark::State& state, Workbench& bench, const Case& one) {
    const auto sides = one.twice(bench);
    const std::unique_ptr<Floor> floor = one.floor(bench, bench.broker().handle());
    const Outcome expected = perform(bench.broker(), one.request, floor->interfaces());
    const auto time = [&](const Interfaces& side) { return secondsOf(bench, one.request, side, expected); };
    measureInTurn(
        state, turnsFor(one), "alone", [&] { return time(sides.first); }, "gated", [&] { return time(sides.second); });
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
void registerLoadingOf(Workbench& workbench, std::size_t size, bool& failed) {
    const std::string name = std::string("Load/") + Row::className;
    registerBenchmark(name + "/provider/" + std::to_string(size), failed,
                      [&workbench, size](benchmark::State& state) { measureLoading<Row>(state, workbench, size); });
    registerBenchmark(name + "/floor/" + std::to_string(size), failed,
                      [&workbench, size](benchmark::State& state) { measureReading<Row>(state, workbench, size); });
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
    registerSide("/both/", &measureBoth);
}

void registerLoading(Workbench& workbench, bool& failed) {
    // From small to large: a table that found room in what a larger one has left would not be told from its texts.
    for (const std::size_t size : readSizes) {
        registerLoadingOf<WarrantyRow>(workbench, size, failed);
        registerLoadingOf<LeaseRow>(workbench, size, failed);
    }
    registerLoadingOf<LeaseRow>(workbench, largestSize, failed);
}

}  // namespace bench
