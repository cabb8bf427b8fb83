#include <gmock/gmock.h>

#include <sstream>

#include "host/cli/Program.h"

namespace cimhost::test {
namespace {

using testing::Each;
using testing::HasSubstr;
using testing::Le;
using testing::Not;

constexpr unsigned short wideTerminal = 200;
constexpr auto escape = "\033[";

std::vector<std::size_t> widthsOf(const std::string& text) {
    std::vector<std::size_t> widths;
    std::istringstream lines(text);
    for (std::string line; std::getline(lines, line);) {
        widths.push_back(line.size());
    }
    return widths;
}

/** The output without blanks and line ends, which wrapping does not change. */
std::string squeezed(std::string text) {
    text.erase(std::remove_if(text.begin(), text.end(), [](char each) { return each == ' ' || each == '\n'; }),
               text.end());
    return text;
}

TEST(Colours, AreForTerminalsOnly) {
    EXPECT_THAT(runOnTerminal({"ei", "Test_Box"}, wideTerminal).output, HasSubstr(escape));
    EXPECT_THAT(runOnTerminal({"classes"}, wideTerminal).output, HasSubstr(escape));
    EXPECT_THAT(runOnTerminal({"gi", "Test_Box.Name=\"none\""}, wideTerminal).output, HasSubstr(escape));
    EXPECT_THAT(run({"ei", "Test_Box"}).output, Not(HasSubstr(escape)));
    EXPECT_THAT(run({"gi", "Test_Box.Name=\"none\""}).error, Not(HasSubstr(escape)));
}

TEST(Colours, AreOmittedOnRequest) {
    for (const char* variable : {"NO_COLOR=1", "TERM=dumb"}) {
        const ProgramResult shown = runOnTerminal({"ei", "Test_Box"}, wideTerminal, {variable});
        EXPECT_EQ(shown.output, run({"ei", "Test_Box"}).output) << variable;
    }
    EXPECT_THAT(runOnTerminal({"--color", "never", "ei", "Test_Box"}, wideTerminal).output, Not(HasSubstr(escape)));
    EXPECT_THAT(runOnTerminal({"--color", "never", "gi", "Test_Box.Name=\"none\""}, wideTerminal).output,
                Not(HasSubstr(escape)));
}

TEST(Colours, AreUsedIfTheyAreRequested) {
    EXPECT_THAT(run({"--color", "always", "ei", "Test_Box"}).output, HasSubstr(escape));
    EXPECT_THAT(run({"--color", "always", "gi", "Test_Box.Name=\"none\""}).error, HasSubstr(escape));
    EXPECT_THAT(runOnTerminal({"--color", "always", "ei", "Test_Box"}, wideTerminal, {"NO_COLOR=1"}).output,
                HasSubstr(escape));
}

TEST(Colours, AreNotForPrograms) {
    for (const char* format : {"json", "mof"}) {
        const ProgramResult shown =
            runOnTerminal({"--color", "always", "--format", format, "ei", "Test_Box"}, wideTerminal);
        EXPECT_EQ(shown.output, run({"--format", format, "ei", "Test_Box"}).output);
    }
}

TEST(Colours, OptionHasThreeValues) {
    const ProgramResult refused = run({"--color", "blue", "ei", "Test_Box"});
    EXPECT_EQ(refused.status, 2);
    EXPECT_THAT(refused.error, HasSubstr("blue not in {auto,always,never}"));
}

class WindowOfAnyWidth : public testing::TestWithParam<unsigned short> {};
TEST_P(WindowOfAnyWidth, IsNotExceededAndHidesNothing) {
    for (const char* command : {"ei", "classes"}) {
        std::vector<std::string> arguments{"--color", "never", command};
        if (std::string(command) == "ei") {
            arguments.emplace_back("Test_Box");
        }
        const std::string shown = runOnTerminal(arguments, GetParam()).output;
        EXPECT_EQ(squeezed(shown), squeezed(run(arguments).output));
        EXPECT_THAT(widthsOf(shown), Each(Le(GetParam()))) << shown;
    }
}
// The longest path, which is not divided, fits into the narrowest terminal.
INSTANTIATE_TEST_SUITE_P(Columns, WindowOfAnyWidth, testing::Values(30, 40, 56, 80, 120));

TEST(Window, ContinuesBelowTheLastColumn) {
    EXPECT_THAT(runOnTerminal({"--color", "never", "ei", "Test_Box"}, 44).output,
                HasSubstr("  Labels  string[]   {\"this side \\\"up\\\"\", \n"
                          "                     \"two\\nlines\"}\n"));
}

TEST(Window, PutsEachCellOnALineIfItIsTooNarrow) {
    EXPECT_THAT(runOnTerminal({"--color", "never", "ei", "Test_Box"}, 30).output,
                HasSubstr("  Shelf\n    sint8\n    -3\n"));
}

TEST(Window, CanBeSetByAVariable) {
    EXPECT_EQ(runOnTerminal({"ei", "Test_Box"}, wideTerminal, {"COLUMNS=40"}).output,
              runOnTerminal({"ei", "Test_Box"}, 40).output);
    EXPECT_EQ(runOnTerminal({"ei", "Test_Box"}, 40, {"COLUMNS=some"}).output,
              runOnTerminal({"ei", "Test_Box"}, 40).output);
}

TEST(Window, WidthAppliesToTerminalsOnly) {
    const std::vector<std::string> line{"--schema",
                                        dataFile("test.mof"),
                                        "--registration",
                                        dataFile("test.reg"),
                                        "--library-path",
                                        PROVIDER_DIRECTORY,
                                        "ei",
                                        "Test_Box"};
    EXPECT_EQ(runBare(line, {"COLUMNS=40"}).output, run({"ei", "Test_Box"}).output);
}

}  // namespace
}  // namespace cimhost::test
