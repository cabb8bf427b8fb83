#include <gmock/gmock.h>

#include "host/cli/Program.h"

namespace cimhost::test {
namespace {

using testing::AllOf;
using testing::HasSubstr;
using testing::StartsWith;

TEST(Help, ShowsCommandsOptionsAndExamples) {
    const ProgramResult help = runBare({"--help"});
    EXPECT_EQ(help.status, 0);
    EXPECT_EQ(help.error, "");
    for (const char* part : {"enumerate-instances, ei", "modify-instance, mi", "--schema", "--library-path", "--raw",
                             "cimhost gi 'Some_Class.InstanceID=\"1\"'", "CIMHOST_REGISTRATION", "Exit status"}) {
        EXPECT_THAT(help.output, HasSubstr(part));
    }
}

TEST(Help, EachCommandHasHelp) {
    for (const char* command : {"ei", "ein", "gi", "ci", "mi", "di", "ai", "ain", "ri", "rin", "classes"}) {
        const ProgramResult help = runBare({command, "--help"});
        EXPECT_EQ(help.status, 0) << command;
        EXPECT_THAT(help.output, HasSubstr("Usage: cimhost ")) << command;
    }
    EXPECT_THAT(runBare({"ai", "--help"}).output, AllOf(HasSubstr("--assoc-class"), HasSubstr("--result-role")));
    EXPECT_THAT(runBare({"mi", "--help"}).output, HasSubstr("--null"));
}

TEST(Version, IsANumberOnOneLine) {
    const ProgramResult version = runBare({"--version"});
    EXPECT_EQ(version.status, 0);
    EXPECT_THAT(version.output, testing::MatchesRegex("cimhost [0-9]+\\.[0-9]+\\.[0-9]+\n"));
}

struct WrongLine {
    std::vector<std::string> arguments;
    const char* message;
};
void PrintTo(const WrongLine& line, std::ostream* out) {
    for (const std::string& word : line.arguments) {
        *out << word << ' ';
    }
}

class WrongUsage : public testing::TestWithParam<WrongLine> {};
TEST_P(WrongUsage, IsExitStatus2WithAReason) {
    const ProgramResult refused = run(GetParam().arguments);
    EXPECT_EQ(refused.status, 2);
    EXPECT_EQ(refused.output, "");
    EXPECT_THAT(refused.error, AllOf(StartsWith("cimhost: "), HasSubstr(GetParam().message)));
}

INSTANTIATE_TEST_SUITE_P(
    CommandLine, WrongUsage,
    testing::Values(WrongLine{{}, "subcommand is required"},
                    WrongLine{{"frobnicate"}, "no command or option frobnicate"},
                    WrongLine{{"--frobnicate"}, "no command or option --frobnicate"},
                    WrongLine{{"ei"}, "CLASS is required"}, WrongLine{{"gi"}, "PATH is required"},
                    WrongLine{{"ei", "A", "B"}, "B"}, WrongLine{{"ei", "A", "--frobnicate"}, "--frobnicate"},
                    WrongLine{{"ei", "A", "--assoc-class", "B"}, "--assoc-class"},
                    WrongLine{{"ei", "A", "--null", "B"}, "--null"}, WrongLine{{"--format"}, "--format"},
                    WrongLine{{"--format", "xml", "ei", "A"}, "xml not in {text,json,mof}"},
                    WrongLine{{"--format", "mof", "classes"}, "--format mof shows only instances"},
                    WrongLine{{"--format", "mof", "--raw", "ei", "Test_Box"}, "--format mof shows only instances"}));

INSTANTIATE_TEST_SUITE_P(
    Targets, WrongUsage,
    testing::Values(WrongLine{{"ei", "Test_Box.Name=\"A\""}, "is the path of an instance; write a class"},
                    WrongLine{{"gi", "Test_Box.Name=A"}, "character 15: expected a key's value"},
                    WrongLine{{"gi", "Test_Box.Name=5"}, "write it in quotation marks, \"5\""},
                    WrongLine{{"gi", "Test_Box.Size=5"}, "class Test_Box has no key Size; its keys are Name"},
                    WrongLine{{"gi", "Test_Answer.Code=65536"}, "from 0 to 65535"},
                    WrongLine{{"gi", ""}, "expected a class name"}, WrongLine{{"ei", "root/cimv2"}, "character 5"}));

INSTANTIATE_TEST_SUITE_P(
    Values, WrongUsage,
    testing::Values(WrongLine{{"mi", "Test_Box.Name=\"A\""}, "nothing to modify"},
                    WrongLine{{"mi", "Test_Box.Name=\"A\"", "Size"}, "Size is not NAME=VALUE"},
                    WrongLine{{"mi", "Test_Box.Name=\"A\"", "=5"}, "=5 is not NAME=VALUE"},
                    WrongLine{{"mi", "Test_Box.Name=\"A\"", "Size=5", "size=6"}, "property Size is given twice"},
                    WrongLine{{"mi", "Test_Box.Name=\"A\"", "Size=5", "--null", "Size"}, "Size is given twice"},
                    WrongLine{{"mi", "Test_Box.Name=\"A\"", "Sice=5"},
                              "no property Sice; its properties are Name, Size"},
                    WrongLine{{"mi", "Test_Box.Name=\"A\"", "--null", "Sice"}, "no property Sice"},
                    WrongLine{{"mi", "Test_Box.Name=\"A\"", "Size=-1"}, "Size: -1 is not a uint32"},
                    WrongLine{{"mi", "Test_Box.Name=\"A\"", "Size="}, "Size: an empty string is not a uint32"},
                    WrongLine{{"mi", "Test_Box.Name=\"A\"", "Packed=today"}, "Packed: today is not a datetime"},
                    WrongLine{{"mi", "Test_Box.Name=\"A\"", "Labels=a"}, "expected a list of values in braces"},
                    WrongLine{{"mi", "Test_Box.Name=\"A\"", "Inside=Test_Answer.Code=1"}, "must refer to a Test_Box"}));

}  // namespace
}  // namespace cimhost::test
