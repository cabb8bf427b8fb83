#include <gmock/gmock.h>

#include <filesystem>

#include "framework/NodeTree.h"
#include "support/TemporaryDirectory.h"

using KO::Node;
using KO::NodeTree;
using testing::ElementsAre;
using testing::IsEmpty;

namespace {

constexpr unsigned int nameProperty = 108;
constexpr unsigned int vendorProperty = 36;
constexpr unsigned int productProperty = 39;

class ComputerDiscoveryTest : public testing::Test {
protected:
    /** Returns the properties of the computer that is discovered with the DMI files written so far. */
    std::map<unsigned int, std::string> computer() {
        const NodeTree tree = KO::discoverComputer(dmi.withSlash(), "host1", problems);
        EXPECT_EQ(tree.nodes().size(), 2U);
        return tree.nodes().back().properties;
    }

    testsupport::TemporaryDirectory dmi;
    Agent::Problems problems;
};

TEST_F(ComputerDiscoveryTest, FindsTheSystemAndBelowItTheComputer) {
    const NodeTree tree = KO::discoverComputer(dmi.withSlash(), "host1", problems);
    ASSERT_EQ(tree.nodes().size(), 2U);
    EXPECT_EQ(tree.nodes()[0].type, 1U);
    EXPECT_EQ(tree.nodes()[0].path, "/system");
    EXPECT_EQ(tree.nodes()[1].type, 40U);
    EXPECT_EQ(tree.nodes()[1].path, "/system/computer");
    for (const Node& node : tree.nodes()) {
        EXPECT_EQ(node.properties.at(nameProperty), "host1");
        EXPECT_EQ(node.properties.at(vendorProperty), "Unknown");
        EXPECT_EQ(node.properties.at(productProperty), "Computer - Computer");
    }
    EXPECT_THAT(problems, IsEmpty()) << "absent files are no problem";
}

TEST_F(ComputerDiscoveryTest, ReadsVendorModelAndChassis) {
    dmi.write("sys_vendor", "Example Computers Ltd. \n");
    dmi.write("product_name", "Model X\n");
    dmi.write("chassis_type", "7\n");
    EXPECT_EQ(computer().at(vendorProperty), "Example Computers Ltd.");
    EXPECT_EQ(computer().at(productProperty), "Model X - Tower");
    EXPECT_THAT(problems, IsEmpty());
}

TEST_F(ComputerDiscoveryTest, RemovesDashesFromTheModel) {
    dmi.write("product_name", "X-200-Pro -  rev-B\n");
    dmi.write("chassis_type", "10\n");
    EXPECT_EQ(computer().at(productProperty), "X 200 Pro rev B - Notebook");
}

TEST_F(ComputerDiscoveryTest, NamesChassisTypes) {
    const std::map<std::string, std::string> words = {
        {"3", "Desktop"},   {"9", "Laptop"},    {"17", "Main Server Chassis"},
        {"36", "Stick PC"}, {"137", "Laptop"},  // with the lock bit
        {"1", "Computer"},  {"2", "Computer"},  {"0", "Computer"},
        {"37", "Computer"}, {"", "Computer"},   {"x", "Computer"},
        {"9x", "Computer"}, {"-1", "Computer"}, {"99999999999", "Computer"},
    };
    for (const auto& [type, word] : words) {
        dmi.write("chassis_type", type + "\n");
        EXPECT_EQ(computer().at(productProperty), "Computer - " + word) << type;
    }
    EXPECT_THAT(problems, IsEmpty());
}

TEST_F(ComputerDiscoveryTest, TreatsFirmwarePlaceholdersAsAbsent) {
    for (const char* text : {"To Be Filled By O.E.M.", "TO BE FILLED BY O.E.M.", "System manufacturer", "Not Specified",
                             "None", "Default string", "   ", "", "System Product Name"}) {
        dmi.write("sys_vendor", std::string(text) + "\n");
        dmi.write("product_name", std::string(text) + "  \n");
        EXPECT_EQ(computer().at(vendorProperty), "Unknown") << text;
        EXPECT_EQ(computer().at(productProperty), "Computer - Computer") << text;
    }
}

TEST_F(ComputerDiscoveryTest, ReplacesAModelOfDashesOnly) {
    dmi.write("product_name", "---\n");
    EXPECT_EQ(computer().at(productProperty), "Computer - Computer");
}

TEST_F(ComputerDiscoveryTest, ReplacesAModelThatIsAPlaceholderWithoutItsDashes) {
    for (const char* text : {"none-", "-- Unknown", "to-be-filled-by-o.e.m."}) {
        dmi.write("product_name", std::string(text) + "\n");
        EXPECT_EQ(computer().at(productProperty), "Computer - Computer") << text;
    }
}

TEST_F(ComputerDiscoveryTest, ReplacesInvalidBytesByBlanks) {
    dmi.write("sys_vendor", "Caf\xC3\xA9 \xFF\xFF Ltd\x01\n");
    EXPECT_EQ(computer().at(vendorProperty), "Caf\xC3\xA9 Ltd");
}

TEST_F(ComputerDiscoveryTest, ReportsUnreadableFiles) {
    std::filesystem::create_directory(dmi.file("product_name"));
    EXPECT_EQ(computer().at(productProperty), "Computer - Computer");
    EXPECT_THAT(problems, ElementsAre(dmi.file("product_name") + " cannot be read: Is a directory"));
}

TEST(HostName, IsNotEmpty) {
    EXPECT_NE(KO::hostName(), "");
}

}  // namespace
