#pragma once

#include "Export.h"
#include "KO/NodeLexicon.h"

#include <memory>
#include <string>

namespace KO {

/**
 * A cursor over the agent's instrumentation tree: the nodes that stand for the managed system and
 * its parts.
 *
 * A new cursor stands on no node. Each selection replaces the one before it. The tree does not change
 * under a cursor. A cursor belongs to one thread.
 */
class KO_EXPORT Instrumentation {
public:
    /** A cursor standing on no node. May throw InstrumentationException when there is no tree. */
    Instrumentation();
    ~Instrumentation();
    Instrumentation(const Instrumentation&) = delete;
    Instrumentation& operator=(const Instrumentation&) = delete;

    /** Selects all nodes of a type, in tree order, and stands on the first (none: on no node). */
    void selectNode(NodeLexicon::NodeType type);

    /** Selects the one node at a path, as getPathToNode gives it (none there: stands on no node). */
    void selectNode(const std::string& path);

    /** Whether the cursor stands on a node. */
    operator bool();

    /** Moves to the next selected node; past the last, stands on none. There it stays. */
    void operator++();

    /**
     * Reads a property of the current node.
     * @param value receives the text; untouched when the answer is false
     * @return false when the node has no such property or the cursor stands on no node
     */
    bool getProperty(NodeLexicon::Properties property, std::string& value);

    /** The current node's path, opaque to callers; empty when the cursor stands on no node. */
    std::string getPathToNode();

    /** The path of the managed computer: of the first computer node, empty if there is none. */
    std::string getPathToComputer();

    /**
     * The printable text form of a path. It has no white space and no underscore, so that record
     * files keep it unchanged. The empty path gives the empty text.
     */
    std::string convertPathToString(const std::string& path);

    /** The inverse of convertPathToString. A text that is no text form of a path is given back. */
    std::string convertStringToPath(const std::string& text);

private:
    struct Implementation;
    std::unique_ptr<Implementation> implementation;
};

}  // namespace KO
