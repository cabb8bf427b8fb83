#include <gmock/gmock.h>

#include <nlohmann/json.hpp>

#include "host/cli/Program.h"

namespace cimhost::test {
namespace {

using testing::AllOf;
using testing::HasSubstr;

/** Runs the program with the inventory's classes and their provider. */
ProgramResult runInventory(std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), {"--schema", INVENTORY_DATA "/inventory.mof", "--registration",
                                         INVENTORY_DATA "/inventory.reg", "--library-path", INVENTORY_PROVIDERS});
    return runBare(arguments);
}

nlohmann::json reportOf(std::vector<std::string> arguments, int status) {
    arguments.insert(arguments.begin(), {"--format", "json"});
    const ProgramResult ended = runInventory(arguments);
    EXPECT_EQ(ended.status, status) << ended.error;
    return nlohmann::json::parse(ended.output);
}

TEST(LoadCommand, ReportsFiguresAndSucceedsIfNoResponseIsWrong) {
    const ProgramResult ended = runInventory({"load", "Inventory_Thing", "--clients", "4", "--requests", "400"});
    EXPECT_EQ(ended.status, 0);
    EXPECT_EQ(ended.error, "");
    EXPECT_THAT(ended.output,
                AllOf(HasSubstr("4 clients, 400 requests, manager standard, seed 1: "),
                      testing::ContainsRegex("requests +wrong +per second +p50 us +p95 us +p99 us +max us\n"),
                      HasSubstr("\nall "), HasSubstr("no answer was wrong\n")));
}

TEST(LoadCommand, DescribesWrongResponsesAndFails) {
    const ProgramResult ended = runInventory({"load", "Inventory_Liar", "--requests", "400", "--show", "1"});
    EXPECT_EQ(ended.status, 1);
    EXPECT_THAT(ended.error, testing::MatchesRegex("cimhost-lab: [0-9]+ answers were wrong\n"));
    EXPECT_THAT(ended.output, AllOf(HasSubstr("wrong answers: "), HasSubstr(", value "),
                                    HasSubstr(": GetInstance root/cimv2:Inventory_Liar.Name=\"load1-c"),
                                    HasSubstr("\n    expected: Number = "), HasSubstr("\n    got: Number = ")));
}

TEST(LoadCommand, ReportsJson) {
    const auto right = reportOf({"load", "Inventory_Thing", "--clients", "2", "--requests", "200", "--seed", "9"}, 0);
    EXPECT_EQ(right["manager"], "standard");
    EXPECT_EQ(right["clients"], 2);
    EXPECT_EQ(right["seed"], 9);
    EXPECT_EQ(right["all"]["requests"], 200);
    EXPECT_EQ(right["wrongAnswers"]["count"], 0);
    EXPECT_GE(right["all"]["microseconds"]["max"], right["all"]["microseconds"]["p50"]);
    const auto wrong = reportOf({"--as", "sfcb", "load", "Inventory_Silent", "--requests", "200", "--show", "2"}, 1);
    EXPECT_EQ(wrong["manager"], "sfcb");
    EXPECT_GT(wrong["wrongAnswers"]["kinds"]["died"], 0);
    ASSERT_EQ(wrong["wrongAnswers"]["first"].size(), 2U);
    EXPECT_EQ(wrong["wrongAnswers"]["first"][0]["kind"], "died");
    EXPECT_THAT(wrong["wrongAnswers"]["first"][0]["request"], HasSubstr("CreateInstance"));
}

TEST(LoadCommand, ShowsTenWrongResponsesOrAll) {
    const std::vector<std::string> liar{"load", "Inventory_Liar", "--requests", "800"};
    const auto report = reportOf(liar, 1);
    const auto count = report["wrongAnswers"]["count"].get<std::size_t>();
    ASSERT_GT(count, 10U);
    EXPECT_EQ(report["wrongAnswers"]["first"].size(), count) << "JSON contains all of them";
    const auto shownBy = [&](std::vector<std::string> more) {
        more.insert(more.begin(), liar.begin(), liar.end());
        const std::string output = runInventory(more).output;
        std::size_t shown = 0;
        for (auto at = output.find("expected: "); at != std::string::npos; at = output.find("expected: ", at + 1)) {
            ++shown;
        }
        return shown;
    };
    EXPECT_EQ(shownBy({}), 10U);
    EXPECT_EQ(shownBy({"--show", "all"}), count);
    EXPECT_EQ(shownBy({"--show", "0"}), 0U);
}

TEST(LoadCommand, AcceptsClassesMixAndAssociations) {
    const auto report =
        reportOf({"load", "Inventory_Thing", "Inventory_Sealed", "--mix", "create=1,associate=1", "--source",
                  "Inventory_Thing.Name=\"x\"", "--assoc-class", "Inventory_Holds", "--requests", "100"},
                 0);
    ASSERT_EQ(report["operations"].size(), 2U);
    EXPECT_EQ(report["operations"][0]["operation"], "create");
    EXPECT_EQ(report["operations"][1]["operation"], "associate");
    const auto usual = reportOf({"load", "Inventory_Thing", "--source", "Inventory_Thing.Name=\"x\"", "--assoc-class",
                                 "Inventory_Holds", "--requests", "400"},
                                0);
    EXPECT_EQ(usual["operations"].size(), 6U) << "associations are in the usual mix when there is a source";
}

TEST(LoadCommand, AFailureBeforeTheLoadIsAnError) {
    const ProgramResult ended = runInventory({"load", "root/nowhere:Inventory_Thing"});
    EXPECT_EQ(ended.status, 1);
    EXPECT_THAT(ended.error, HasSubstr("CMPI_RC_ERR_INVALID_NAMESPACE"));
}

TEST(LoadCommand, ReportsErrorsOfTheCommandLine) {
    const std::pair<std::vector<std::string>, const char*> lines[] = {
        {{"load"}, "CLASS is required"},
        {{"load", "Inventory_Missing"}, "not in the schema"},
        {{"load", "Inventory_Pair"}, "other keys than one string"},
        {{"load", "Inventory_Sealed"}, "omit modify from the mix"},
        {{"load", "Inventory_Thing.Name=\"x\""}, "is the path of an instance; write a class"},
        {{"load", "Inventory_Thing", "--mix", "fly=1"}, "fly is not one of"},
        {{"load", "Inventory_Thing", "--mix", "associate=1"}, "no instance to start from"},
        {{"load", "Inventory_Thing", "--clients", "0"}, "--clients"},
        {{"load", "Inventory_Thing", "--requests", "many"}, "--requests"},
        {{"load", "Inventory_Thing", "--show", "some"}, "--show"},
        {{"--raw", "load", "Inventory_Thing"}, "load sends many"},
        {{"--format", "mof", "load", "Inventory_Thing"}, "--format mof shows only instances"},
    };
    for (const auto& [words, message] : lines) {
        const ProgramResult refused = runInventory(words);
        EXPECT_EQ(refused.status, 2) << message;
        EXPECT_THAT(refused.error, HasSubstr(message));
        EXPECT_EQ(refused.output, "");
    }
}

TEST(LoadCommand, HelpDescribesProvidersThatDoNotSupportConcurrency) {
    const std::string help = runBare({"load", "--help"}).output;
    EXPECT_THAT(help, AllOf(HasSubstr("--clients"), HasSubstr("does not support this returns wrong responses"),
                            HasSubstr("exit status"), HasSubstr("--assoc-class")));
}

}  // namespace
}  // namespace cimhost::test
