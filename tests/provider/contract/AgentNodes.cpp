#include "AgentNodes.h"

#include "support/AgentEnvironment.h"
#include "support/Files.h"

#include <filesystem>

namespace contract {

namespace {

/** The last line of the configuration before the nodes. */
const std::string beforeNodes = "discover = false\n";

std::filesystem::path configuration() {
    return agentEnvironment::directory() / "agent.toml";
}

}  // namespace

AgentNodes::AgentNodes(const std::string& nodes) : before(testsupport::readFile(configuration())) {
    testsupport::writeFile(configuration(), before.substr(0, before.find(beforeNodes) + beforeNodes.size()) + nodes);
}

AgentNodes::~AgentNodes() {
    testsupport::writeFile(configuration(), before);
}

}  // namespace contract
