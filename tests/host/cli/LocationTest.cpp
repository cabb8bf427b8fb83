#include <gmock/gmock.h>
#include <sys/stat.h>

#include "host/cli/Program.h"
#include "host/schema/Schemas.h"
#include "support/TemporaryDirectory.h"

namespace cimhost::test {
namespace {

using testing::AllOf;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

Environment testEnvironment() {
    return {"CIMHOST_SCHEMA=" + dataFile("test.mof"), "CIMHOST_REGISTRATION=" + dataFile("test.reg"),
            std::string("CIMHOST_LIBRARY_PATH=/:") + PROVIDER_DIRECTORY};
}

TEST(Location, IsReadFromTheEnvironment) {
    const ProgramResult listed = runBare({"ein", "Test_Box"}, testEnvironment());
    EXPECT_EQ(listed.status, 0) << listed.error;
    EXPECT_THAT(listed.output, HasSubstr("Test_Box.Name=\"A\""));
}

TEST(Location, OptionsOverrideTheEnvironment) {
    const testsupport::TemporaryDirectory directory;
    const std::string other = directory.write("other.mof", "class Other { [Key] string K; };");
    const ProgramResult listed = runBare({"--schema", other, "classes"}, testEnvironment());
    EXPECT_THAT(listed.output, AllOf(StartsWith("Other "), HasSubstr("Test_Box"), HasSubstr("(not in the schema)")));
}

TEST(Location, MayNameSeveralFilesAndDirectories) {
    const testsupport::TemporaryDirectory directory;
    directory.write("a/2.mof", "class Two : One {};");
    directory.write("a/1.mof", "class One { [Key] string K; };");
    directory.write("a/notes.txt", "no MOF");
    const std::string three = directory.write("3.mof", "class Three : Two {};");
    const std::string list = "CIMHOST_SCHEMA=" + (directory.path() / "a").string() + ":" + three;
    const std::string registration = "CIMHOST_REGISTRATION=" + directory.write("x.reg", "#");
    EXPECT_EQ(runBare({"classes"}, {list, registration}).output, "One    -\nTwo    -\nThree  -\n");
    EXPECT_EQ(
        runBare({"--schema", (directory.path() / "a").string(), "--schema", three, "classes"}, {registration}).output,
        "One    -\nTwo    -\nThree  -\n");
}

TEST(Location, AGateReplacesTheProviderOfItsClassesUnlessTheBareOneIsChosen) {
    const testsupport::TemporaryDirectory directory;
    const std::string rest = " location: x\n type: instance\n namespace: root/cimv2\n#\n";
    directory.write("all.reg", "[One]\n provider: Bare\n" + rest + "[Two]\n provider: Bare\n" + rest);
    directory.write("gate/gate.reg", "[one]\n provider: Gate\n" + rest);
    const std::string schema = directory.write("1.mof", "class One { [Key] string K; }; class Two : One {};");
    const auto list = [&](std::vector<std::string> options, Environment environment) {
        environment.push_back("CIMHOST_REGISTRATION=" + directory.path().string());
        options.insert(options.end(), {"--schema", schema, "classes"});
        return runBare(options, environment);
    };
    const auto showsGate = AllOf(HasSubstr("Gate"), HasSubstr("Two  instance  Bare"));
    EXPECT_THAT(list({}, {}).output, showsGate);
    EXPECT_THAT(list({"--provider", "bare"}, {}).output, Not(HasSubstr("Gate")));
    EXPECT_THAT(list({}, {"CIMHOST_PROVIDER=bare"}).output, Not(HasSubstr("Gate")));
    EXPECT_THAT(list({"--provider", "gate"}, {"CIMHOST_PROVIDER=bare"}).output, showsGate);
    const ProgramResult refused = list({}, {"CIMHOST_PROVIDER=other"});
    EXPECT_EQ(refused.status, 2);
    EXPECT_THAT(refused.error, HasSubstr("CIMHOST_PROVIDER is \"other\"; set it to gate or bare"));
}

TEST(Location, IsTheDataDirectoryBesideTheProgramByDefault) {
    const ProgramResult listed = runBare({"classes"});
    EXPECT_EQ(listed.status, 0) << listed.error;
    EXPECT_NE(listed.output, "");
    EXPECT_EQ(listed.error, "");
}

struct MissingFile {
    std::vector<std::string> arguments;
    const char* message;
};
void PrintTo(const MissingFile& missing, std::ostream* out) {
    *out << missing.arguments.front();
}

class CannotLoad : public testing::TestWithParam<MissingFile> {};
TEST_P(CannotLoad, IsExitStatus3WithAReason) {
    const ProgramResult refused = runBare(GetParam().arguments, testEnvironment());
    EXPECT_EQ(refused.status, 3);
    EXPECT_EQ(refused.output, "");
    EXPECT_THAT(refused.error, AllOf(StartsWith("cimhost: "), HasSubstr(GetParam().message)));
}
INSTANTIATE_TEST_SUITE_P(
    Files, CannotLoad,
    testing::Values(
        MissingFile{{"--schema", "/no/such.mof", "classes"}, "/no/such.mof: this file does not exist"},
        MissingFile{{"--registration", "/no/such.reg", "classes"}, "/no/such.reg: this file does not exist"},
        MissingFile{{"--library-path", "/no/such", "classes"}, "/no/such: this library directory does not exist"},
        MissingFile{{"--schema", dataFile("test.reg"), "classes"}, "test.reg:1:3: expected \"pragma\" after #"},
        MissingFile{{"--registration", dataFile("test.mof"), "classes"}, "test.mof:1: expected [CLASS]"},
        MissingFile{{"ei", "Test_NoLibrary"}, "libno_such_library.so"},
        MissingFile{{"ei", "Test_NoLibrary"}, "--library-path"},
        MissingFile{{"ei", "Test_NoFactory"}, "NoSuchProvider_Create_InstanceMI"}));

TEST(CannotLoad, ADirectoryWithoutSuchFilesNamesTheOption) {
    const testsupport::TemporaryDirectory directory;
    const ProgramResult refused = runBare({"--schema", directory.path().string(), "classes"}, testEnvironment());
    EXPECT_EQ(refused.status, 3);
    EXPECT_THAT(refused.error, AllOf(HasSubstr("no schema"), HasSubstr("--schema"), HasSubstr("CIMHOST_SCHEMA")));
}

TEST(CannotLoad, AFileThatIsNoLibrary) {
    const testsupport::TemporaryDirectory directory;
    directory.write("libcli_test_provider.so", "this is no library");
    const ProgramResult refused =
        runBare({"--library-path", directory.path().string(), "ei", "Test_Box"}, testEnvironment());
    EXPECT_EQ(refused.status, 3);
    EXPECT_THAT(refused.error, HasSubstr("libcli_test_provider.so"));
}

TEST(Output, ThatCannotBeWrittenIsExitStatus4) {
    for (const std::vector<std::string>& arguments :
         {std::vector<std::string>{"ei", "Test_Box"}, {"--help"}, {"--format", "json", "classes"}}) {
        const ProgramResult refused = runBare(arguments, testEnvironment(), "/dev/full");
        EXPECT_EQ(refused.status, 4) << arguments.front();
        EXPECT_THAT(refused.error, StartsWith("cimhost: the output cannot be written: ")) << arguments.front();
    }
}

}  // namespace
}  // namespace cimhost::test
