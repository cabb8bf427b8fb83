#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace toml {
inline namespace v3 {
class table;
}
}  // namespace toml

namespace Agent {

/** What is wrong with a configuration, one sentence a problem, in the order in which it was found. */
using Problems = std::vector<std::string>;

/**
 * Reads the keys of one table of the configuration and notes what is wrong with them: values of the
 * wrong kind and, at the end, keys that nobody asked for. A value that is absent or wrong is no
 * value, so that the caller goes on with its default.
 */
class TableReader {
public:
    /**
     * @param table    the table; null is an empty one
     * @param name     what problems call it, such as "log"; empty for the document itself
     * @param problems receives the problems
     */
    TableReader(const toml::table* table, std::string name, Problems& problems);

    std::optional<std::string> text(std::string_view key);      ///< a string
    std::optional<std::string> someText(std::string_view key);  ///< a string that is not empty
    std::optional<bool> flag(std::string_view key);             ///< a boolean

    /** An integer that is not below minimum nor above maximum. */
    std::optional<std::int64_t> number(std::string_view key, std::int64_t minimum, std::int64_t maximum);

    /** The table under a key; an empty one if there is none. */
    TableReader table(std::string_view key);

    /** The tables of the array of tables under a key, in order. */
    std::vector<TableReader> tables(std::string_view key);

    /** All keys with string values, in the order of the key names; the others are problems. */
    std::vector<std::pair<std::string, std::string>> allTexts();

    /** Whether the key is there, of whatever kind its value is. Counts as asking for it. */
    bool has(std::string_view key);

    /** Notes a problem with the value of a key. */
    void reject(std::string_view key, const std::string& why);

    /** Notes a problem for every key that was never asked for. */
    void rejectUnknownKeys();

private:
    std::string nameOf(std::string_view key) const;

    const toml::table* source;
    std::string tableName;
    Problems* problems;
    std::vector<std::string> knownKeys;
};

}  // namespace Agent
