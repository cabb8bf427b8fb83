#include <gmock/gmock.h>

#include "host/cli/Program.h"

// The program under emulated object managers. Crashes are reported.

namespace cimhost::test {
namespace {

using testing::HasSubstr;

TEST(ManagerOption, TheStandardManagerIsTheDefault) {
    EXPECT_EQ(run({"--as", "standard", "ei", "Test_Box"}).output, run({"ei", "Test_Box"}).output);
    const ProgramResult named = run({"ei", "Test_Box", "--as", "pegasus"});
    EXPECT_EQ(named.status, 0);
    EXPECT_EQ(named.output, run({"ei", "Test_Box"}).output);
}

TEST(ManagerOption, AnExceptionIsACrashOrUnknown) {
    const ProgramResult dead = run({"--as", "sfcb", "gi", "Test_Answer.Code=999"});
    EXPECT_EQ(dead.status, 1);
    EXPECT_EQ(
        dead.error,
        "cimhost-lab: error 1 (CMPI_RC_ERR_FAILED): The manager's provider process would have died: The provider threw "
        "an exception: the provider is at its wit's end\n");
    const ProgramResult unknown = run({"--as", "pegasus", "gi", "Test_Answer.Code=999"});
    EXPECT_EQ(unknown.status, 1);
    EXPECT_EQ(unknown.error, "cimhost-lab: error 1 (CMPI_RC_ERR_FAILED): Unknown error.\n");
}

TEST(ManagerOption, RawShowsTheResponseAndTheCrash) {
    const ProgramResult dead = run({"--as", "sfcb", "--raw", "gi", "Test_Answer.Code=999"});
    EXPECT_EQ(dead.status, 1);
    EXPECT_THAT(dead.output, HasSubstr("exception: \"The provider threw an exception"));
    EXPECT_THAT(dead.error, HasSubstr("would have died"));
}

TEST(ManagerOption, AModificationHasAllPropertiesAndAList) {
    const ProgramResult standard = run({"--raw", "mi", "Test_Box.Name=\"A\"", "Size=5"});
    EXPECT_EQ(standard.output,
              "status: 0 (CMPI_RC_OK)\n1. instance root/cimv2:Test_Box.Name=\"A\"\n     Size  uint32  5\n"
              "2. data string \"Size\"\nreturnDone: 0\n");
    const ProgramResult sfcb = run({"--as", "sfcb", "--raw", "mi", "Test_Box.Name=\"A\"", "Size=5"});
    EXPECT_THAT(sfcb.output, HasSubstr("Note    string     NULL\nreturnDone: 0")) << "no list";
    const ProgramResult pegasus = run({"--as", "pegasus", "--raw", "mi", "Test_Box.Name=\"A\"", "Size=5"});
    EXPECT_THAT(pegasus.output, HasSubstr("2. data string \"Size\"\n3. data string \"Name\"\n"));
}

TEST(ManagerOption, AnUnknownNameIsWrongUsage) {
    const ProgramResult refused = run({"--as", "cimom", "ei", "Test_Box"});
    EXPECT_EQ(refused.status, 2);
    EXPECT_THAT(refused.error, HasSubstr("cimom not in {standard,sfcb,pegasus,pegasus-empty-key}"));
}

}  // namespace
}  // namespace cimhost::test
