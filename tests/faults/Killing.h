#pragma once

#include <sys/types.h>

#include <functional>
#include <string>

#include "Scene.h"

namespace faults {

/** What a file of records looks like from outside. */
enum class FileState { whole, empty, cutOff };

/** A file of records with so many lines a record. Whole: as many lines as its count promises, each ended. */
FileState stateOf(const std::string& content, int linesOfRecord);

/** How many records a file has all lines of, whatever its count says. */
int wholeRecordsIn(const std::string& content, int linesOfRecord);

constexpr int linesOfLease = 13;
constexpr int linesOfWarranty = 4;

/**
 * Runs work in a process of its own, which ends with it: with status 0, or 1 after an exception.
 * @return the process, which has to be waited for; std::runtime_error when there can be no other process
 */
pid_t startProcess(const std::function<void()>& work);

/** Waits for a child process. @return whether it was killed by SIGKILL; std::runtime_error after any other bad end */
bool waitForEnd(pid_t child);

/** Runs work in a process of its own. @return whether it was killed by SIGKILL; else it came to its end */
bool isKilled(const std::function<void()>& work);

}  // namespace faults
