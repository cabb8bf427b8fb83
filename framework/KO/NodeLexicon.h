#pragma once

/** Numbers of node types and node properties in the instrumentation tree. */
namespace KO::NodeLexicon {

/** Type of a node of the instrumentation tree. A tree may contain any 16-bit number. */
enum NodeType : unsigned int {
    NT_SYSTEM = 1,     ///< the managed system, the root of the tree
    NT_COMPUTER = 40,  ///< a computer
};

/** Property of a node; all values are strings. A tree may contain any 16-bit number. */
enum Properties : unsigned int {
    PROPERTY_VENDOR = 36,        ///< manufacturer
    PROPERTY_PRODUCT_NAME = 39,  ///< product name, in the form "model - suffix"
    PROPERTY_NAME = 108,         ///< name of the node; of a computer, its host name
};

}  // namespace KO::NodeLexicon
