#include "agent/TestConfiguration.h"

#include <memory>

#include "support/TemporaryDirectory.h"

namespace agent_test {

namespace {

constexpr const char* nodes = R"(
[product]
name = "Test Agent"
version = "2.3.4"
build_number = "77"
identifying_number = "N-1"
vendor = "Gr\u00fcn"

[instrumentation]
discover = false
[[instrumentation.node]]
type = 1
path = "/system"
properties = { "108" = "host1", "36" = "Maker" }
[[instrumentation.node]]
type = 40
path = "/system/computer"
properties = { "108" = "host1", "36" = "Maker", "39" = "Model X - Tower" }
[[instrumentation.node]]
type = 77
path = "/other"
[[instrumentation.node]]
type = 40
path = "/rack 1/host_2"
properties = { "108" = "host2", "36" = "" }
[[instrumentation.node]]
type = 40
path = "/nameless"
)";

/** Configures the agent of this process before its first use, and cleans up afterwards. */
class Configuration : public testing::Environment {
public:
    void SetUp() override {
        directory = std::make_unique<testsupport::TemporaryDirectory>();
        const std::string directories = "[directories]\ninstall = '" + directory->withSlash() + "install'\ndata = '" +
                                        directory->withSlash() + "data/'\n";
        ::setenv("OSTREL_CONFIG", directory->write("agent.toml", directories + nodes).c_str(), 1);
    }
    void TearDown() override { directory.reset(); }

    std::unique_ptr<testsupport::TemporaryDirectory> directory;
};

auto* const configuration = static_cast<Configuration*>(testing::AddGlobalTestEnvironment(new Configuration));

}  // namespace

std::string configuredDirectory() {
    return configuration->directory->withSlash();
}

}  // namespace agent_test
