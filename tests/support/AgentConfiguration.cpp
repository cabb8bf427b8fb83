#include "support/AgentConfiguration.h"

#include <filesystem>

#include "support/AgentEnvironment.h"
#include "support/Files.h"

namespace agentEnvironment {

namespace {

/** The last line of the configuration before the nodes. */
const std::string beforeNodes = "discover = false\n";

/** The part of the configuration before the version. */
const std::string beforeVersion = "\nversion = \"";

std::filesystem::path configuration() {
    return directory() / "agent.toml";
}

}  // namespace

AgentConfiguration::AgentConfiguration(const std::function<std::string(const std::string&)>& change)
    : before(testsupport::readFile(configuration())) {
    testsupport::writeFile(configuration(), change(before));
}

AgentConfiguration::~AgentConfiguration() {
    testsupport::writeFile(configuration(), before);
}

AgentNodes::AgentNodes(const std::string& nodes)
    : AgentConfiguration([&](const std::string& usual) {
          return usual.substr(0, usual.find(beforeNodes) + beforeNodes.size()) + nodes;
      }) {}

AgentVersion::AgentVersion(const std::string& version)
    : AgentConfiguration([&](const std::string& usual) {
          const std::size_t value = usual.find(beforeVersion) + beforeVersion.size();
          return usual.substr(0, value) + version + usual.substr(usual.find('"', value));
      }) {}

}  // namespace agentEnvironment
