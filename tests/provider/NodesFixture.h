#pragma once

#include <string>

#include "support/AgentConfiguration.h"

namespace providerTest {

/**
 * Replaces the nodes of this process's agent during the lifetime of this object. The program must link
 * koframework_objects.
 */
class ProcessNodes {
public:
    explicit ProcessNodes(const std::string& toml);
    ~ProcessNodes();
    ProcessNodes(const ProcessNodes&) = delete;
    ProcessNodes& operator=(const ProcessNodes&) = delete;

private:
    agentEnvironment::AgentNodes configuration;
};

/** @name Nodes as TOML fragments */
///@{
extern const char* const assetNodes;    ///< computers with every form of product name
extern const char* const settingNodes;  ///< computers whose paths need escaping, and two computers with the same name
///@}

}  // namespace providerTest
