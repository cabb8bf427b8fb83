#include <gmock/gmock.h>

#include "host/cli/Program.h"

namespace cimhost::test {
namespace {

TEST(TextOutput, ShowsInstancesWithAlignedNamesTypesAndValues) {
    const ProgramResult listed = run({"enumerate-instances", "Test_Box"});
    EXPECT_EQ(listed.status, 0);
    EXPECT_EQ(listed.error, "");
    EXPECT_EQ(listed.output, R"(root/cimv2:Test_Box.Name="A"
  Name    string     "A"
  Size    uint32     4294967295
  Open    boolean    TRUE
  Packed  datetime   "20260131120000.000000+060"
  Labels  string[]   {"this side \"up\"", "two\nlines"}
  Shelf   sint8      -3
  Mark    char16     '\x20AC'
  Weight  real64     2.5
  Serial  uint64     18446744073709551615
  Inside  reference  root/cimv2:Test_Box.Name="B"
  Note    string     NULL

root/cimv2:Test_Box.Name="B"
  Name  string  "B"
  Note  string  NULL
)");
}

TEST(TextOutput, ShowsPathsOnePerLine) {
    const ProgramResult listed = run({"enumerate-instance-names", "Test_Box"});
    EXPECT_EQ(listed.status, 0);
    EXPECT_EQ(listed.output, "root/cimv2:Test_Box.Name=\"A\"\nroot/cimv2:Test_Box.Name=\"B\"\n");
}

TEST(TextOutput, ListsClassesWithTheirProviders) {
    const ProgramResult listed = run({"classes"});
    EXPECT_EQ(listed.status, 0);
    EXPECT_EQ(
        listed.output,
        "Test_Box             instance              CliTest         libcli_test_provider.so  root/cimv2,root/other\n"
        "Test_Contains        instance,association  CliTest         libcli_test_provider.so  root/cimv2\n"
        "Test_Answer          instance              CliTest         libcli_test_provider.so  root/cimv2\n"
        "Test_Special         -\n"
        "Test_NoLibrary       instance              CliTest         libno_such_library.so    root/cimv2\n"
        "Test_NoFactory       instance              NoSuchProvider  libcli_test_provider.so  root/cimv2\n"
        "Test_Unserved        -\n"
        "Test_OnlyRegistered  instance              CliTest         libcli_test_provider.so  root/cimv2  (not in "
        "the schema)\n");
}

TEST(MofOutput, ShowsInstancesAsAMofCompilerAcceptsThem) {
    const ProgramResult listed = run({"--format", "mof", "ei", "Test_Box"});
    EXPECT_EQ(listed.status, 0);
    EXPECT_EQ(listed.output, R"(instance of Test_Box {
    Name = "A";
    Size = 4294967295;
    Open = TRUE;
    Packed = "20260131120000.000000+060";
    Labels = {"this side \"up\"", "two\nlines"};
    Shelf = -3;
    Mark = '\x20AC';
    Weight = 2.5;
    Serial = 18446744073709551615;
    Inside = "root/cimv2:Test_Box.Name=\"B\"";
    Note = NULL;
};

instance of Test_Box {
    Name = "B";
    Note = NULL;
};
)");
}

TEST(MofOutput, ShowsPathsLikeText) {
    EXPECT_EQ(run({"--format", "mof", "ein", "Test_Box"}).output, run({"ein", "Test_Box"}).output);
}

}  // namespace
}  // namespace cimhost::test
