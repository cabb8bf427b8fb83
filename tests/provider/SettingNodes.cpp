#include "support/AgentEnvironment.h"

/** Two computers, whose paths need an escape in their text form, and a third with the name of the second. */
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
