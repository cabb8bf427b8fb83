#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

// Forward declarations, so that only the source files that parse or read values include the TOML library.
namespace toml {
struct discard_comments;
template <typename Comments, template <typename...> class Table, template <typename...> class Array>
class basic_value;
}  // namespace toml

namespace Agent {

/** A value of the configuration file. Tables are sorted by key. */
using TomlValue = toml::basic_value<toml::discard_comments, std::map, std::vector>;
using TomlTable = std::map<std::string, TomlValue>;

/** Problems of a configuration, one sentence each, in the order in which they were found. */
using Problems = std::vector<std::string>;

/**
 * Reads the keys of one table of the configuration. Records a problem for each invalid value and, in
 * rejectUnknownKeys(), for each unknown key. If a value is absent or invalid, the functions return no value, and the
 * caller uses its default.
 */
class TableReader {
public:
    /**
     * @param table    the table; null for an empty table
     * @param name     the table's name in problems, such as "log"; empty for the root table
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

    /** The table under a key; an empty table if there is none. */
    TableReader table(std::string_view key);

    /** The tables of the array of tables under a key, in order. */
    std::vector<TableReader> tables(std::string_view key);

    /** All string values with their keys, sorted by key. Records a problem for each value of another type. */
    std::vector<std::pair<std::string, std::string>> allStrings();

    /** Returns whether the table has the key, with a value of any kind, and marks the key as known. */
    bool has(std::string_view key) { return find(key) != nullptr; }

    /** Records a problem with the value of a key. */
    void reject(std::string_view key, const std::string& why);

    /** Records a problem for each key of the table that is not marked as known. */
    void rejectUnknownKeys();

private:
    /** Marks a key as known and returns its value; null if there is none. */
    const TomlValue* find(std::string_view key);

    /** Like find(key), except that an invalid value yields null and a problem that states the requirement. */
    template <class IsValid>
    const TomlValue* find(std::string_view key, IsValid isValid, const std::string& requirement);
    std::string nameOf(std::string_view key) const;

    const TomlTable* source;
    std::string tableName;
    Problems* problems;
    std::vector<std::string> knownKeys;
};

}  // namespace Agent
