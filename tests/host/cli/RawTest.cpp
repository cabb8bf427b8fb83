#include <gmock/gmock.h>

#include "host/cli/Program.h"

namespace cimhost::test {
namespace {

TEST(RawOutput, ShowsEverythingThatTheProviderReturnedInOrder) {
    const ProgramResult modified = run({"--raw", "mi", "Test_Box.Name=\"A\"", "Size=5", "Note="});
    EXPECT_EQ(modified.status, 0);
    EXPECT_EQ(modified.output, R"(status: 0 (CMPI_RC_OK)
1. instance root/cimv2:Test_Box.Name="A"
     Size  uint32  5
     Note  string  ""
2. data string "Size"
3. data string "Note"
returnDone: 0
)");
}

TEST(RawOutput, CountsEveryReturnDone) {
    const ProgramResult got = run({"--raw", "gi", "Test_Box.Name=\"none\""});
    EXPECT_EQ(got.output, "status: 0 (CMPI_RC_OK)\n1. done\n2. done\nreturnDone: 2\n");
    EXPECT_EQ(got.status, 0) << "the provider's status, not what an object manager makes of it";
}

TEST(RawOutput, ShowsTheStatusOfAFailureAlsoOnStandardError) {
    const ProgramResult failed = run({"--raw", "gi", "Test_Answer.Code=2"});
    EXPECT_EQ(failed.status, 1);
    EXPECT_EQ(failed.output,
              "status: 2 (CMPI_RC_ERR_ACCESS_DENIED)\nmessage: \"as you\\nlike \\\"it\\\"\"\nreturnDone: 0\n");
    EXPECT_EQ(failed.error, "cimhost: error 2 (CMPI_RC_ERR_ACCESS_DENIED): as you\\nlike \"it\"\n");
}

TEST(RawOutput, ShowsACodeThatIsNoStatusCodeAsItIs) {
    for (const char* code : {"256", "1000", "65535"}) {
        const std::string shown = code + std::string(" (unknown code)");
        const std::string path = std::string("Test_Answer.Code=") + code;
        const ProgramResult raw = run({"--raw", "gi", path});
        EXPECT_EQ(raw.status, 1);
        EXPECT_EQ(raw.output, "status: " + shown + "\nmessage: \"as you\\nlike \\\"it\\\"\"\nreturnDone: 0\n");
        EXPECT_EQ(raw.error, "cimhost: error " + shown + ": as you\\nlike \"it\"\n");
        const ProgramResult asManager = run({"gi", path});
        EXPECT_EQ(asManager.status, 1);
        EXPECT_EQ(asManager.output, "");
        EXPECT_EQ(asManager.error, raw.error);
    }
}

TEST(RawOutput, DistinguishesAnExceptionFromAMessage) {
    const ProgramResult thrown = run({"--raw", "gi", "Test_Answer.Code=999"});
    EXPECT_EQ(thrown.status, 1);
    EXPECT_THAT(thrown.output, testing::StartsWith("status: 1 (CMPI_RC_ERR_FAILED)\nexception: "));
    EXPECT_THAT(thrown.output, testing::HasSubstr("wit's end"));
}

TEST(RawOutput, IsOnlyTheErrorWithoutAProvider) {
    const ProgramResult failed = run({"--raw", "ei", "Test_Unserved"});
    EXPECT_EQ(failed.status, 1);
    EXPECT_EQ(failed.output, "");
    EXPECT_THAT(failed.error, testing::StartsWith("cimhost: error 5 (CMPI_RC_ERR_INVALID_CLASS): "));
}

}  // namespace
}  // namespace cimhost::test
