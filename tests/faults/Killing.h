#pragma once

#include <sys/types.h>

#include <functional>
#include <string>

#include "TestEnvironment.h"

namespace faults {

/** State of a record file. */
enum class FileState { complete, empty, truncated };

/**
 * Returns the state of a record file with `linesOfRecord` lines per record. A complete file has all lines that its
 * count declares, and the last one ends with a line feed.
 */
FileState stateOf(const std::string& content, int linesOfRecord);

/** Returns the number of complete records in a file, regardless of its count. */
int completeRecordsIn(const std::string& content, int linesOfRecord);

constexpr int linesOfLease = 13;
constexpr int linesOfWarranty = 4;

/**
 * Runs work in a child process. The process exits with status 0, or 1 after an exception.
 * @return the process id, for waitForEnd(); throws std::runtime_error if fork fails
 */
pid_t startProcess(const std::function<void()>& work);

/**
 * Waits for a child process. @return true if SIGKILL ended it, false if it exited with status 0; throws
 * std::runtime_error otherwise
 */
bool waitForEnd(pid_t child);

/** Runs work in a child process and waits for it. @return see waitForEnd() */
bool isKilled(const std::function<void()>& work);

}  // namespace faults
