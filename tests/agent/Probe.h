#pragma once

#include <string>
#include <vector>

namespace agent_test {

/** How a probe process ended and what it said on its standard streams. */
struct ProbeResult {
    int exitCode;  ///< -1 when it did not end by itself
    std::string output;
    std::string errors;
};

/** Runs the probe under a configuration file; an empty path leaves the variable unset. */
ProbeResult runProbe(const std::string& configuration, std::vector<std::string> arguments);

/** The same with another program in the probe's place. */
ProbeResult runProgram(const std::string& program, const std::string& configuration,
                       std::vector<std::string> arguments);

}  // namespace agent_test
