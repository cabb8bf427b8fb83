#pragma once

#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "configuration/TableReader.h"

namespace Agent {

/**
 * The agent's configuration file, parsed. An absent file is an empty document; a file that cannot be read or parsed is
 * an empty document with a problem.
 */
class Document {
public:
    /** Reads the file at a path. */
    static Document read(const std::string& path);

    /**
     * Reads the configuration file of this process: the one that OSTREL_CONFIG names, else /etc/ostrel/agent.toml. A
     * process that has more privileges than its caller ignores the variable.
     */
    static Document readDefault();

    /** Parses a document. Its problem starts with the name. */
    static Document parse(std::string_view text, const std::string& name);

    /** One sentence on why the file could not be used; empty if it was used. */
    const std::string& problem() const { return whatIsWrong; }

    /** Returns a reader of the document. The reader must not outlive the document or the problems. */
    TableReader root(Problems& problems) const { return TableReader(table.get(), "", problems); }

private:
    std::shared_ptr<const TomlTable> table{};  ///< null for an empty document
    std::string whatIsWrong{};
};

/** Maximum depth of nested brackets, and maximum number of dots in a key. */
constexpr int deepestNesting = 16;

/**
 * Returns the number of the first line of a TOML document at which more than 16 brackets are nested or a key has more
 * than 16 dots; none if there is no such line. The TOML parser recurses for each level and could overflow the stack.
 */
std::optional<std::size_t> lineNestedTooDeep(std::string_view document);

}  // namespace Agent
