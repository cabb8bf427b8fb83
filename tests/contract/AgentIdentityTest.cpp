#include <algorithm>
#include <filesystem>

#include "ProviderFixture.h"
#include "support/AgentConfiguration.h"
#include "support/Files.h"

// The agent's instance, VELKO_OstrelAgent.

namespace contract {
namespace {

namespace fs = std::filesystem;
using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::named;
using testsupport::stringOf;
using testsupport::text;

constexpr const char* identityClass = "VELKO_OstrelAgent";
constexpr const char* notThisAgent = "Could not find specified Agent.";

class AgentIdentityTest : public ProviderTest {
protected:
    ~AgentIdentityTest() override { fs::remove_all(marker()); }

    static fs::path marker() { return agentEnvironment::installDirectory() / "version.lv1"; }

    static ObjectPath path(std::vector<NamedValue> keys) {
        return testsupport::objectPath(nameSpace, identityClass, std::move(keys));
    }

    /** Returns the agent's keys with some values replaced. */
    static std::vector<NamedValue> keys(const std::vector<NamedValue>& changes = {}) {
        std::vector<NamedValue> all{named("Name", text("Test Agent")), named("IdentifyingNumber", text("ID-1")),
                                    named("ProductName", text("Test Agent")), named("Vendor", text("VEL")),
                                    named("Version", text("4.2.0"))};
        for (const NamedValue& change : changes) {
            std::find_if(all.begin(), all.end(), [&](const NamedValue& key) {
                return key.name == change.name;
            })->value = change.value;
        }
        return all;
    }

    /**
     * Returns whether GetInstance returns the agent for a path with these keys. Fails the test unless the response is
     * the agent or is empty.
     */
    bool isTheAgent(const std::vector<NamedValue>& keysOfPath) {
        agentEnvironment::forgetLog();
        const Outcome outcome = provider().getInstance(path(keysOfPath));
        const bool found = outcome.instances().size() == 1;
        if (found) {
            EXPECT_THAT(outcome, isOk(1));
            EXPECT_THAT(loggedFailures(), IsEmpty());
        } else {
            EXPECT_THAT(outcome, isOk(0));
            EXPECT_THAT(outcome.events, IsEmpty());
            EXPECT_THAT(caughtFailures(), ElementsAre(notThisAgent));
        }
        return found;
    }

    /** Returns the filter types that the last request compared, in order. */
    static std::vector<std::string> comparedTypes() {
        std::vector<std::string> types;
        for (const LogRecord& record : logOf()) {
            const std::string label = "Parameters List: FilterType=";
            const std::size_t found = record.text.find(label);
            if (record.function == "setFilter" && record.text.rfind("ENTERING", 0) == 0 && found != std::string::npos) {
                types.push_back(record.text.substr(found + label.size(), 1));
            }
        }
        return types;
    }
};

TEST_F(AgentIdentityTest, ThereIsExactlyOneAgent) {
    const Outcome names = provider().enumerateInstanceNames(classPath(identityClass));
    EXPECT_THAT(names, isOk(1));
    EXPECT_EQ(names.paths().size(), 1U);
    const Outcome instances = provider().enumerateInstances(classPath(identityClass));
    EXPECT_THAT(instances, isOk(1));
    EXPECT_EQ(instances.instances().size(), 1U);
}

TEST_F(AgentIdentityTest, ItsPathHasFiveKeys) {
    const auto paths = provider().enumerateInstanceNames(classPath(identityClass)).paths();
    ASSERT_EQ(paths.size(), 1U);
    EXPECT_EQ(testsupport::toText(paths[0]), testsupport::toText(path(keys())));
    EXPECT_EQ(paths[0].nameSpace, nameSpace);
    for (const NamedValue& key : paths[0].keys) {
        EXPECT_EQ(key.value.type, CMPI_string) << key.name;
    }
}

TEST_F(AgentIdentityTest, ItsInstanceHasNineStringsInOrder) {
    const auto instances = provider().enumerateInstances(classPath(identityClass)).instances();
    ASSERT_EQ(instances.size(), 1U);
    EXPECT_EQ(testsupport::toText(instances[0].path), testsupport::toText(path(keys())));
    EXPECT_THAT(shown(instances[0].properties),
                ElementsAre("Caption=\"VEL Ostrel\"", "Description=\"VEL Ostrel\"", "BuildNumber=\"77\"",
                            "Status=\"OK\"", "Name=\"Test Agent\"", "ProductName=\"Test Agent\"",
                            "IdentifyingNumber=\"ID-1\"", "Vendor=\"VEL\"", "Version=\"4.2.0\""));
    for (const NamedValue& property : instances[0].properties) {
        EXPECT_EQ(property.value.type, CMPI_string) << property.name;
    }
}

TEST_F(AgentIdentityTest, ItIsInTheRequestsNamespace) {
    const auto paths = provider().enumerateInstanceNames(testsupport::objectPath("root/other", identityClass)).paths();
    ASSERT_EQ(paths.size(), 1U);
    EXPECT_EQ(paths[0].nameSpace, "root/other");
}

TEST_F(AgentIdentityTest, TheInstanceIsReturnedIfAllKeysAreEqual) {
    EXPECT_TRUE(isTheAgent(keys()));
    const auto got = provider().getInstance(path(keys())).instances();
    const auto enumerated = provider().enumerateInstances(classPath(identityClass)).instances();
    ASSERT_EQ(got.size(), 1U);
    EXPECT_EQ(shown(got[0].properties), shown(enumerated.at(0).properties));
}

TEST_F(AgentIdentityTest, TheInstanceIsNotReturnedIfOneKeyDiffers) {
    for (const char* name : {"Name", "IdentifyingNumber", "ProductName", "Vendor", "Version"}) {
        EXPECT_FALSE(isTheAgent(keys({named(name, text("other"))}))) << name;
        EXPECT_FALSE(isTheAgent(keys({named(name, text(""))}))) << name;
    }
}

TEST_F(AgentIdentityTest, ItIsReturnedForASingleKey) {
    for (const NamedValue& key : keys()) {
        EXPECT_TRUE(isTheAgent({key})) << key.name;
    }
}

TEST_F(AgentIdentityTest, EachKeyIsComparedIndividually) {
    for (const char* name : {"Name", "IdentifyingNumber", "ProductName", "Vendor", "Version"}) {
        EXPECT_FALSE(isTheAgent({named(name, text("other"))})) << name;
    }
}

TEST_F(AgentIdentityTest, ValuesAreCaseSensitive) {
    EXPECT_FALSE(isTheAgent({named("Name", text("test agent"))}));
    EXPECT_FALSE(isTheAgent({named("Vendor", text("vel"))}));
    EXPECT_FALSE(isTheAgent({named("Version", text("4.2.0 "))}));
    EXPECT_FALSE(isTheAgent({named("IdentifyingNumber", text("id-1"))}));
}

TEST_F(AgentIdentityTest, TheVersionIsCaseSensitive) {
    const agentEnvironment::AgentVersion version("4.2.0-Beta");
    EXPECT_TRUE(isTheAgent({named("Version", text("4.2.0-Beta"))}));
    for (const char* other : {"4.2.0-beta", "4.2.0-BETA", "4.2.0-Beta ", "4.2.0"}) {
        EXPECT_FALSE(isTheAgent({named("Version", text(other))})) << other;
    }
}

TEST_F(AgentIdentityTest, KeyNamesAreCaseInsensitive) {
    EXPECT_TRUE(isTheAgent({named("VENDOR", text("VEL"))}));
    EXPECT_FALSE(isTheAgent({named("vendor", text("other"))}));
}

TEST_F(AgentIdentityTest, KeysAreComparedUpToTheFirstMismatch) {
    isTheAgent(keys());
    EXPECT_THAT(comparedTypes(), ElementsAre("0", "1", "2", "4", "3"));
    isTheAgent(keys({named("ProductName", text("other")), named("Version", text("other"))}));
    EXPECT_THAT(comparedTypes(), ElementsAre("0", "1", "2"));
    isTheAgent(keys({named("Vendor", text("other"))}));
    EXPECT_THAT(comparedTypes(), ElementsAre("0", "1", "2", "4", "3"));
}

TEST_F(AgentIdentityTest, KeysWithOtherNamesAreIgnored) {
    EXPECT_TRUE(isTheAgent({named("InstanceID", text("other"))}));
    EXPECT_THAT(comparedTypes(), IsEmpty());
    EXPECT_TRUE(isTheAgent({}));
    EXPECT_THAT(comparedTypes(), IsEmpty());
}

TEST_F(AgentIdentityTest, KeysOfOtherTypesAreIgnored) {
    EXPECT_TRUE(isTheAgent({named("Version", testsupport::uint32(4))}));
    EXPECT_TRUE(isTheAgent({named("Version", testsupport::nullOf(CMPI_string))}));
    EXPECT_THAT(comparedTypes(), IsEmpty());
}

TEST_F(AgentIdentityTest, KeysOfEnumerationPathsAreCompared) {
    EXPECT_THAT(provider().enumerateInstanceNames(path({named("Vendor", text("other"))})).events, IsEmpty());
    EXPECT_THAT(provider().enumerateInstances(path({named("Vendor", text("other"))})).events, IsEmpty());
    EXPECT_EQ(provider().enumerateInstanceNames(path({named("Vendor", text("VEL"))})).paths().size(), 1U);
}

TEST_F(AgentIdentityTest, BothNamesHaveTheSuffixIfTheMarkerFileExists) {
    testsupport::writeFile(marker(), "");
    const auto instances = provider().enumerateInstances(classPath(identityClass)).instances();
    ASSERT_EQ(instances.size(), 1U);
    EXPECT_EQ(stringOf(instances[0].properties, "Name"), "Test Agent Tarvik Agent");
    EXPECT_EQ(stringOf(instances[0].properties, "ProductName"), "Test Agent Tarvik Agent");
    EXPECT_EQ(stringOf(instances[0].path.keys, "Name"), "Test Agent Tarvik Agent");
    EXPECT_EQ(stringOf(instances[0].path.keys, "ProductName"), "Test Agent Tarvik Agent");
}

TEST_F(AgentIdentityTest, TheMarkerFileIsCheckedInEachRequest) {
    EXPECT_TRUE(isTheAgent({named("Name", text("Test Agent"))}));
    testsupport::writeFile(marker(), "its content does not count");
    EXPECT_FALSE(isTheAgent({named("Name", text("Test Agent"))}));
    EXPECT_TRUE(isTheAgent({named("Name", text("Test Agent Tarvik Agent"))}));
    fs::remove(marker());
    EXPECT_TRUE(isTheAgent({named("Name", text("Test Agent"))}));
}

TEST_F(AgentIdentityTest, ThePropertyListIsNotApplied) {
    const std::vector<std::string> one{"Status"};
    EXPECT_EQ(provider().getInstance(path(keys()), one).instances().at(0).properties.size(), 9U);
    EXPECT_EQ(provider().enumerateInstances(classPath(identityClass), one).instances().at(0).properties.size(), 9U);
}

TEST_F(AgentIdentityTest, TheAgentCannotBeCreatedModifiedOrDeleted) {
    const Instance instance = clientInstance(path(keys()), {named("Caption", text("other"))});
    EXPECT_THAT(provider().createInstance(path(keys()), instance), isRefused(CMPI_RC_ERR_INVALID_CLASS));
    EXPECT_THAT(provider().modifyInstance(path(keys()), instance), isRefused(CMPI_RC_ERR_INVALID_CLASS));
    EXPECT_THAT(provider().deleteInstance(path(keys())), isRefused(CMPI_RC_ERR_INVALID_CLASS));
    EXPECT_TRUE(isTheAgent(keys()));
}

TEST_F(AgentIdentityTest, ObjectsThatCannotBeCreatedAreSkipped) {
    for (const char* function : {"CMPIBrokerEncFT.newObjectPath", "CMPIBrokerEncFT.newInstance"}) {
        broker.failCall(function, 1, CMPI_RC_ERR_FAILED);
        const Outcome outcome = provider().enumerateInstances(classPath(identityClass));
        EXPECT_THAT(outcome, isOk(1)) << function;
        EXPECT_THAT(outcome.instances(), IsEmpty()) << function;
    }
    broker.answerNothing("CMPIBrokerEncFT.newObjectPath", 1);
    const Outcome names = provider().enumerateInstanceNames(classPath(identityClass));
    EXPECT_THAT(names, isOk(1));
    EXPECT_THAT(names.paths(), IsEmpty());
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_F(AgentIdentityTest, NoOtherProviderIsCalled) {
    provider().enumerateInstances(classPath(identityClass));
    for (const std::string& function : broker.functions()) {
        EXPECT_NE(function.rfind("CMPIBrokerFT.", 0), 0U) << function;
    }
}

}  // namespace
}  // namespace contract
