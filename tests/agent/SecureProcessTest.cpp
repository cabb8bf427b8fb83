// A process that runs with rights that its caller has not: nothing that the caller sets may lead it elsewhere.

#include "agent/Probe.h"

#include <gmock/gmock.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <memory>
#include <vector>

using agent_test::ProbeResult;
using testing::HasSubstr;
using testing::Not;

namespace {

/** A group that is not the process's own and that it may give files to; its own where there is none. */
gid_t otherGroup() {
    if (::geteuid() == 0) {
        return ::getegid() + 1;
    }
    std::vector<gid_t> groups(static_cast<std::size_t>(::getgroups(0, nullptr)));
    static_cast<void>(::getgroups(static_cast<int>(groups.size()), groups.data()));
    const auto found = std::find_if(groups.begin(), groups.end(), [](gid_t group) { return group != ::getegid(); });
    return found != groups.end() ? *found : ::getegid();
}

/** A copy of the probe, beside it, that runs with the rights of a group. */
class PrivilegedProbe {
public:
    explicit PrivilegedProbe(gid_t group)
        : file(std::string(AGENT_PROBE) + "-privileged-" + std::to_string(::getpid())) {
        std::filesystem::copy_file(AGENT_PROBE, file);
        EXPECT_EQ(::chown(file.c_str(), static_cast<uid_t>(-1), group), 0);
        EXPECT_EQ(::chmod(file.c_str(), S_ISGID | 0750), 0);
    }
    ~PrivilegedProbe() { std::filesystem::remove(file); }
    PrivilegedProbe(const PrivilegedProbe&) = delete;
    PrivilegedProbe& operator=(const PrivilegedProbe&) = delete;

    const std::string file;
};

std::string outputOf(const std::string& command) {
    const std::unique_ptr<FILE, int (*)(FILE*)> pipe(popen(command.c_str(), "r"), pclose);
    std::string output;
    std::array<char, 4096> buffer{};
    for (std::size_t read = 1; pipe != nullptr && read > 0;) {
        read = fread(buffer.data(), 1, buffer.size(), pipe.get());
        output.append(buffer.data(), read);
    }
    return output;
}

}  // namespace

TEST(SecureProcess, TakesNoConfigurationFromItsCaller) {
    const gid_t group = otherGroup();
    if (group == ::getegid()) {
        GTEST_SKIP() << "this user has one group only";
    }
    const std::string configuration = testing::TempDir() + "callers-" + std::to_string(::getpid()) + ".toml";
    std::ofstream(configuration) << "[directories]\ndata = '/callers/'\n";
    ASSERT_THAT(agent_test::runProbe(configuration, {"show"}).output, HasSubstr("/callers/"));
    const PrivilegedProbe probe(group);
    const ProbeResult result = agent_test::runProgram(probe.file, configuration, {"show"});
    std::filesystem::remove(configuration);
    EXPECT_EQ(result.exitCode, 0) << result.errors;
    EXPECT_THAT(result.output, HasSubstr("Ostrel"));
    EXPECT_THAT(result.output, Not(HasSubstr("/callers/")));
}

TEST(SecureProcess, ReadsNoVariableWithoutLookingAtItsRights) {
    for (const char* library : {KOFRAMEWORK_LIBRARY, RZLOG_LIBRARY}) {
        const std::string symbols = outputOf(std::string("nm --dynamic --undefined-only '") + library + "'");
        EXPECT_THAT(symbols, HasSubstr(" secure_getenv")) << library;
        EXPECT_THAT(symbols, Not(HasSubstr(" getenv"))) << library;
    }
}
