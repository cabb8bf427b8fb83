#pragma once

#include <string>
#include <vector>

namespace agent_test {

/** Exit code and output of a probe process. */
struct ProbeResult {
    int exitCode;  ///< -1 when it did not end by itself
    std::string output;
    std::string errors;
};

/** Runs the probe under a configuration file; an empty path leaves the variable unset. */
ProbeResult runProbe(const std::string& configuration, std::vector<std::string> arguments);

/** Runs another program instead of the probe. */
ProbeResult runProgram(const std::string& program, const std::string& configuration,
                       std::vector<std::string> arguments);

}  // namespace agent_test
