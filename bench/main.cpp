#include "Cases.h"

#include <benchmark/benchmark.h>
#include <malloc.h>

#include <exception>
#include <iostream>
#include <limits>

namespace {

void registerAll(bench::Workbench& workbench, bool& failed) {
    bench::registerLoading(workbench, failed);
    for (const auto& cases : {bench::recordCases(), bench::productCases(), bench::associationCases()}) {
        for (const bench::Case& one : cases) {
            bench::registerCase(one, workbench, failed);
        }
    }
}

/** @return whether some benchmark was run and every answer was right */
bool run() {
    bench::Workbench workbench;
    bool failed = false;
    registerAll(workbench, failed);
    const bool any = benchmark::RunSpecifiedBenchmarks() > 0;
    if (failed) {
        std::cerr << "Some answers were wrong: see the errors above.\n";
    }
    return any && !failed;
}

}  // namespace

int main(int argc, char** argv) {
    // Memory that was used once stays in the process: else large answers are measured with the kernel's work for it.
    mallopt(M_TRIM_THRESHOLD, std::numeric_limits<int>::max());
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
