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

#include "Cases.h"
#include "ProcessResources.h"

namespace bench {

namespace {

std::string contentOf(const std::filesystem::path& file) {
    std::ifstream stream(file, std::ios::binary);
    if (!stream) {
        throw std::runtime_error("there is no " + file.string());
    }
    return {std::istreambuf_iterator<char>(stream), {}};
}

/** @throws std::runtime_error unless the provider and the baseline wrote equal files */
void requireSameFile(const Environment& environment, const Case& one) {
    if (!one.changedFile.empty() && contentOf(environment.agent().data() / one.changedFile) !=
                                        contentOf(environment.agent().baselineData() / one.changedFile)) {
        throw std::runtime_error("the record file differs from the baseline's");
    }
}

/** Performs a request once per iteration. @param load returns the interfaces  @return the last response */
template <class Load>
TimedResponse measure(benchmark::State& state, Environment& environment, const ExpectedRequest& request, Load load) {
    TimedResponse response;
    for (auto _ : state) {
        response = {};
        response = perform(environment.broker(), request.request, load());
        state.SetIterationTime(response.seconds);
        requireExpected(request, response);
    }
    return response;
}

void measureBaseline(benchmark::State& state, Environment& environment, const Case& one) {
    std::unique_ptr<Baseline> baseline;
    measure(state, environment, one.request, [&] {
        if (baseline == nullptr || !one.changedFile.empty()) {
            baseline = one.baseline(environment, environment.broker().handle());
        }
        return baseline->interfaces();
    });
}

void measureProvider(benchmark::State& state, Environment& environment, const Case& one) {
    const auto performBaseline = [&] {
        return perform(environment.broker(), one.request.request,
                       one.baseline(environment, environment.broker().handle())->interfaces());
    };
    performBaseline();  // allocates the memory of the response, so that its allocation is not measured
    const TimedResponse response = measure(state, environment, one.request, [&] { return one.provider(environment); });
    requireSame(response.events, performBaseline().events);
    requireSameFile(environment, one);
}

/** The time of a request. @throws std::runtime_error if the response is not the expected one */
double secondsOf(Environment& environment, const ExpectedRequest& request, const Interfaces& interfaces,
                 const TimedResponse& expected) {
    const TimedResponse response = perform(environment.broker(), request.request, interfaces);
    requireExpected(request, response);
    requireSame(response.events, expected.events);
    return response.seconds;
}

/** The median, which outliers and a coarse clock hardly affect. */
double median(std::vector<double> seconds) {
    const auto half = seconds.begin() + static_cast<std::ptrdiff_t>(seconds.size() / 2);
    std::nth_element(seconds.begin(), half, seconds.end());
    if (*half <= 0) {
        throw std::runtime_error("the clock does not advance");
    }
    return *half;
}

/** Times two sides alternately, so that other work of the machine affects both. Reports the median of each. */
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
    state.counters[firstName] = median(std::move(firstTimes));
    state.counters[secondName] = median(std::move(secondTimes));
}

/** The number of requests per side and iteration, so that even one iteration has a median. */
int turnsFor(const Case& one) {
    return one.size < largestSize ? 10 : 3;
}

void measureBoth(benchmark::State& state, Environment& environment, const Case& one) {
    std::unique_ptr<Baseline> baseline;
    const auto performBaseline = [&] {
        if (baseline == nullptr || !one.changedFile.empty()) {
            baseline = one.baseline(environment, environment.broker().handle());
        }
        return perform(environment.broker(), one.request.request, baseline->interfaces());
    };
    TimedResponse latest;
    const auto timeBaseline = [&] {
        latest = {};  // frees its memory, so that both sides start with the same free memory
        const TimedResponse response = performBaseline();
        requireExpected(one.request, response);
        return response.seconds;
    };
    const auto timeProvider = [&] {
        latest = perform(environment.broker(), one.request.request, one.provider(environment));
        requireExpected(one.request, latest);
        return latest.seconds;
    };
    timeBaseline();
    measureInTurn(state, turnsFor(one), "baseline", timeBaseline, "provider", timeProvider);
    requireSame(latest.events, performBaseline().events);
    requireSameFile(environment, one);
}

/** Measures the provider alone and behind the gate. */
void measureGate(benchmark::State& state, Environment& environment, const Case& one) {
    const auto sides = one.twice(environment);
    const std::unique_ptr<Baseline> baseline = one.baseline(environment, environment.broker().handle());
    const TimedResponse expected = perform(environment.broker(), one.request.request, baseline->interfaces());
    const auto time = [&](const Interfaces& side) { return secondsOf(environment, one.request, side, expected); };
    measureInTurn(
        state, turnsFor(one), "alone", [&] { return time(sides.first); }, "gated", [&] { return time(sides.second); });
}

/** Registers a benchmark whose body sets the measured time. The benchmark fails if the body throws an exception. */
void registerBenchmark(const std::string& name, bool& failed, const std::function<void(benchmark::State&)>& body) {
    const auto guarded = [&failed, body](benchmark::State& state) {
        try {
            body(state);
        } catch (const std::exception& failure) {
            failed = true;
            state.SkipWithError(failure.what());
        }
    };
#ifndef __clang_analyzer__  // the library owns the benchmark, which the analyzer reports as a leak
    benchmark::RegisterBenchmark(name.c_str(), guarded)->UseManualTime()->Unit(benchmark::kMicrosecond);
#endif
}

template <class Row>
void measureLoading(benchmark::State& state, Environment& environment, std::size_t size) {
    environment.unload();
    const std::filesystem::path file = environment.agent().data() / Row::fileName;
    writeRows(file, makeRows<Row>(size));
    const auto perRecord = [&](std::size_t bytes) { return static_cast<double>(bytes) / static_cast<double>(size); };
    state.counters["file_per_record"] = perRecord(std::filesystem::file_size(file));
    for (auto _ : state) {
        ::malloc_trim(0);  // returns to the kernel the memory that earlier iterations freed
        const ProcessResources before = processResources();
        double begin = processorSeconds();
        std::optional<cimhost::LoadedLibrary> library(std::in_place, ProviderEntry::ofProvider().file, libraryFlags);
        double seconds = processorSeconds() - begin;
        const ProcessResources after = processResources();
        state.counters["bytes_per_record"] = perRecord(after.resident - before.resident);
        state.counters["table_per_record"] = perRecord(after.mapped - before.mapped);
        state.counters["pieces_per_record"] = perRecord((after.heap - after.mapped) - (before.heap - before.mapped));
        begin = processorSeconds();
        library.reset();
        state.SetIterationTime(seconds + processorSeconds() - begin);
        if (isLoaded(ProviderEntry::ofProvider().file)) {
            throw std::runtime_error("the provider library was not unloaded");
        }
    }
    const ExpectedRequest request{cimhost::Request::enumerateInstanceNames(classPath(Row::className)), size};
    requireExpected(request, perform(environment.broker(), request.request, environment.loaded<Row>(size)));
}

template <class Row>
void measureReading(benchmark::State& state, const Environment& environment, std::size_t size) {
    const std::filesystem::path file = environment.agent().baselineData() / Row::fileName;
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
void registerLoadingOf(Environment& environment, std::size_t size, bool& failed) {
    const std::string name = std::string("Load/") + Row::className;
    registerBenchmark(name + "/provider/" + std::to_string(size), failed,
                      [&environment, size](benchmark::State& state) { measureLoading<Row>(state, environment, size); });
    registerBenchmark(name + "/baseline/" + std::to_string(size), failed,
                      [&environment, size](benchmark::State& state) { measureReading<Row>(state, environment, size); });
}

}  // namespace

void registerCase(const Case& one, Environment& environment, bool& failed) {
    const std::string name = one.operation + '/' + one.className;
    const auto registerSide = [&](const char* side, auto measureSide) {
        registerBenchmark(name + side + std::to_string(one.size), failed,
                          [&environment, one, measureSide](benchmark::State& state) {
                              environment.computers().count = one.computers;
                              measureSide(state, environment, one);
                          });
    };
    registerSide("/provider/", &measureProvider);
    if (one.twice) {
        registerSide("/gate/", &measureGate);
    }
    registerSide("/baseline/", &measureBaseline);
    registerSide("/both/", &measureBoth);
}

void registerLoading(Environment& environment, bool& failed) {
    // From small to large, so that a table does not reuse the memory of a larger one.
    for (const std::size_t size : readSizes) {
        registerLoadingOf<WarrantyRow>(environment, size, failed);
        registerLoadingOf<LeaseRow>(environment, size, failed);
    }
    registerLoadingOf<LeaseRow>(environment, largestSize, failed);
}

}  // namespace bench
