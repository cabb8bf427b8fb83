#include <gmock/gmock.h>
#include <unistd.h>

#include <filesystem>

#include "agent/Probe.h"
#include "support/TemporaryDirectory.h"

using agent_test::ProbeResult;
using agent_test::runProbe;
using testing::HasSubstr;
using testing::Not;

namespace {

class ConfigurationInProcess : public testing::Test {
protected:
    /** Returns the probe's output with a configuration that also has a log file. */
    std::string show(const std::string& settings) {
        const std::string logging = "[log]\ndestination = '" + directory.file("agent.log") + "'\ntrace_level = 0\n";
        const ProbeResult result = runProbe(directory.write("agent.toml", settings + logging), {"show"});
        EXPECT_EQ(result.exitCode, 0);
        EXPECT_EQ(result.errors, "");
        return result.output;
    }

    static std::string hostName() {
        char name[256] = {};
        EXPECT_EQ(::gethostname(name, sizeof name - 1), 0);
        return name;
    }

    testsupport::TemporaryDirectory directory;
};

TEST_F(ConfigurationInProcess, MayBeMissing) {
    const ProbeResult result = runProbe(directory.file("none.toml"), {"show"});
    EXPECT_EQ(result.exitCode, 0);
    EXPECT_EQ(result.errors, "");
    EXPECT_THAT(result.output, HasSubstr("/usr/lib/ostrel/\n/var/lib/ostrel/\nOstrel\n"));
    EXPECT_THAT(result.output, HasSubstr("/system/computer " + hostName() + " "));
}

TEST_F(ConfigurationInProcess, SetsTheDirectoryOfFirmwareFiles) {
    std::filesystem::create_directory(directory.file("dmi"));
    directory.write("dmi/product_name", "X-200\n");
    directory.write("dmi/chassis_type", "9\n");
    const std::string output = show("[instrumentation]\ndmi_root = '" + directory.file("dmi") + "'\n");
    EXPECT_THAT(output, HasSubstr("/system " + hostName() + " X 200 - Laptop\n"));
    EXPECT_THAT(output, HasSubstr("/system/computer " + hostName() + " X 200 - Laptop\n"));
    EXPECT_EQ(directory.read("agent.log"), "");
}

TEST_F(ConfigurationInProcess, AddsAndReplacesNodes) {
    const std::string output = show(R"(
[instrumentation]
dmi_root = "/no/such/directory"
[[instrumentation.node]]
type = 40
path = "/second"
properties = { "108" = "host2" }
[[instrumentation.node]]
type = 40
path = "/system/computer"
properties = { "39" = "Model X - Tower" }
)");
    EXPECT_THAT(output, HasSubstr("/system " + hostName() +
                                  " Computer - Computer\n"
                                  "/system/computer (none) Model X - Tower\n"
                                  "/second host2 (none)\n"));
}

TEST_F(ConfigurationInProcess, MayDisableDiscovery) {
    EXPECT_THAT(show("[instrumentation]\ndiscover = false\n"), Not(HasSubstr("/system")));
}

TEST_F(ConfigurationInProcess, ProblemsAreReportedOnceAndTheRestIsUsed) {
    const std::string output = show("[directories]\ndata = '/srv/agent'\nlogs = '/x'\n[product]\nname = 3\n");
    EXPECT_THAT(output, HasSubstr("/srv/agent/\nOstrel\n"));
    const std::string log = directory.read("agent.log");
    EXPECT_THAT(log, HasSubstr("\tlog\t3000\tOstrel.Agent\t"));
    EXPECT_THAT(log, HasSubstr("configuration key directories.logs is unknown; ignored\n"));
    EXPECT_THAT(log, HasSubstr("configuration key product.name must be a string; ignored\n"));
    EXPECT_EQ(std::count(log.begin(), log.end(), '\n'), 2);
}

TEST_F(ConfigurationInProcess, UnreadableFirmwareFilesAreReported) {
    std::filesystem::create_directories(directory.file("dmi/sys_vendor"));
    show("[instrumentation]\ndmi_root = '" + directory.file("dmi") + "'\n");
    EXPECT_THAT(directory.read("agent.log"), HasSubstr("\tOstrel.Agent\t"));
    EXPECT_THAT(directory.read("agent.log"), HasSubstr("/dmi/sys_vendor cannot be read: Is a directory\n"));
}

TEST_F(ConfigurationInProcess, InvalidTomlLeavesTheDefaults) {
    const ProbeResult result = runProbe(directory.write("agent.toml", "[directories\n"), {"show"});
    EXPECT_EQ(result.exitCode, 0);
    EXPECT_EQ(result.errors, "");
    EXPECT_THAT(result.output, HasSubstr("/usr/lib/ostrel/\n/var/lib/ostrel/\n"));
}

TEST_F(ConfigurationInProcess, IsUsableWhileStaticObjectsAreDestroyed) {
    const std::string settings =
        "[directories]\ndata = '/srv/agent'\n[log]\ndestination = '" + directory.file("agent.log") + "'\n";
    const ProbeResult result = runProbe(directory.write("agent.toml", settings), {"exit"});
    EXPECT_EQ(result.exitCode, 0);
    EXPECT_EQ(result.output, "/srv/agent/\n");
    EXPECT_THAT(directory.read("agent.log"), HasSubstr("\tat exit\n"));
}

}  // namespace
