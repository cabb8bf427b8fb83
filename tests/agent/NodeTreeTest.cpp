#include <gmock/gmock.h>

#include "framework/NodeTree.h"

using KO::Node;
using KO::NodeTree;
using testing::ElementsAre;
using testing::Field;

TEST(NodeTree, KeepsTheOrderInWhichNodesWerePut) {
    NodeTree tree;
    tree.put({1, "/b", {}});
    tree.put({2, "/a", {}});
    EXPECT_THAT(tree.nodes(), ElementsAre(Field(&Node::path, "/b"), Field(&Node::path, "/a")));
}

TEST(NodeTree, ReplacesTheCompleteNodeAtAPath) {
    NodeTree tree;
    tree.put({1, "/a", {{108, "old"}, {36, "vendor"}}});
    tree.put({1, "/b", {}});
    tree.put({40, "/a", {{108, "new"}}});
    ASSERT_EQ(tree.nodes().size(), 2U);
    EXPECT_EQ(tree.nodes()[0].type, 40U);
    EXPECT_THAT(tree.nodes()[0].properties, ElementsAre(testing::Pair(108U, "new")));
}
