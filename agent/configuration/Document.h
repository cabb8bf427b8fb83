#pragma once

#include "configuration/TableReader.h"

#include <memory>
#include <string>
#include <string_view>

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
     * process that runs with another user's privileges ignores the variable.
     */
    static Document readDefault();

    /** Parses a document; problems contain the name. */
    static Document parse(std::string_view text, const std::string& name);

    Document(Document&&) noexcept;
    Document& operator=(Document&&) noexcept;
    ~Document();

    /** One sentence on why the file could not be used; empty if it was used. */
    const std::string& problem() const { return whatIsWrong; }

    /** Returns a reader of the document. It must not outlive the document or the problems. */
    TableReader root(Problems& problems) const;

private:
    Document();

    struct Content;
    std::unique_ptr<Content> content;
    std::string whatIsWrong;
};

}  // namespace Agent
