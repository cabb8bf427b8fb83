#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <vector>

#include "Target.h"
#include "support/Files.h"

// Runs a fuzzer with the inputs of its corpus, without the fuzzing engine.

namespace {

std::vector<std::filesystem::path> corpus() {
    std::vector<std::filesystem::path> files;
    for (const auto& entry : std::filesystem::directory_iterator(FUZZ_CORPUS)) {
        files.push_back(entry.path());
    }
    std::sort(files.begin(), files.end());
    return files;
}

void check(const std::string& input) {
    try {
        LLVMFuzzerTestOneInput(reinterpret_cast<const std::uint8_t*>(input.data()), input.size());
    } catch (const std::exception& violation) {
        ADD_FAILURE() << violation.what();
    }
}

TEST(FuzzCorpusTest, FUZZ_NAME) {
    const auto files = corpus();
    ASSERT_FALSE(files.empty()) << FUZZ_CORPUS;
    for (const auto& file : files) {
        SCOPED_TRACE(file.filename());
        check(testsupport::readFile(file));
    }
    SCOPED_TRACE("empty input");
    check({});
}

}  // namespace
