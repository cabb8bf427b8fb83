#pragma once

/** Numbers of node types and node properties in the instrumentation tree. */
namespace KO::NodeLexicon {

/** Type of a node of the instrumentation tree. A tree can also contain other 16-bit numbers. */
enum NodeType : unsigned int {
    NT_SYSTEM = 1,     ///< the managed system, the root of the tree
    NT_COMPUTER = 40,  ///< a computer
};

/** Property of a node. All values are strings. A tree can also contain other 16-bit numbers. */
enum Properties : unsigned int {
    PROPERTY_VENDOR = 36,        ///< manufacturer
    PROPERTY_PRODUCT_NAME = 39,  ///< product name, in the form "model - suffix"
    PROPERTY_NAME = 108,         ///< name of the node; for a computer, its host name
};

}  // namespace KO::NodeLexicon
