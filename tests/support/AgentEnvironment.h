#pragma once

#include <filesystem>
#include <string>
#include <vector>

/**
 * The agent's surroundings of a test program: a directory of its own with configuration, data
 * directory and log file, set up before the first static object of the program needs them, and
 * removed at the program's end.
 *
 * A program that links this says of which instrumentation nodes its agent knows, as TOML text, by
 * defining `const char* const agentNodes` (constant-initialised). Levels admit all records.
 */
extern const char* const agentNodes;

/** A program that defines it likewise has no log: what a log would say is not what it is about, or far too much. */
extern const bool agentHasNoLog __attribute__((weak));

/** The version of the agent product, for programs that define it likewise; "4.2.0" in all others. */
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

std::filesystem::path directory();      ///< all below is in here
std::filesystem::path dataDirectory();  ///< with Lease.dat, Warranty.dat, asset.dat
std::filesystem::path installDirectory();
std::filesystem::path logFile();

/** Empties the data directory and the log, for a test's clean start. Tables in memory stay. */
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

/** The records written since clear() or forgetLog(). */
std::vector<LogRecord> log();

/** Drops the records written so far. */
void forgetLog();

}  // namespace agentEnvironment
