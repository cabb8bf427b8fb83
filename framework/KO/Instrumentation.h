#pragma once

#include <memory>
#include <string>

#include "Export.h"
#include "KO/NodeLexicon.h"

namespace KO {

/**
 * A cursor over the agent's instrumentation tree, whose nodes represent the managed system and its parts.
 *
 * A new cursor has no current node. Each selection replaces the preceding one. The tree does not change while a cursor
 * exists. A cursor belongs to one thread.
 */
class KO_EXPORT Instrumentation {
public:
    /** Creates a cursor without a current node. May throw InstrumentationException if there is no tree. */
    Instrumentation();
    ~Instrumentation();
    Instrumentation(const Instrumentation&) = delete;
    Instrumentation& operator=(const Instrumentation&) = delete;

    /** Selects all nodes of a type in tree order and moves to the first, if any. */
    void selectNode(NodeLexicon::NodeType type);

    /** Selects the node at a path that getPathToNode returned, if it exists. */
    void selectNode(const std::string& path);

    /** Returns whether there is a current node. */
    operator bool();

    /** Moves to the next selected node. After the last one, there is no current node. */
    void operator++();

    /**
     * Reads a property of the current node.
     * @param value receives the value; unchanged if the result is false
     * @return false if the node has no such property or there is no current node
     */
    bool getProperty(NodeLexicon::Properties property, std::string& value);

    /** Returns the current node's path, an opaque string; empty if there is no current node. */
    std::string getPathToNode();

    /** Returns the path of the managed computer, which is the first computer node; empty if there is none. */
    std::string getPathToComputer();

    /**
     * Returns the printable string form of a path. It contains no white space and no underscores, so that record files
     * do not change it. The empty path yields the empty string.
     */
    std::string convertPathToString(const std::string& path);

    /** Inverse of convertPathToString. If a string is not the string form of a path, returns it unchanged. */
    std::string convertStringToPath(const std::string& text);

private:
    struct Implementation;
    std::unique_ptr<Implementation> implementation;
};

}  // namespace KO
