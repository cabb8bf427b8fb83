#pragma once

#include <map>
#include <string>
#include <vector>

#include "configuration/TableReader.h"

namespace KO {

/** A node of the instrumentation tree. Types and property numbers are those of KO::NodeLexicon. */
struct Node {
    unsigned int type = 0;
    std::string path;
    std::map<unsigned int, std::string> properties;
};

/** The nodes of the managed system, in tree order; no two have the same path. */
class NodeTree {
public:
    /** Adds a node at the end, or replaces the node with the same path. */
    void put(Node node);

    const std::vector<Node>& nodes() const { return allNodes; }

private:
    std::vector<Node> allNodes;
};

/** Returns this computer's host name; "localhost" if the system has none. */
std::string hostName();

/**
 * Returns the nodes of this computer: the system, and the computer below it. Both nodes have the computer's name,
 * vendor and product name.
 * @param dmiRoot directory of the kernel's DMI files, ending with a separator
 * @param name    the computer's name
 * @param problems receives a sentence for each existing file that cannot be read
 */
NodeTree discoverComputer(const std::string& dmiRoot, const std::string& name, Agent::Problems& problems);

/**
 * Encodes a node path: every byte except ASCII letters, digits and . / : - becomes %NN, the byte's value in two
 * upper-case hexadecimal digits.
 */
std::string pathToText(const std::string& path);

/** Decodes a path. If the string is not the encoding of a path, returns it unchanged. */
std::string textToPath(const std::string& text);

}  // namespace KO
