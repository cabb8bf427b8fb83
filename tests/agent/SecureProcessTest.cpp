// A process with more rights than its caller must ignore the caller's environment.

#include <gmock/gmock.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <vector>

#include "agent/Probe.h"
#include "support/Command.h"

using agent_test::ProbeResult;
using testing::HasSubstr;
using testing::Not;

namespace {

/** Returns a supplementary group of the process; its primary group if there is none. */
gid_t otherGroup() {
    if (::geteuid() == 0) {
        return ::getegid() + 1;
    }
    std::vector<gid_t> groups(static_cast<std::size_t>(::getgroups(0, nullptr)));
    static_cast<void>(::getgroups(static_cast<int>(groups.size()), groups.data()));
    const auto found = std::find_if(groups.begin(), groups.end(), [](gid_t group) { return group != ::getegid(); });
    return found != groups.end() ? *found : ::getegid();
}

/** A copy of a program, beside it, that runs with the rights of a group. */
class PrivilegedCopy {
public:
    PrivilegedCopy(const std::string& program, gid_t group)
        : file(program + "-privileged-" + std::to_string(::getpid())) {
        std::filesystem::copy_file(program, file);
        EXPECT_EQ(::chown(file.c_str(), static_cast<uid_t>(-1), group), 0);
        EXPECT_EQ(::chmod(file.c_str(), S_ISGID | 0750), 0);
    }
    ~PrivilegedCopy() { std::filesystem::remove(file); }
    PrivilegedCopy(const PrivilegedCopy&) = delete;
    PrivilegedCopy& operator=(const PrivilegedCopy&) = delete;

    const std::string file;
};

/** Sets an environment variable of this process and its children for the lifetime of the object. */
class Variable {
public:
    Variable(const char* itsName, const char* value) : name(itsName) { ::setenv(name, value, 1); }
    ~Variable() { ::unsetenv(name); }
    Variable(const Variable&) = delete;
    Variable& operator=(const Variable&) = delete;

private:
    const char* name;
};

}  // namespace

TEST(SecureProcess, IgnoresTheCallersConfiguration) {
    const gid_t group = otherGroup();
    if (group == ::getegid()) {
        GTEST_SKIP() << "this user has one group only";
    }
    const std::string configuration = testing::TempDir() + "callers-" + std::to_string(::getpid()) + ".toml";
    std::ofstream(configuration) << "[directories]\ndata = '/callers/'\n";
    ASSERT_THAT(agent_test::runProbe(configuration, {"show"}).output, HasSubstr("/callers/"));
    const PrivilegedCopy probe(AGENT_PROBE, group);
    const ProbeResult result = agent_test::runProgram(probe.file, configuration, {"show"});
    std::filesystem::remove(configuration);
    EXPECT_EQ(result.exitCode, 0) << result.errors;
    EXPECT_THAT(result.output, HasSubstr("Ostrel"));
    EXPECT_THAT(result.output, Not(HasSubstr("/callers/")));
}

TEST(SecureProcess, IgnoresTheCallersPathsOfObjectManagerFiles) {
    const gid_t group = otherGroup();
    if (group == ::getegid()) {
        GTEST_SKIP() << "this user has one group only";
    }
    const PrivilegedCopy cimhost(CIMHOST, group);
    for (const char* name : {"CIMHOST_SCHEMA", "CIMHOST_REGISTRATION"}) {
        const Variable variable(name, "/callers");
        const std::vector<std::string> request{"enumerate-instances", "No_SuchClass"};
        EXPECT_THAT(agent_test::runProgram(CIMHOST, "", request).errors, HasSubstr("/callers")) << name;
        const ProbeResult result = agent_test::runProgram(cimhost.file, "", request);
        EXPECT_EQ(result.exitCode, 1) << name << ": " << result.errors;
        EXPECT_THAT(result.errors, HasSubstr("No_SuchClass")) << name;
        EXPECT_THAT(result.errors, Not(HasSubstr("/callers"))) << name;
    }
}

/** cimhost is excluded: its command-line library could read variables, but none of its options uses one. */
TEST(SecureProcess, ReadsVariablesOnlyWithSecureGetenv) {
    std::istringstream shippedLibraries(SHIPPED_LIBRARIES);
    for (std::string library; std::getline(shippedLibraries, library, ':');) {
        const std::string symbols = testsupport::runCommand("nm --dynamic --undefined-only '" + library + "'").output;
        EXPECT_THAT(symbols, HasSubstr("@GLIBC")) << library << " was not read";
        EXPECT_THAT(symbols, Not(HasSubstr(" getenv"))) << library;
    }
}
