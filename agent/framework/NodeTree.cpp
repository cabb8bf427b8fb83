#include "framework/NodeTree.h"

#include <algorithm>

namespace KO {

void NodeTree::put(Node node) {
    const auto place = std::find_if(allNodes.begin(), allNodes.end(),
                                    [&node](const Node& present) { return present.path == node.path; });
    if (place == allNodes.end()) {
        allNodes.push_back(std::move(node));
    } else {
        *place = std::move(node);
    }
}

}  // namespace KO
