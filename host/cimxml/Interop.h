#pragma once

#include <string>
#include <vector>

#include "schema/Schema.h"

namespace cimhost::cimxml {

/** Names of the interop namespace, which clients use to discover the server and its namespaces. */
const std::vector<std::string>& interopNameSpaces();

/**
 * The classes CIM_ObjectManager, CIM_Namespace and __Namespace, with one instance for the server and one for each
 * namespace.
 * @param host       name of the machine
 * @param nameSpaces namespaces besides the interop namespaces
 */
Schema interopSchema(const std::string& host, const std::string& version, const std::vector<std::string>& nameSpaces);

}  // namespace cimhost::cimxml
