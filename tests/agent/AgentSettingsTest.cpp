#include <gmock/gmock.h>

#include "agent/ShippedConfiguration.h"
#include "configuration/FileContent.h"
#include "framework/AgentState.h"

using KO::AgentSettings;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::MatchesRegex;
using testing::Pair;

namespace {

class AgentSettingsTest : public testing::Test {
protected:
    AgentSettings read(const char* text) {
        const Agent::Document document = Agent::Document::parse(text, "test");
        EXPECT_EQ(document.problem(), "");
        return KO::readAgentSettings(document, problems);
    }

    Agent::Problems problems;
};

TEST_F(AgentSettingsTest, HaveDefaults) {
    const AgentSettings settings = read("");
    EXPECT_EQ(settings.installDirectory, "/usr/lib/ostrel/");
    EXPECT_EQ(settings.dataDirectory, "/var/lib/ostrel/");
    EXPECT_EQ(settings.product.name, "Ostrel");
    EXPECT_EQ(settings.product.version, "1.0.0");
    EXPECT_EQ(settings.product.buildNumber, "1");
    EXPECT_EQ(settings.product.vendor, "VEL");
    EXPECT_EQ(settings.dmiRoot, "/sys/class/dmi/id/");
    EXPECT_TRUE(settings.discover);
    EXPECT_THAT(settings.nodes, IsEmpty());
    EXPECT_THAT(problems, IsEmpty());
}

TEST_F(AgentSettingsTest, HaveTheDefaultsOfTheInstalledFile) {
    const AgentSettings defaults = read("");
    const AgentSettings shown = read(shippedConfiguration().c_str());
    EXPECT_EQ(shown.installDirectory, defaults.installDirectory);
    EXPECT_EQ(shown.dataDirectory, defaults.dataDirectory);
    EXPECT_EQ(shown.product.name, defaults.product.name);
    EXPECT_EQ(shown.product.version, defaults.product.version);
    EXPECT_EQ(shown.product.buildNumber, defaults.product.buildNumber);
    EXPECT_EQ(shown.product.vendor, defaults.product.vendor);
    EXPECT_EQ(shown.dmiRoot, defaults.dmiRoot);
    EXPECT_EQ(shown.discover, defaults.discover);
    EXPECT_THAT(shown.nodes, IsEmpty());
    EXPECT_THAT(shown.flags, ElementsAre(Pair("gate.refuse_lossy_values", true)));
    EXPECT_THAT(problems, IsEmpty());
}

TEST_F(AgentSettingsTest, DeriveTheIdentifyingNumberWithoutRevealingTheMachineId) {
    const std::string number = read("").product.identifyingNumber;
    EXPECT_THAT(number, MatchesRegex("unknown|[0-9a-f]{32}"));
    EXPECT_EQ(number, read("").product.identifyingNumber);
    EXPECT_EQ(Agent::readFile("/etc/machine-id").text.find(number), std::string::npos);
}

TEST_F(AgentSettingsTest, EndDirectoriesWithASeparator) {
    const AgentSettings settings = read("[directories]\ninstall = '/opt/agent'\ndata = '/srv/agent/'\n");
    EXPECT_EQ(settings.installDirectory, "/opt/agent/");
    EXPECT_EQ(settings.dataDirectory, "/srv/agent/");
    EXPECT_THAT(problems, IsEmpty());
}

TEST_F(AgentSettingsTest, RejectRelativeDirectories) {
    const AgentSettings settings = read("[directories]\ninstall = 'agent'\ndata = ''\n");
    EXPECT_EQ(settings.installDirectory, "/usr/lib/ostrel/");
    EXPECT_EQ(settings.dataDirectory, "/var/lib/ostrel/");
    EXPECT_THAT(problems, ElementsAre("configuration key directories.install must be an absolute path; ignored",
                                      "configuration key directories.data must not be empty; ignored"));
}

TEST_F(AgentSettingsTest, ReadTheProduct) {
    const AgentSettings settings = read(
        "[product]\nname = 'A'\nversion = '2.0.0'\nbuild_number = '7'\nidentifying_number = 'N-1'\nvendor = 'V'\n");
    EXPECT_EQ(settings.product.name, "A");
    EXPECT_EQ(settings.product.version, "2.0.0");
    EXPECT_EQ(settings.product.buildNumber, "7");
    EXPECT_EQ(settings.product.identifyingNumber, "N-1");
    EXPECT_EQ(settings.product.vendor, "V");
    EXPECT_THAT(problems, IsEmpty());
}

TEST_F(AgentSettingsTest, RejectEmptyProductValues) {
    EXPECT_EQ(read("[product]\nvendor = ''\n").product.vendor, "VEL");
    EXPECT_THAT(problems, ElementsAre("configuration key product.vendor must not be empty; ignored"));
}

TEST_F(AgentSettingsTest, ReadNodes) {
    const AgentSettings settings = read(R"(
[instrumentation]
dmi_root = "/tmp/dmi"
discover = false
[[instrumentation.node]]
type = 40
path = "/rack 1/host_2"
properties = { 108 = "host2", "39" = "Model X - Tower", "36" = "" }
[[instrumentation.node]]
type = 65535
path = "x"
)");
    EXPECT_THAT(problems, IsEmpty());
    EXPECT_EQ(settings.dmiRoot, "/tmp/dmi/");
    EXPECT_FALSE(settings.discover);
    ASSERT_EQ(settings.nodes.size(), 2U);
    EXPECT_EQ(settings.nodes[0].type, 40U);
    EXPECT_EQ(settings.nodes[0].path, "/rack 1/host_2");
    EXPECT_THAT(settings.nodes[0].properties,
                ElementsAre(Pair(36U, ""), Pair(39U, "Model X - Tower"), Pair(108U, "host2")));
    EXPECT_EQ(settings.nodes[1].type, 65535U);
    EXPECT_THAT(settings.nodes[1].properties, IsEmpty());
}

TEST_F(AgentSettingsTest, SkipNodesWithoutTypeOrPath) {
    const AgentSettings settings = read(R"(
[[instrumentation.node]]
path = "/no/type"
[[instrumentation.node]]
type = 40
[[instrumentation.node]]
type = 65536
path = "/bad/type"
)");
    EXPECT_THAT(settings.nodes, IsEmpty());
    EXPECT_THAT(problems,
                ElementsAre("configuration key instrumentation.node[0].type is missing; ignored",
                            "configuration key instrumentation.node[1].path is missing; ignored",
                            "configuration key instrumentation.node[2].type must be an integer from 0 to 65535; "
                            "ignored"));
}

TEST_F(AgentSettingsTest, SkipPropertiesWithoutANumberOrAString) {
    const AgentSettings settings = read(R"(
[[instrumentation.node]]
type = 1
path = "/x"
properties = { name = "a", "65536" = "b", "10" = 3, "-1" = "c", "12x" = "d", "11" = "good" }
)");
    ASSERT_EQ(settings.nodes.size(), 1U);
    EXPECT_THAT(settings.nodes[0].properties, ElementsAre(Pair(11U, "good")));
    const std::string key = "configuration key instrumentation.node[0].properties.";
    EXPECT_THAT(problems, testing::UnorderedElementsAre(key + "name is not a property number; ignored",
                                                        key + "65536 is not a property number; ignored",
                                                        key + "10 must be a string; ignored",
                                                        key + "-1 is not a property number; ignored",
                                                        key + "12x is not a property number; ignored"));
}

TEST_F(AgentSettingsTest, ReportUnknownKeysOutsideOfTheLogTable) {
    read("color = 1\n[log]\nanything = 1\n[directories]\nlogs = '/x'\n[product]\nid = 'x'\n[instrumentation]\nx = 1\n");
    EXPECT_THAT(problems, ElementsAre("configuration key directories.logs is unknown; ignored",
                                      "configuration key product.id is unknown; ignored",
                                      "configuration key instrumentation.x is unknown; ignored",
                                      "configuration key color is unknown; ignored"));
}

TEST_F(AgentSettingsTest, ReadFlagsByTableAndKey) {
    EXPECT_THAT(read("").flags, IsEmpty());
    EXPECT_THAT(read("[gate]\nrefuse_lossy_values = false\n").flags,
                ElementsAre(Pair("gate.refuse_lossy_values", false)));
    EXPECT_THAT(problems, IsEmpty());
    EXPECT_THAT(read("[gate]\nrefuse_lossy_values = 1\nrefuse = true\n").flags, IsEmpty());
    EXPECT_THAT(problems, testing::SizeIs(2));
}

}  // namespace
