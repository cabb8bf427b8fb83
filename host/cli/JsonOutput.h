#pragma once

#include <string>
#include <vector>

#include "cli/ClassList.h"
#include "operations/Request.h"

/**
 * Output for programs, one JSON document with a line feed at the end. Properties and keys stay in their order; each
 * has its CIM type, whether it is an array, and its value, null where it is null. Bytes that are no UTF-8 become
 * U+FFFD. docs/cimhost.md shows the shapes.
 */
namespace cimhost::json {

std::string format(const std::vector<Instance>& instances);
std::string format(const Instance& instance);
std::string format(const std::vector<ObjectPath>& paths);
std::string format(const ObjectPath& path);
std::string format(const std::vector<RawAnswer>& answers);
std::string format(const std::vector<ListedClass>& classes);

}  // namespace cimhost::json
