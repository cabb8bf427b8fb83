#include "support/AgentEnvironment.h"

/**
 * Two computers whose paths contain escaped characters in their string form, and a third one with the second one's
 * name.
 */
const char* const agentNodes = R"(
[[instrumentation.node]]
type = 1
path = "/system"
properties = { "36" = "Example Maker", "108" = "the system" }

[[instrumentation.node]]
type = 40
path = "/system/first box"
properties = { "108" = "alpha" }

[[instrumentation.node]]
type = 40
path = "/system/second_box"
properties = { "108" = "beta" }

[[instrumentation.node]]
type = 40
path = "/system/third"
properties = { "108" = "beta" }

[[instrumentation.node]]
type = 7
path = "/system/fan"
properties = { "36" = "no name" }
)";
