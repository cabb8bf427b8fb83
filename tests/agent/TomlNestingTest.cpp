#include <gmock/gmock.h>

#include "configuration/Document.h"

using Agent::deepestNesting;
using Agent::lineNestedTooDeep;
using testing::Optional;

namespace {

constexpr int tooDeep = deepestNesting + 1;

std::string repeat(std::string_view part, int count) {
    std::string all;
    for (int number = 0; number < count; ++number) {
        all += part;
    }
    return all;
}

}  // namespace

TEST(TomlNesting, MayHaveBracketsAndPartsOfKeysUpToTheLimit) {
    for (const std::string& document :
         {"a = " + repeat("[", deepestNesting) + repeat("]", deepestNesting), repeat("a.", deepestNesting) + "a = 1",
          "[" + repeat("a.", deepestNesting) + "a]", "a = " + repeat("{a=", deepestNesting) + "1"}) {
        EXPECT_EQ(lineNestedTooDeep(document), std::nullopt) << document;
    }
}

TEST(TomlNesting, IsFoundWithItsLine) {
    for (const std::string& line :
         {"a = " + repeat("[", tooDeep), "a = " + repeat("{a=", tooDeep), repeat("a.", tooDeep) + "a = 1",
          "[" + repeat("a.", tooDeep) + "a]", "a = {" + repeat("'a' . ", tooDeep) + "a = 1}"}) {
        EXPECT_THAT(lineNestedTooDeep("first = '''\n'''\n" + line), Optional(3U)) << line;
    }
    EXPECT_THAT(lineNestedTooDeep("a = [\n" + repeat("[ # ]\n", deepestNesting)), Optional(tooDeep));
}

TEST(TomlNesting, DoesNotCountStringsCommentsAndClosedBrackets) {
    const std::string brackets = repeat("[", tooDeep);
    for (const std::string& value :
         {"'" + brackets + "'", '"' + brackets + '"', "\"\\\"" + brackets + '"',
          "\"\"\"\n\"\"" + brackets + "\"\"\"\"\"", "'''\n'" + brackets + "''''", "1 # \"" + brackets,
          "[" + repeat("[], ", tooDeep) + "]", "[" + repeat("1.5, ", tooDeep) + "]"}) {
        EXPECT_EQ(lineNestedTooDeep("a = " + value + "\nb = 1"), std::nullopt) << value;
    }
}

TEST(TomlNesting, IsFoundAfterStringsAndComments) {
    for (const char* value :
         {R"('\')", R"("\\")", R"("\"")", R"("""""")", R"("""a""""")", "''''''''", "'a", "\"a", R"('# "')", "1 # '"}) {
        EXPECT_TRUE(lineNestedTooDeep("a = " + std::string(value) + "\nb = " + repeat("[", tooDeep))) << value;
    }
}

TEST(TomlNesting, ThatIsTooDeepIsAProblemOfTheDocument) {
    for (const std::string& document : {repeat("a.", 50000) + "a = 1", "[" + repeat("a.", 50000) + "a]",
                                        "a = " + repeat("{a = ", 20000), "a = " + repeat("[", 100000)}) {
        EXPECT_EQ(Agent::Document::parse(document, "agent.toml").problem(),
                  "agent.toml is not valid TOML (line 1: nested too deep); using the defaults");
    }
}
