#include "support/AgentEnvironment.h"

/** Computers with every form of product name. */
const char* const agentNodes = R"(
[[instrumentation.node]]
type = 1
path = "/system one"
properties = { "36" = "Example Maker", "108" = "the system" }

[[instrumentation.node]]
type = 1
path = "/system two"
properties = { "36" = "Other Maker" }

[[instrumentation.node]]
type = 40
path = "/c1"
properties = { "39" = "Model X - Tower", "108" = "spaced", "36" = "Computer Maker" }

[[instrumentation.node]]
type = 40
path = "/c2"
properties = { "39" = "Model-X", "108" = "tight" }

[[instrumentation.node]]
type = 40
path = "/c3"
properties = { "39" = "Model X", "108" = "dashless" }

[[instrumentation.node]]
type = 40
path = "/c4"
properties = { "39" = "-Tower - Red", "108" = "dash first" }

[[instrumentation.node]]
type = 40
path = "/c5"
properties = { "39" = "A-B", "108" = "dash second" }

[[instrumentation.node]]
type = 40
path = "/c6"
properties = { "39" = "Model X - Tower - Red", "108" = "many dashes" }

[[instrumentation.node]]
type = 40
path = "/c7"
properties = { "39" = "", "108" = "empty" }

[[instrumentation.node]]
type = 40
path = "/c8"
properties = { "108" = "productless" }

[[instrumentation.node]]
type = 40
path = "/c9"
properties = { "39" = "Model X - Tower" }
)";
