#pragma once

#include "configuration/Document.h"
#include "framework/NodeTree.h"

#include <string>

namespace KO {

/** What the configuration says to the framework: every table but [log]. */
struct AgentSettings {
    std::string installDirectory;  ///< ends with a separator, like the next
    std::string dataDirectory;

    struct {
        std::string name;
        std::string version;
        std::string buildNumber;
        std::string identifyingNumber;
        std::string vendor;
    } product;

    std::string dmiRoot;      ///< directory of the kernel's DMI files
    bool discover;            ///< whether the computer is discovered
    std::vector<Node> nodes;  ///< nodes to be added, or put in the place of discovered ones

    std::map<std::string, bool> flags;  ///< the switches that are set, by table and key: "gate.refuse_lossy_values"
};

/** Reads the settings; every value that is absent or wrong has its default. */
AgentSettings readAgentSettings(const Agent::Document& document, Agent::Problems& problems);

}  // namespace KO
