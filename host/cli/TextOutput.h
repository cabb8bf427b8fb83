#pragma once

#include <string>
#include <vector>

#include "cli/ClassList.h"
#include "cli/Style.h"
#include "operations/Request.h"

/** Output for people. Control characters in data are escaped, so that they cannot steer a terminal. */
namespace cimhost::text {

/** The path, then one line a property: name, type, value. Instances are separated by an empty line. */
std::string format(const std::vector<Instance>& instances, const Style& style);

/** One path a line. */
std::string format(const std::vector<ObjectPath>& paths, const Style& style);

/** For each provider asked: its status, everything it returned, numbered, and how often it said that it was done. */
std::string format(const std::vector<RawAnswer>& answers, const Style& style);

/** One line a class and provider: class, interfaces, provider, library, namespaces. */
std::string format(const std::vector<ListedClass>& classes, const Style& style);

}  // namespace cimhost::text
