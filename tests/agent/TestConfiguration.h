#pragma once

#include <string>

namespace agent_test {

/** The directory whose subdirectories "install" and "data" this program's agent is configured with. */
const std::string& configuredDirectory();

}  // namespace agent_test
