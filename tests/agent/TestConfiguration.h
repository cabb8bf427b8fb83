#pragma once

#include <string>

namespace agent_test {

/** Returns the directory with the subdirectories "install" and "data" of this program's agent. */
std::string configuredDirectory();

}  // namespace agent_test
