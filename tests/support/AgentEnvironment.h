#pragma once

#include <filesystem>
#include <string>
#include <vector>

/**
 * The agent of a test program: a temporary directory with configuration, data directory and log file. It is created
 * before static objects are initialized, and removed when the program ends. The log contains records of all levels.
 *
 * The program defines `const char* const agentNodes`, the agent's nodes as a TOML fragment (constant-initialized).
 */
extern const char* const agentNodes;

/** If a test program defines this, the agent writes no log. */
extern const bool agentHasNoLog __attribute__((weak));

/** The version of the agent's product, if the program defines it; otherwise "4.2.0". */
extern const char* const agentVersion __attribute__((weak));

namespace agentEnvironment {

/** One computer, named "testhost", whose product is "Model X - Tower" by "Example Maker". */
constexpr const char* oneComputer = R"(
[[instrumentation.node]]
type = 1
path = "/system"
properties = { "36" = "Example Maker", "108" = "testhost" }

[[instrumentation.node]]
type = 40
path = "/system/computer"
properties = { "36" = "Example Maker", "39" = "Model X - Tower", "108" = "testhost" }
)";

std::filesystem::path directory();      ///< contains all of the following
std::filesystem::path dataDirectory();  ///< with Lease.dat, Warranty.dat, asset.dat
std::filesystem::path installDirectory();
std::filesystem::path logFile();

/** Empties the data directory and the log, not the tables in memory. */
void clear();

/** One record of the log. */
struct LogRecord {
    std::string channel;  ///< "log" or "trace"
    int level = 0;
    std::string logger;
    std::string function;
    std::string file;
    int line = 0;
    std::string text;
};

/** The records since clear() or forgetLog(). */
std::vector<LogRecord> log();

/** Removes the current records. */
void forgetLog();

}  // namespace agentEnvironment
