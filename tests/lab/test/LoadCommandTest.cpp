#include <gmock/gmock.h>

#include <nlohmann/json.hpp>

#include "host/cli/Program.h"

namespace cimhost::test {
namespace {

using testing::AllOf;
using testing::HasSubstr;

/** Runs the program with the depot's classes and their provider. */
Ended runDepot(std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), {"--schema", DEPOT_DATA "/depot.mof", "--registration", DEPOT_DATA "/depot.reg",
                                         "--library-path", DEPOT_PROVIDERS});
    return runBare(arguments);
}

nlohmann::json reportOf(std::vector<std::string> arguments, int status) {
    arguments.insert(arguments.begin(), {"--format", "json"});
    const Ended ended = runDepot(arguments);
    EXPECT_EQ(ended.status, status) << ended.error;
    return nlohmann::json::parse(ended.output);
}

TEST(LoadCommand, ReportsFiguresAndSucceedsWhenNoAnswerIsWrong) {
    const Ended ended = runDepot({"load", "Depot_Thing", "--clients", "4", "--requests", "400"});
    EXPECT_EQ(ended.status, 0);
    EXPECT_EQ(ended.error, "");
    EXPECT_THAT(ended.output,
                AllOf(HasSubstr("4 clients, 400 requests, manager standard, seed 1: "),
                      testing::ContainsRegex("requests +wrong +per second +p50 us +p95 us +p99 us +max us\n"),
                      HasSubstr("\nall "), HasSubstr("no answer was wrong\n")));
}

TEST(LoadCommand, TellsWrongAnswersInWordsAndFails) {
    const Ended ended = runDepot({"load", "Depot_Liar", "--requests", "400", "--show", "1"});
    EXPECT_EQ(ended.status, 1);
    EXPECT_THAT(ended.error, testing::MatchesRegex("cimhost-lab: [0-9]+ answers were wrong\n"));
    EXPECT_THAT(ended.output, AllOf(HasSubstr("wrong answers: "), HasSubstr(", value "),
                                    HasSubstr(": GetInstance root/cimv2:Depot_Liar.Name=\"load1-c"),
                                    HasSubstr("\n    expected: Number = "), HasSubstr("\n    got: Number = ")));
}

TEST(LoadCommand, IsJsonForPrograms) {
    const auto right = reportOf({"load", "Depot_Thing", "--clients", "2", "--requests", "200", "--seed", "9"}, 0);
    EXPECT_EQ(right["manager"], "standard");
    EXPECT_EQ(right["clients"], 2);
    EXPECT_EQ(right["seed"], 9);
    EXPECT_EQ(right["all"]["requests"], 200);
    EXPECT_EQ(right["wrongAnswers"]["count"], 0);
    EXPECT_GE(right["all"]["microseconds"]["max"], right["all"]["microseconds"]["p50"]);
    const auto wrong = reportOf({"--as", "sfcb", "load", "Depot_Silent", "--requests", "200", "--show", "2"}, 1);
    EXPECT_EQ(wrong["manager"], "sfcb");
    EXPECT_GT(wrong["wrongAnswers"]["kinds"]["died"], 0);
    ASSERT_EQ(wrong["wrongAnswers"]["first"].size(), 2U);
    EXPECT_EQ(wrong["wrongAnswers"]["first"][0]["kind"], "died");
    EXPECT_THAT(wrong["wrongAnswers"]["first"][0]["request"], HasSubstr("CreateInstance"));
}

TEST(LoadCommand, ShowsTenWrongAnswersOrAll) {
    const std::vector<std::string> liar{"load", "Depot_Liar", "--requests", "800"};
    const auto report = reportOf(liar, 1);
    const auto count = report["wrongAnswers"]["count"].get<std::size_t>();
    ASSERT_GT(count, 10U);
    EXPECT_EQ(report["wrongAnswers"]["first"].size(), count) << "a program gets them all";
    const auto shownBy = [&](std::vector<std::string> more) {
        more.insert(more.begin(), liar.begin(), liar.end());
        const std::string output = runDepot(more).output;
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

TEST(LoadCommand, TakesClassesMixAndAssociations) {
    const auto report = reportOf({"load", "Depot_Thing", "Depot_Sealed", "--mix", "create=1,associate=1", "--source",
                                  "Depot_Thing.Name=\"x\"", "--assoc-class", "Depot_Holds", "--requests", "100"},
                                 0);
    ASSERT_EQ(report["operations"].size(), 2U);
    EXPECT_EQ(report["operations"][0]["operation"], "create");
    EXPECT_EQ(report["operations"][1]["operation"], "associate");
    const auto usual = reportOf({"load", "Depot_Thing", "--source", "Depot_Thing.Name=\"x\"", "--assoc-class",
                                 "Depot_Holds", "--requests", "400"},
                                0);
    EXPECT_EQ(usual["operations"].size(), 6U) << "associations are in the usual mix when there is a source";
}

TEST(LoadCommand, AFailureBeforeTheLoadIsAnError) {
    const Ended ended = runDepot({"load", "root/nowhere:Depot_Thing"});
    EXPECT_EQ(ended.status, 1);
    EXPECT_THAT(ended.error, HasSubstr("CMPI_RC_ERR_INVALID_NAMESPACE"));
}

TEST(LoadCommand, SaysWhatIsWrongWithTheCommandLine) {
    const std::pair<std::vector<std::string>, const char*> lines[] = {
        {{"load"}, "CLASS is required"},
        {{"load", "Depot_Missing"}, "not in the schema"},
        {{"load", "Depot_Pair"}, "other keys than one string"},
        {{"load", "Depot_Sealed"}, "leave modify out of the mix"},
        {{"load", "Depot_Thing.Name=\"x\""}, "names an instance; name a class"},
        {{"load", "Depot_Thing", "--mix", "fly=1"}, "fly is not one of"},
        {{"load", "Depot_Thing", "--mix", "associate=1"}, "no instance whose associations"},
        {{"load", "Depot_Thing", "--clients", "0"}, "--clients"},
        {{"load", "Depot_Thing", "--requests", "many"}, "--requests"},
        {{"load", "Depot_Thing", "--show", "some"}, "--show"},
        {{"--raw", "load", "Depot_Thing"}, "load has many"},
        {{"--format", "mof", "load", "Depot_Thing"}, "--format mof shows instances"},
    };
    for (const auto& [words, complaint] : lines) {
        const Ended refused = runDepot(words);
        EXPECT_EQ(refused.status, 2) << complaint;
        EXPECT_THAT(refused.error, HasSubstr(complaint));
        EXPECT_EQ(refused.output, "");
    }
}

TEST(LoadCommand, HelpSaysWhatALoadDoesToProvidersForOneRequestAtATime) {
    const std::string help = runBare({"load", "--help"}).output;
    EXPECT_THAT(help, AllOf(HasSubstr("--clients"), HasSubstr("one request at a time answers wrongly"),
                            HasSubstr("exit status"), HasSubstr("--assoc-class")));
}

}  // namespace
}  // namespace cimhost::test
