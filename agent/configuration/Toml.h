#pragma once

#include <map>
#include <string>
#include <vector>

// Declared here so that only the files that parse or read values include the library.
namespace toml {
struct discard_comments;
template <typename Comments, template <typename...> class Table, template <typename...> class Array>
class basic_value;
}  // namespace toml

namespace Agent {

/** A value of the configuration file; its tables are sorted by key. */
using TomlValue = toml::basic_value<toml::discard_comments, std::map, std::vector>;
using TomlTable = std::map<std::string, TomlValue>;

}  // namespace Agent
