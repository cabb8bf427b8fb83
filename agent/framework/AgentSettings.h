#pragma once

#include "configuration/Document.h"
#include "framework/NodeTree.h"

#include <string>

namespace KO {

/** The framework's part of the configuration: every table except [log]. */
struct AgentSettings {
    std::string installDirectory;  ///< ends with a separator, as does dataDirectory
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
    std::vector<Node> nodes;  ///< nodes to add, or to replace discovered ones

    std::map<std::string, bool> flags;  ///< the configured flags, by table and key: "gate.refuse_lossy_values"
};

/** Reads the settings; absent and wrong values have their defaults. */
AgentSettings readAgentSettings(const Agent::Document& document, Agent::Problems& problems);

}  // namespace KO
