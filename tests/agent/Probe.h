#pragma once

#include <string>
#include <vector>

namespace agent_test {

/** Exit code and output of a probe process. */
struct ProbeResult {
    int exitCode;  ///< -1 if the process was killed by a signal
    std::string output;
    std::string errors;
};

/** Runs the probe with a configuration file; for an empty path, the variable is not set. */
ProbeResult runProbe(const std::string& configuration, std::vector<std::string> arguments);

/** Runs another program instead of the probe. */
ProbeResult runProgram(const std::string& program, const std::string& configuration,
                       std::vector<std::string> arguments);

}  // namespace agent_test
