#include "NodesFixture.h"
#include "framework/AgentState.h"

namespace providerTest {

ProcessNodes::ProcessNodes(const std::string& toml) : configuration(toml) {
    KO::forgetAgentState();
}

ProcessNodes::~ProcessNodes() {
    KO::forgetAgentState();
}

const char* const assetNodes = R"(
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

const char* const settingNodes = R"(
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

}  // namespace providerTest
