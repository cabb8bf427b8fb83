#pragma once

#include <functional>
#include <map>
#include <string>
#include <vector>

/**
 * Test double of the framework's locks, files and property files. Records the calls that the asset element makes and
 * whether the lock was held, and injects failures.
 */
namespace assetFileDouble {

/** Returns the calls since forget(), each with its arguments, and with the suffix " locked" if the lock was held. */
const std::vector<std::string>& calls();

/** Returns whether the lock is held. */
bool locked();

/** Returns the values of the property file by key. A key that is not in the map has an empty value. */
std::map<std::string, std::string>& values();

/** Runs an action before each call with this string, including its arguments. If the action throws, the call fails. */
void before(const std::string& call, std::function<void()> action);

/** Clears calls, values and actions. */
void forget();

}  // namespace assetFileDouble
