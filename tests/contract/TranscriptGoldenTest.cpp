#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <iostream>
#include <regex>
#include <set>
#include <sstream>

#include "TranscriptFixture.h"
#include "support/Files.h"

// Compares each scenario's log with its golden file.
//
// A line of a golden file is one record: channel, level, logger, function, file, line and message, separated by tabs.
// Line numbers and addresses are masked, except the fixed lines of the marker records of a request. Set UPDATE_GOLDEN=1
// in the environment to write the files instead of comparing them.

namespace contract {
namespace {

namespace fs = std::filesystem;

constexpr const char* extension = ".txt";

std::string masked(const std::string& text) {
    static const std::regex line(R"((\[Line: |, Line: |at line )[0-9]+)");
    static const std::regex address("0x[0-9a-f]+");
    return std::regex_replace(std::regex_replace(text, line, "$1N"), address, "0xN");
}

std::string goldenLine(const LogRecord& record) {
    std::ostringstream line;
    line << record.channel << '\t' << record.level << '\t' << record.logger << '\t' << record.function << '\t'
         << record.file << '\t' << (record.file == markerFile ? std::to_string(record.line) : "N") << '\t'
         << masked(record.text) << '\n';
    return line.str();
}

std::vector<std::string> linesOf(const std::string& content) {
    std::vector<std::string> lines;
    std::istringstream stream(content);
    for (std::string line; std::getline(stream, line);) {
        lines.push_back(line);
    }
    return lines;
}

/** Describes the first difference between two transcripts. */
std::string difference(const std::string& golden, const std::string& logged) {
    const auto expected = linesOf(golden);
    const auto actual = linesOf(logged);
    const auto [left, right] = std::mismatch(expected.begin(), expected.end(), actual.begin(), actual.end());
    return "at record " + std::to_string(left - expected.begin() + 1) +
           "\n  golden: " + (left == expected.end() ? "(ends)" : *left) +
           "\n  logged: " + (right == actual.end() ? "(ends)" : *right);
}

fs::path goldenFile(const Scenario& scenario) {
    return fs::path(CONTRACT_GOLDEN) / (scenario.name + extension);
}

bool isUpdate() {
    const char* update = std::getenv("UPDATE_GOLDEN");
    return update != nullptr && std::string(update) == "1";
}

class TranscriptGoldenTest : public TranscriptTest, public testing::WithParamInterface<Scenario> {};

std::string scenarioName(const testing::TestParamInfo<Scenario>& info) {
    std::string name = info.param.name;
    std::replace(name.begin(), name.end(), '-', '_');
    return name;
}

INSTANTIATE_TEST_SUITE_P(Scenarios, TranscriptGoldenTest, testing::ValuesIn(scenarios()), scenarioName);

TEST_P(TranscriptGoldenTest, MatchesTheGoldenFile) {
    std::string logged;
    for (const LogRecord& record : transcriptOf(GetParam())) {
        logged += goldenLine(record);
    }
    const fs::path file = goldenFile(GetParam());
    if (isUpdate()) {
        testsupport::writeFile(file, logged);
        std::cout << "wrote " << file.string() << "\n";
        return;
    }
    const std::string golden = testsupport::readFile(file);
    EXPECT_TRUE(golden == logged) << file.string() << "\n" << difference(golden, logged);
}

TEST(TranscriptGoldenFiles, AllBelongToScenarios) {
    std::set<std::string> expected;
    for (const Scenario& scenario : scenarios()) {
        expected.insert(goldenFile(scenario).filename().string());
    }
    EXPECT_EQ(expected.size(), scenarios().size()) << "duplicate name";
    std::set<std::string> found;
    for (const auto& entry : fs::directory_iterator(CONTRACT_GOLDEN)) {
        found.insert(entry.path().filename().string());
    }
    if (isUpdate()) {
        std::cout << "not compared while golden files are written\n";
        return;
    }
    EXPECT_EQ(found, expected);
}

}  // namespace
}  // namespace contract
