#pragma once

#include <functional>
#include <map>
#include <string>
#include <vector>

/**
 * Stands in for the framework's locks, files and property files: notes the calls that the asset
 * element makes of them, and whether the lock was held, and fails where it is told to.
 */
namespace assetFileDouble {

/** The calls since forget(), each with its arguments; " locked" at the end of one made under the lock. */
const std::vector<std::string>& calls();

/** Whether the lock is held now. */
bool locked();

/** What is read under each key; a key not there reads as empty. */
std::map<std::string, std::string>& values();

/** Runs an action before each call that reads so, arguments included. One that throws is the call's failure. */
void before(const std::string& call, std::function<void()> action);

/** Drops calls, values and actions. */
void forget();

}  // namespace assetFileDouble
