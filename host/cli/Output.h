#pragma once

#include <string>
#include <vector>

#include "cli/TextLayout.h"
#include "model/Response.h"
#include "schema/Registration.h"
#include "schema/Schema.h"

namespace cimhost {

/** A class and its providers. */
struct ListedClass {
    std::string name{};
    const Class* definition = nullptr;  ///< null if the schema does not contain the class
    std::vector<ProviderRegistration> providers{};
};

}  // namespace cimhost

/** Output for people. Control characters in data are escaped, so that they do not control the terminal. */
namespace cimhost::text {

/** The path, then one line per property: name, type, value. Instances are separated by an empty line. */
std::string format(const std::vector<Instance>& instances, const Style& style);

/** One path per line. */
std::string format(const std::vector<ObjectPath>& paths, const Style& style);

/** Per provider: its status, its numbered results, and the number of its calls to returnDone. */
std::string format(const std::vector<ProviderResponse>& responses, const Style& style);

/** One line per class and provider: class, interfaces, provider, library, namespaces. */
std::string format(const std::vector<ListedClass>& classes, const Style& style);

}  // namespace cimhost::text

/**
 * Output for programs: a JSON document with a line feed at the end. Properties and keys keep their order; each has its
 * CIM type, its value, and whether it is an array. Bytes that are not UTF-8 become U+FFFD. docs/cimhost.md shows the
 * format.
 */
namespace cimhost::json {

std::string format(const std::vector<Instance>& instances);
std::string format(const Instance& instance);
std::string format(const std::vector<ObjectPath>& paths);
std::string format(const ObjectPath& path);
std::string format(const std::vector<ProviderResponse>& responses);
std::string format(const std::vector<ListedClass>& classes);

}  // namespace cimhost::json
