#pragma once

#include "configuration/TableReader.h"

#include <memory>
#include <string>
#include <string_view>

namespace Agent {

/**
 * The agent's configuration file, read and parsed. A file that is absent is an empty document; one
 * that cannot be read or parsed is an empty document with a problem.
 */
class Document {
public:
    /** Reads the file at a path. */
    static Document read(const std::string& path);

    /**
     * Reads the file that this process is configured by: the one that OSTREL_CONFIG names, else
     * /etc/ostrel/agent.toml. A process that runs with another's privileges ignores the variable.
     */
    static Document readDefault();

    /** Parses a text; name is what problems call it. */
    static Document parse(std::string_view text, const std::string& name);

    Document(Document&&) noexcept;
    Document& operator=(Document&&) noexcept;
    ~Document();

    /** Why the file could not be used, one sentence; empty when it could. */
    const std::string& problem() const { return whatIsWrong; }

    /** A reader of the whole document. It must not outlive the document or the problems. */
    TableReader root(Problems& problems) const;

private:
    Document();

    struct Content;
    std::unique_ptr<Content> content;
    std::string whatIsWrong;
};

}  // namespace Agent
