#include <gmock/gmock.h>

#include "host/cli/Program.h"

namespace cimhost::test {
namespace {

using testing::HasSubstr;
using testing::Not;

struct Misspelt {
    std::vector<std::string> arguments;
    const char* suggestion;
};
void PrintTo(const Misspelt& line, std::ostream* out) {
    *out << line.suggestion;
}

class Misspelling : public testing::TestWithParam<Misspelt> {};
TEST_P(Misspelling, IsReportedWithASuggestion) {
    const ProgramResult refused = run(GetParam().arguments);
    EXPECT_NE(refused.status, 0);
    EXPECT_THAT(refused.error, HasSubstr(std::string("did you mean ") + GetParam().suggestion + "?"));
}
INSTANTIATE_TEST_SUITE_P(
    Words, Misspelling,
    testing::Values(Misspelt{{"clases"}, "classes"}, Misspelt{{"get-instances", "A"}, "get-instance"},
                    Misspelt{{"--scheme", "a", "classes"}, "--schema"},
                    Misspelt{{"ei", "A", "--propery"}, "--property"}, Misspelt{{"ei", "A", "--fromat"}, "--format"},
                    Misspelt{{"ei", "Tset_Box"}, "Test_Box"}, Misspelt{{"ei", "TESTBOX"}, "Test_Box"},
                    Misspelt{{"ain", "Test_Box.Name=\"A\"", "--assoc-class", "Test_Contain"}, "Test_Contains"},
                    Misspelt{{"mi", "Test_Box.Name=\"A\"", "Sizes=1"}, "Size"}));

TEST(Suggestion, IsNotMadeIfNothingIsSimilar) {
    EXPECT_THAT(run({"frobnicate"}).error, Not(HasSubstr("did you mean")));
    EXPECT_THAT(run({"ei", "Nothing_Like_It"}).error, Not(HasSubstr("did you mean")));
    EXPECT_THAT(run({"mi", "Test_Box.Name=\"A\"", "Frobnicated=1"}).error, Not(HasSubstr("did you mean")));
}

struct Refused {
    std::vector<std::string> arguments;
    const char* hint;
};
void PrintTo(const Refused& line, std::ostream* out) {
    *out << line.hint;
}

class Hint : public testing::TestWithParam<Refused> {};
TEST_P(Hint, NamesTheCommandThatHelps) {
    const ProgramResult refused = run(GetParam().arguments);
    EXPECT_NE(refused.status, 0);
    EXPECT_THAT(refused.error, HasSubstr(GetParam().hint));
}
INSTANTIATE_TEST_SUITE_P(
    Failures, Hint,
    testing::Values(Refused{{"ei", "No_Such"}, "Run cimhost classes to list the classes"},
                    Refused{{"ei", "root/none:Test_Box"}, "Run cimhost classes to list the namespaces of each class"},
                    Refused{{"di", "Test_Box.Name=\"none\""}, "Run cimhost enumerate-instance-names Test_Box"},
                    Refused{{"ei", "A", "B"}, "Run cimhost enumerate-instances --help"},
                    Refused{{"frobnicate"}, "Run cimhost --help"}));

}  // namespace
}  // namespace cimhost::test
