#include <gmock/gmock.h>

#include <thread>
#include <vector>

#include "KO/Instrumentation.h"

using KO::Instrumentation;
using KO::NodeLexicon::NodeType;
using KO::NodeLexicon::NT_COMPUTER;
using KO::NodeLexicon::NT_SYSTEM;
using KO::NodeLexicon::PROPERTY_NAME;
using KO::NodeLexicon::PROPERTY_PRODUCT_NAME;
using KO::NodeLexicon::PROPERTY_VENDOR;
using testing::ElementsAre;

namespace {

std::vector<std::string> pathsOf(NodeType type) {
    std::vector<std::string> paths;
    Instrumentation cursor;
    for (cursor.selectNode(type); cursor; ++cursor) {
        paths.push_back(cursor.getPathToNode());
    }
    return paths;
}

}  // namespace

TEST(Instrumentation, HasInitiallyNoCurrentNode) {
    Instrumentation cursor;
    std::string value = "kept";
    EXPECT_FALSE(static_cast<bool>(cursor));
    EXPECT_EQ(cursor.getPathToNode(), "");
    EXPECT_FALSE(cursor.getProperty(PROPERTY_NAME, value));
    EXPECT_EQ(value, "kept");
}

TEST(Instrumentation, SelectsAllNodesOfATypeInTreeOrder) {
    EXPECT_THAT(pathsOf(NT_COMPUTER), ElementsAre("/system/computer", "/rack 1/host_2", "/nameless"));
    EXPECT_THAT(pathsOf(NT_SYSTEM), ElementsAre("/system"));
    EXPECT_THAT(pathsOf(static_cast<NodeType>(77)), ElementsAre("/other"));
    EXPECT_THAT(pathsOf(static_cast<NodeType>(78)), ElementsAre());
}

TEST(Instrumentation, StaysAfterTheLastNode) {
    Instrumentation cursor;
    cursor.selectNode(NT_SYSTEM);
    ASSERT_TRUE(static_cast<bool>(cursor));
    for (int step = 0; step < 3; ++step) {
        ++cursor;
        EXPECT_FALSE(static_cast<bool>(cursor));
        EXPECT_EQ(cursor.getPathToNode(), "");
    }
}

TEST(Instrumentation, SelectsTheNodeAtAPath) {
    Instrumentation cursor;
    cursor.selectNode("/rack 1/host_2");
    ASSERT_TRUE(static_cast<bool>(cursor));
    EXPECT_EQ(cursor.getPathToNode(), "/rack 1/host_2");
    ++cursor;
    EXPECT_FALSE(static_cast<bool>(cursor));
    cursor.selectNode("/rack 1");
    EXPECT_FALSE(static_cast<bool>(cursor));
    cursor.selectNode("");
    EXPECT_FALSE(static_cast<bool>(cursor));
}

TEST(Instrumentation, RestartsWithEachSelection) {
    Instrumentation cursor;
    cursor.selectNode(NT_COMPUTER);
    ++cursor;
    cursor.selectNode(NT_COMPUTER);
    EXPECT_EQ(cursor.getPathToNode(), "/system/computer");
    cursor.selectNode("/no/such/node");
    EXPECT_FALSE(static_cast<bool>(cursor));
}

TEST(Instrumentation, ReadsPropertiesThatTheNodeHas) {
    Instrumentation cursor;
    cursor.selectNode(NT_COMPUTER);
    std::string value;
    EXPECT_TRUE(cursor.getProperty(PROPERTY_NAME, value));
    EXPECT_EQ(value, "host1");
    EXPECT_TRUE(cursor.getProperty(PROPERTY_PRODUCT_NAME, value));
    EXPECT_EQ(value, "Model X - Tower");
    ++cursor;
    EXPECT_FALSE(cursor.getProperty(PROPERTY_PRODUCT_NAME, value));
    EXPECT_EQ(value, "Model X - Tower") << "untouched";
    EXPECT_TRUE(cursor.getProperty(PROPERTY_VENDOR, value)) << "an empty text is a value";
    EXPECT_EQ(value, "");
}

TEST(Instrumentation, ReturnsThePathOfTheManagedComputer) {
    EXPECT_EQ(Instrumentation().getPathToComputer(), "/system/computer");
}

TEST(Instrumentation, ConvertsPathsToStringsAndBack) {
    Instrumentation cursor;
    for (cursor.selectNode(NT_COMPUTER); cursor; ++cursor) {
        const std::string path = cursor.getPathToNode();
        EXPECT_EQ(cursor.convertStringToPath(cursor.convertPathToString(path)), path);
    }
    EXPECT_EQ(cursor.convertPathToString("/rack 1/host_2"), "/rack%201/host%5F2");
    EXPECT_EQ(cursor.convertPathToString(""), "");
    EXPECT_EQ(cursor.convertStringToPath(""), "");
    EXPECT_EQ(cursor.convertStringToPath("no path"), "no path");
}

TEST(Instrumentation, MayBeUsedByManyThreadsEachWithItsOwnCursor) {
    std::vector<std::thread> threads;
    std::vector<std::size_t> counts(4);
    for (std::size_t& count : counts) {
        threads.emplace_back([&count] {
            for (int round = 0; round < 100; ++round) {
                count += pathsOf(NT_COMPUTER).size();
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_THAT(counts, ElementsAre(300U, 300U, 300U, 300U));
}
