#include <benchmark/benchmark.h>
#include <malloc.h>

#include <exception>
#include <iostream>
#include <limits>

#include "Cases.h"

namespace {

void registerAll(bench::Environment& environment, bool& failed) {
    bench::registerLoading(environment, failed);
    for (const auto& cases : {bench::recordCases(), bench::productCases(), bench::associationCases()}) {
        for (const bench::Case& one : cases) {
            bench::registerCase(one, environment, failed);
        }
    }
}

/** @return whether a benchmark ran and all responses were right */
bool run() {
    bench::Environment environment;
    bool failed = false;
    registerAll(environment, failed);
    const bool any = benchmark::RunSpecifiedBenchmarks() > 0;
    if (failed) {
        std::cerr << "Some responses were wrong: see the errors above.\n";
    }
    return any && !failed;
}

}  // namespace

int main(int argc, char** argv) {
    // Keep freed memory in the process; otherwise the time of large responses includes requesting it from the kernel.
    mallopt(M_TRIM_THRESHOLD, std::numeric_limits<int>::max());
    // Merge freed blocks at once; otherwise a request may merge the blocks that earlier requests freed.
    mallopt(M_MXFAST, 0);
    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv)) {
        return 1;
    }
    benchmark::AddCustomContext("compiler", BENCH_COMPILER);
    benchmark::AddCustomContext("build_type", BENCH_BUILD_TYPE);
    try {
        return run() ? 0 : 1;
    } catch (const std::exception& failure) {
        std::cerr << failure.what() << '\n';
        return 1;
    }
}
