#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
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

/** Problems of a configuration, one sentence each, in the order in which they were found. */
using Problems = std::vector<std::string>;

/**
 * Reads the keys of one table of the configuration and records its problems: values of the wrong kind and, at the end,
 * unknown keys. For a value that is absent or wrong the functions return no value, and the caller uses its default.
 */
class TableReader {
public:
    /**
     * @param table    the table; null for an empty one
     * @param name     the table's name in problems, such as "log"; empty for the document
     * @param problems receives the problems
     */
    TableReader(const TomlTable* table, std::string name, Problems& problems);

    std::optional<std::string> string(std::string_view key);
    std::optional<std::string> nonEmptyString(std::string_view key);
    std::optional<bool> flag(std::string_view key);

    /** An integer from minimum to maximum. */
    std::optional<std::int64_t> number(std::string_view key, std::int64_t minimum, std::int64_t maximum);

    /** The strings of an array. */
    std::optional<std::vector<std::string>> strings(std::string_view key);

    /** The table under a key; an empty one if there is none. */
    TableReader table(std::string_view key);

    /** The tables of the array of tables under a key, in order. */
    std::vector<TableReader> tables(std::string_view key);

    /** All keys with string values, in the order of the keys; records a problem for each other value. */
    std::vector<std::pair<std::string, std::string>> allStrings();

    /** Returns whether the table has the key, with a value of any kind, and marks the key as known. */
    bool has(std::string_view key) { return find(key) != nullptr; }

    /** Records a problem with the value of a key. */
    void reject(std::string_view key, const std::string& why);

    /** Records a problem for each key that no other function has been called for. */
    void rejectUnknownKeys();

private:
    /** Returns the value of a key, null if there is none, and marks the key as known. */
    const TomlValue* find(std::string_view key);

    /** Also returns null for a value that is not valid, and records a problem with the requirement. */
    template <class IsValid>
    const TomlValue* find(std::string_view key, IsValid isValid, const std::string& requirement);
    std::string nameOf(std::string_view key) const;

    const TomlTable* source;
    std::string tableName;
    Problems* problems;
    std::vector<std::string> knownKeys;
};

}  // namespace Agent
