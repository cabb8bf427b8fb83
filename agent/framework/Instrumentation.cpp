#include "KO/Instrumentation.h"

#include <vector>

#include "framework/AgentState.h"

namespace KO {

struct Instrumentation::Implementation {
    std::shared_ptr<const AgentState> agent = agentState();
    std::vector<const Node*> selected;
    std::size_t position = 0;

    const Node* current() const { return position < selected.size() ? selected[position] : nullptr; }

    template <typename Predicate>
    void select(const Predicate& fits) {
        selected.clear();
        position = 0;
        for (const Node& node : agent->tree.nodes()) {
            if (fits(node)) {
                selected.push_back(&node);
            }
        }
    }
};

Instrumentation::Instrumentation() : implementation(std::make_unique<Implementation>()) {}
Instrumentation::~Instrumentation() = default;

void Instrumentation::selectNode(NodeLexicon::NodeType type) {
    implementation->select([type](const Node& node) { return node.type == type; });
}

void Instrumentation::selectNode(const std::string& path) {
    implementation->select([&path](const Node& node) { return node.path == path; });
}

Instrumentation::operator bool() {
    return implementation->current() != nullptr;
}

void Instrumentation::operator++() {
    if (implementation->current() != nullptr) {
        ++implementation->position;
    }
}

bool Instrumentation::getProperty(NodeLexicon::Properties property, std::string& value) {
    const Node* node = implementation->current();
    if (node == nullptr) {
        return false;
    }
    const auto entry = node->properties.find(property);
    if (entry == node->properties.end()) {
        return false;
    }
    value = entry->second;
    return true;
}

std::string Instrumentation::getPathToNode() {
    const Node* node = implementation->current();
    return node != nullptr ? node->path : std::string();
}

std::string Instrumentation::getPathToComputer() {
    for (const Node& node : implementation->agent->tree.nodes()) {
        if (node.type == NodeLexicon::NT_COMPUTER) {
            return node.path;
        }
    }
    return {};
}

std::string Instrumentation::convertPathToString(const std::string& path) {
    return pathToText(path);
}
std::string Instrumentation::convertStringToPath(const std::string& text) {
    return textToPath(text);
}

}  // namespace KO
