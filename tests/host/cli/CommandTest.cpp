#include <gmock/gmock.h>

#include "host/cli/Program.h"

namespace cimhost::test {
namespace {

using testing::AllOf;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

constexpr auto boxA = "Test_Box.Name=\"A\"";

TEST(Command, LongAndShortNamesDoTheSame) {
    const std::pair<const char*, const char*> names[] = {
        {"enumerate-instances", "ei"}, {"enumerate-instance-names", "ein"},
        {"get-instance", "gi"},        {"create-instance", "ci"},
        {"delete-instance", "di"},     {"associators", "ai"},
        {"associator-names", "ain"},   {"references", "ri"},
        {"reference-names", "rin"}};
    for (const auto& [full, brief] : names) {
        const std::string target = std::string(brief).substr(0, 2) == "ei" ? "Test_Box" : boxA;
        const ProgramResult one = run({full, target});
        const ProgramResult other = run({brief, target});
        EXPECT_EQ(one.status, other.status) << full;
        EXPECT_EQ(one.output, other.output) << full;
        EXPECT_EQ(one.error, other.error) << full;
        EXPECT_NE(one.status, 2) << full << ": " << one.error;
    }
}

TEST(GetInstance, ShowsOneInstance) {
    const ProgramResult got = run({"gi", "Test_Box.Name=\"B\""});
    EXPECT_EQ(got.status, 0);
    EXPECT_EQ(got.output, "root/cimv2:Test_Box.Name=\"B\"\n  Name  string  \"B\"\n  Note  string  NULL\n");
}

TEST(GetInstance, PassesThePropertyListToTheProvider) {
    EXPECT_THAT(run({"gi", boxA, "--property", "Size", "--property", "Open"}).output,
                HasSubstr("\"asked for Size Open\""));
    EXPECT_THAT(run({"gi", boxA}).output, Not(HasSubstr("asked for")));
}

TEST(GetInstance, ReadsTheNamespaceFromThePathOrTheOption) {
    EXPECT_THAT(run({"gi", "root/other:Test_Box.Name=\"A\""}).output, StartsWith("root/other:Test_Box"));
    EXPECT_THAT(run({"--namespace", "root/other", "gi", boxA}).output, StartsWith("root/other:Test_Box"));
    EXPECT_THAT(run({"gi", boxA, "--namespace", "root/other"}).output, StartsWith("root/other:Test_Box"));
}

TEST(GetInstance, NotFoundIsError6) {
    const ProgramResult got = run({"gi", "Test_Box.Name=\"none\""});
    EXPECT_EQ(got.status, 1);
    EXPECT_EQ(got.output, "");
    EXPECT_THAT(got.error, AllOf(StartsWith("cimhost: error 6 (CMPI_RC_ERR_NOT_FOUND): "), HasSubstr("none")));
}

TEST(CreateInstance, ShowsThePathOfTheNewInstance) {
    const ProgramResult created = run({"ci", "Test_Box.Name=\"new\"", "Size=3"});
    EXPECT_EQ(created.status, 0) << created.error;
    EXPECT_EQ(created.output, "root/cimv2:Test_Box.Name=\"new\"\n");
}

TEST(CreateInstance, PassesKeysAndValuesToTheProvider) {
    const ProgramResult created = run({"--raw", "ci", "Test_Box.Name=\"new\"", "Size=3", "--null", "Note"});
    EXPECT_THAT(created.output, HasSubstr(R"(2. instance root/cimv2:Test_Box.Name="new"
     Name  string  "new"
     Size  uint32  3
     Note  string  NULL
)"));
}

TEST(CreateInstance, AKeyMayBeInThePathOrAmongTheValues) {
    EXPECT_EQ(run({"ci", "Test_Box", "Name=new"}).output, "root/cimv2:Test_Box.Name=\"new\"\n");
    EXPECT_EQ(run({"ci", "Test_Box.Name=\"new\"", "Name=new"}).status, 0);
    const ProgramResult different = run({"ci", "Test_Box.Name=\"new\"", "Name=old"});
    EXPECT_EQ(different.status, 2);
    EXPECT_THAT(different.error, HasSubstr("key Name has one value in the path and another one after it"));
    EXPECT_THAT(run({"ci", "Test_Box", "--null", "Name"}).error, HasSubstr("key Name cannot be null"));
}

TEST(CreateInstance, AnExistingInstanceIsError11) {
    const ProgramResult created = run({"ci", boxA});
    EXPECT_EQ(created.status, 1);
    EXPECT_EQ(created.error, "cimhost: error 11 (CMPI_RC_ERR_ALREADY_EXISTS): there is a box A\n");
}

TEST(ModifyInstance, PrintsNothingIfItSucceeds) {
    const ProgramResult modified = run({"mi", boxA, "Size=5"});
    EXPECT_EQ(modified.status, 0);
    EXPECT_EQ(modified.output, "");
    EXPECT_EQ(modified.error, "");
}

TEST(ModifyInstance, ConvertsEachValueToTheTypeOfTheProperty) {
    const ProgramResult modified =
        run({"--raw", "modify-instance", boxA, "Size=0x10", "open=TRUE", "Packed=20260131120000.000000+060",
             "Labels={\"a, b\", \"c\"}", "Shelf=-128", "Mark=x", "Weight=1", "Inside=Test_Box.Name=\"B\"",
             "Note=null = \"nothing\"", "--null", "Serial"});
    EXPECT_EQ(modified.status, 0) << modified.error;
    EXPECT_THAT(modified.output, HasSubstr(R"(1. instance root/cimv2:Test_Box.Name="A"
     Size    uint32     16
     Open    boolean    TRUE
     Packed  datetime   "20260131120000.000000+060"
     Labels  string[]   {"a, b", "c"}
     Shelf   sint8      -128
     Mark    char16     'x'
     Weight  real64     1.0
     Inside  reference  root/cimv2:Test_Box.Name="B"
     Note    string     "null = \"nothing\""
     Serial  uint64     NULL
)"));
    EXPECT_THAT(modified.output, HasSubstr("data string \"Serial\""));
}

TEST(ModifyInstance, AFailureWithoutAMessageStillHasItsCode) {
    const ProgramResult modified = run({"mi", "Test_Box.Name=\"B\"", "Size=5"});
    EXPECT_EQ(modified.status, 1);
    EXPECT_THAT(modified.error, StartsWith("cimhost: error 6 (CMPI_RC_ERR_NOT_FOUND)"));
}

TEST(DeleteInstance, PrintsOnlyTheReasonOfAFailure) {
    const ProgramResult deleted = run({"di", boxA});
    EXPECT_EQ(deleted.status, 0);
    EXPECT_EQ(deleted.output + deleted.error, "");
    const ProgramResult missing = run({"di", "Test_Box.Name=\"B\""});
    EXPECT_EQ(missing.status, 1);
    EXPECT_EQ(missing.error,
              "cimhost: error 6 (CMPI_RC_ERR_NOT_FOUND): no such box\n"
              "Run cimhost enumerate-instance-names Test_Box to list the instances.\n");
}

TEST(Associators, ShowTheInstancesAtTheOtherEnd) {
    const ProgramResult found = run({"ai", boxA, "--assoc-class", "Test_Contains"});
    EXPECT_EQ(found.status, 0) << found.error;
    EXPECT_THAT(found.output, StartsWith("root/cimv2:Test_Box.Name=\"B\"\n"));
}

TEST(Associators, PassTheirFiltersToTheProvider) {
    const ProgramResult found = run({"ain", boxA, "--assoc-class", "Test_Contains", "--result-class", "Test_Box",
                                     "--role", "Outer", "--result-role", "Inner"});
    EXPECT_EQ(found.output, "root/cimv2:Test_Box.Name=\"Test_Contains|Test_Box|Outer|Inner\"\n");
    EXPECT_EQ(run({"ain", boxA, "--assoc-class", "Test_Contains"}).output,
              "root/cimv2:Test_Box.Name=\"Test_Contains|-|-|-\"\n");
}

TEST(References, ShowTheAssociations) {
    const std::string link =
        R"(root/cimv2:Test_Contains.Outer="root/cimv2:Test_Box.Name=\"A\"",Inner="root/cimv2:Test_Box.Name=\"B\"")";
    EXPECT_EQ(run({"rin", boxA, "--result-class", "Test_Contains"}).output, link + "\n");
    EXPECT_EQ(run({"ri", boxA, "--result-class", "Test_Contains"}).output,
              link +
                  "\n  Outer  reference  root/cimv2:Test_Box.Name=\"A\"\n"
                  "  Inner  reference  root/cimv2:Test_Box.Name=\"B\"\n");
}

TEST(Associators, OfAClassThatNoProviderAssociatesAreError5) {
    const ProgramResult found = run({"ai", boxA, "--assoc-class", "Test_Box"});
    EXPECT_EQ(found.status, 1);
    EXPECT_THAT(found.error, StartsWith("cimhost: error 5 (CMPI_RC_ERR_INVALID_CLASS): "));
}

TEST(Error, OfAClassWithoutProviderIsError5AndOfAnUnknownNamespaceError3) {
    EXPECT_THAT(run({"ei", "Test_Unserved"}).error, StartsWith("cimhost: error 5 (CMPI_RC_ERR_INVALID_CLASS): "));
    EXPECT_THAT(run({"ei", "No_Such_Class"}).error, StartsWith("cimhost: error 5 (CMPI_RC_ERR_INVALID_CLASS): "));
    EXPECT_THAT(run({"ei", "root/none:Test_Box"}).error,
                StartsWith("cimhost: error 3 (CMPI_RC_ERR_INVALID_NAMESPACE): "));
    EXPECT_THAT(run({"ci", "No_Such_Class", "A=1"}).error,
                AllOf(StartsWith("cimhost: error 5 (CMPI_RC_ERR_INVALID_CLASS): "), HasSubstr("--schema")));
}

TEST(Error, EachProviderStatusIsShownWithCodeAndName) {
    const ProgramResult failed = run({"gi", "Test_Answer.Code=13"});
    EXPECT_EQ(failed.status, 1);
    EXPECT_EQ(failed.output, "");
    EXPECT_EQ(failed.error, "cimhost: error 13 (CMPI_RC_ERR_TYPE_MISMATCH): as you\\nlike \"it\"\n")
        << "one line, whatever the message holds";
    EXPECT_THAT(run({"gi", "Test_Answer.Code=200"}).error, StartsWith("cimhost: error 200 (CMPI_RC_ERROR)"));
    EXPECT_THAT(run({"gi", "Test_Answer.Code=150"}).error, StartsWith("cimhost: error 150 (unknown code)"));
}

TEST(Error, AnExceptionOfAProviderIsError1AndDoesNotEndTheProgram) {
    const ProgramResult thrown = run({"gi", "Test_Answer.Code=999"});
    EXPECT_EQ(thrown.status, 1);
    EXPECT_THAT(thrown.error, AllOf(StartsWith("cimhost: error 1 (CMPI_RC_ERR_FAILED): "), HasSubstr("wit's end")));
}

}  // namespace
}  // namespace cimhost::test
