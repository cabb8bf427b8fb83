#include <memory>

#include "AssetFixture.h"
#include "support/AgentConfiguration.h"

// Asset data with missing nodes or properties, and with more than one computer.

namespace contract {
namespace {

using testing::ElementsAre;
using testsupport::named;
using testsupport::stringOf;
using testsupport::text;

/** Returns a node of the tree in the configuration's format. */
std::string node(int type, const std::string& path, const std::string& properties) {
    return "[[instrumentation.node]]\ntype = " + std::to_string(type) + "\npath = \"" + path + "\"\nproperties = { " +
           properties + " }\n";
}

std::string system(const std::string& properties = "\"36\" = \"Example Maker\"") {
    return node(1, "/system", properties);
}

std::string computer(const std::string& properties) {
    return node(40, "/system/computer", properties);
}

class AssetNodesTest : public AssetTest {
protected:
    /** Sets the agent's instrumentation tree. */
    void setNodes(const std::string& toml) {
        unload();
        nodes.reset();
        nodes = std::make_unique<agentEnvironment::AgentNodes>(toml);
    }

    /** Returns the property ProductName of a computer with this product. */
    std::string productNameOf(const std::string& product) {
        setNodes(system() + computer("\"108\" = \"testhost\", \"39\" = \"" + product + "\""));
        return property("ProductName");
    }

    int countWith(std::vector<NamedValue> keysOfPath) {
        const Outcome outcome = provider().getInstance(path(std::move(keysOfPath)));
        EXPECT_THAT(outcome, isOk(1));
        return static_cast<int>(outcome.instances().size());
    }

private:
    std::unique_ptr<agentEnvironment::AgentNodes> nodes;
};

TEST_F(AssetNodesTest, TheProductNameEndsOneCharacterBeforeTheFirstDash) {
    EXPECT_EQ(productNameOf("Model X - Tower"), "\"Model X\"");
    EXPECT_EQ(productNameOf("Model X - Tower - Large"), "\"Model X\"");
    EXPECT_EQ(productNameOf("Model-X"), "\"Mode\"");
    EXPECT_EQ(productNameOf("M-X"), "\"\"");
    EXPECT_EQ(productNameOf("Model X -"), "\"Model X\"");
}

TEST_F(AssetNodesTest, AProductNameWithALeadingDashIsUnchanged) {
    EXPECT_EQ(productNameOf("- Tower"), "\"- Tower\"");
    EXPECT_EQ(productNameOf("-"), "\"-\"");
}

TEST_F(AssetNodesTest, AProductNameWithoutADashRepeatsThePrecedingString) {
    writeData(assetFile, "USER.AssetNumber=A-1\nUSER.AssetIdTag=T-9\n");
    EXPECT_EQ(productNameOf("Model X"), "\"T-9\"");
    EXPECT_EQ(productNameOf(""), "\"T-9\"");
}

TEST_F(AssetNodesTest, AProductNameWithoutADashIsTheComputersNameIfTheFileCannotBeRead) {
    blockData(assetFile);
    EXPECT_EQ(productNameOf("Model X"), "\"testhost\"");
}

TEST_F(AssetNodesTest, AComputerWithoutAProductHasNoProductName) {
    setNodes(system() + computer("\"108\" = \"testhost\""));
    EXPECT_EQ(property("ProductName"), "(none)");
    EXPECT_EQ(asset().properties.size(), 32U);
}

TEST_F(AssetNodesTest, AComputerWithoutAProductHasTheOtherPropertiesIfTheFileCannotBeRead) {
    blockData(assetFile);
    setNodes(system() + computer("\"108\" = \"testhost\""));
    EXPECT_THAT(testsupport::namesOf(asset().properties),
                ElementsAre("IdentifyingNumber", "Name", "Vendor", "Version", "Caption", "Description", "CSName",
                            "AssetIDStringArea", "LocalDateTime"));
    EXPECT_THAT(assetProperties(),
                ElementsAre("IdentifyingNumber=\"/system\"", "Name=\"testhost\"", "Vendor=\"Example Maker\"",
                            "Version=\"4.2.0\"", "Caption=\"Asset ID Information\"",
                            "Description=\"Asset ID Information\"", "CSName=\"testhost\"", "AssetIDStringArea=1024"));
}

TEST_F(AssetNodesTest, AComputerWithoutANameRepeatsThePrecedingStrings) {
    setNodes(system() + computer("\"39\" = \"Model X - Tower\""));
    const Instance instance = asset();
    EXPECT_EQ(shownProperty(instance, "Name"), "\"/system\"") << "the identifying number";
    EXPECT_EQ(shownProperty(instance, "CSName"), "\"Asset ID Information\"") << "the description";
    EXPECT_EQ(shownProperty(instance, "Vendor"), "\"Example Maker\"");
    EXPECT_EQ(shownProperty(instance, "ProductName"), "\"Model X\"");
}

TEST_F(AssetNodesTest, ASystemWithoutAVendorRepeatsThePrecedingString) {
    setNodes(system("\"108\" = \"testhost\"") + computer("\"36\" = \"not asked\", \"108\" = \"alpha\""));
    EXPECT_EQ(property("Vendor"), "\"alpha\"") << "the name";
}

TEST_F(AssetNodesTest, WithoutNameAndVendorBothRepeatThePrecedingString) {
    setNodes(system("\"108\" = \"testhost\"") + computer("\"39\" = \"Model X - Tower\""));
    const Instance instance = asset();
    EXPECT_EQ(shownProperty(instance, "Name"), "\"/system\"");
    EXPECT_EQ(shownProperty(instance, "Vendor"), "\"/system\"");
}

TEST_F(AssetNodesTest, AKeyWhosePropertyCannotBeReadMatchesAnyValue) {
    setNodes(system("\"108\" = \"testhost\"") + computer("\"39\" = \"Model X - Tower\""));
    EXPECT_EQ(countWith({named("Vendor", text("whoever"))}), 1);
    EXPECT_EQ(countWith({named("Name", text("whatever"))}), 1);
    EXPECT_EQ(countWith({named("Vendor", text("whoever")), named("Version", text("other"))}), 0);
    EXPECT_EQ(countWith({named("IdentifyingNumber", text("/other"))}), 0);
}

TEST_F(AssetNodesTest, WithoutASystemTheFileIsNotRead) {
    writeData(assetFile, "USER.AssetNumber=A-1\n");
    setNodes(computer("\"108\" = \"testhost\", \"39\" = \"Model X - Tower\""));
    const Instance instance = asset();
    EXPECT_THAT(testsupport::namesOf(instance.properties),
                ElementsAre("IdentifyingNumber", "Name", "Vendor", "Version", "Caption", "Description", "CSName",
                            "AssetIDStringArea", "ProductName", "LocalDateTime"));
    EXPECT_EQ(shownProperty(instance, "IdentifyingNumber"), "\"\"");
    EXPECT_EQ(shownProperty(instance, "Name"), "\"testhost\"");
    EXPECT_EQ(shownProperty(instance, "Vendor"), "\"testhost\"") << "the preceding string";
    EXPECT_EQ(readData(assetFile), "USER.AssetNumber=A-1\n");
}

TEST_F(AssetNodesTest, AModificationOfAnUnreadFileClearsTheOtherAssetValues) {
    writeData(assetFile,
              "USER.AssetNumber=A-1\nUSER.AssetIdTag=T-9\nUSER.Name=Ann\nUSER.PersonalizedLabel1=L1\n"
              "USER.PurchaseDate=20240101000000.000000+000\nOTHER.Key=kept\n");
    setNodes(computer("\"108\" = \"testhost\""));
    const Outcome outcome =
        provider().modifyInstance(path(), clientInstance(path(), {named("SystemLocation", text("Hall"))}));
    EXPECT_THAT(outcome, isOk(0));
    EXPECT_EQ(stored("USER.Location"), "Hall");
    for (const char* key : {"USER.AssetNumber", "USER.AssetIdTag", "USER.Name", "USER.PersonalizedLabel1",
                            "USER.PurchaseDate", "USER.PersonalizedData5"}) {
        EXPECT_EQ(stored(key), "") << key;
    }
    EXPECT_EQ(stored("OTHER.Key"), "kept");
}

TEST_F(AssetNodesTest, WithoutAComputerThereIsNoInstance) {
    setNodes(system());
    for (const Outcome& outcome : {provider().enumerateInstances(path()), provider().enumerateInstanceNames(path()),
                                   provider().getInstance(path(keys()))}) {
        EXPECT_THAT(outcome, isOk(1));
        EXPECT_EQ(outcome.events.size(), 1U);
    }
    EXPECT_EQ(readData(assetFile), "") << "the file is created";
}

TEST_F(AssetNodesTest, EachComputerIsAnInstanceWithTheSameAssetData) {
    writeData(assetFile, "USER.AssetNumber=A-1\n");
    setNodes(system() + computer("\"108\" = \"alpha\", \"39\" = \"Model X - Tower\"") +
             node(40, "/system/second", "\"108\" = \"beta\", \"39\" = \"Model Y - Rack\""));
    const Outcome outcome = provider().enumerateInstances(path());
    EXPECT_THAT(outcome, isOk(1));
    const auto instances = outcome.instances();
    ASSERT_EQ(instances.size(), 2U);
    EXPECT_EQ(stringOf(instances[0].properties, "Name"), "alpha");
    EXPECT_EQ(stringOf(instances[0].properties, "ProductName"), "Model X");
    EXPECT_EQ(stringOf(instances[1].properties, "Name"), "beta");
    EXPECT_EQ(stringOf(instances[1].properties, "CSName"), "beta");
    EXPECT_EQ(stringOf(instances[1].properties, "ProductName"), "Model Y");
    for (const Instance& instance : instances) {
        EXPECT_EQ(stringOf(instance.properties, "AssetNumber"), "A-1");
        EXPECT_EQ(stringOf(instance.properties, "Vendor"), "Example Maker");
        EXPECT_EQ(stringOf(instance.properties, "IdentifyingNumber"), "/system");
    }
    EXPECT_EQ(provider().enumerateInstanceNames(path()).paths().size(), 2U);
}

TEST_F(AssetNodesTest, KeysSelectAmongSeveralComputers) {
    setNodes(system() + computer("\"108\" = \"alpha\"") + node(40, "/system/second", "\"108\" = \"beta\"") +
             node(40, "/system/third", "\"108\" = \"alpha\""));
    const auto found = provider().getInstance(path({named("Name", text("beta"))})).instances();
    ASSERT_EQ(found.size(), 1U);
    EXPECT_EQ(stringOf(found[0].properties, "Name"), "beta");
    EXPECT_EQ(countWith({named("Name", text("alpha"))}), 2);
    EXPECT_EQ(countWith({named("Version", text("4.2.0"))}), 3);
    EXPECT_EQ(countWith({named("Name", text("alpha")), named("Version", text("other"))}), 0);
}

TEST_F(AssetNodesTest, TheIdentifyingNumberIsThePathOfTheSystemNode) {
    setNodes(node(1, "/my system_1", "\"36\" = \"Example Maker\"") + computer("\"108\" = \"testhost\""));
    EXPECT_EQ(property("IdentifyingNumber"), "\"/my%20system%5F1\"");
    EXPECT_EQ(countWith({named("IdentifyingNumber", text("/my%20system%5F1"))}), 1);
    EXPECT_EQ(countWith({named("IdentifyingNumber", text("/my system_1"))}), 0);
}

}  // namespace
}  // namespace contract
