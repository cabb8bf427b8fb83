#pragma once

/** The numbers by which the instrumentation tree names its node types and node properties. */
namespace KO::NodeLexicon {

/** What a node of the instrumentation tree stands for. Any 16-bit number may occur in a tree. */
enum NodeType : unsigned int {
    NT_SYSTEM = 1,     ///< the managed system as a whole, the root of the tree
    NT_COMPUTER = 40,  ///< a computer
};

/** A numbered property of a node; all values are text. Any 16-bit number may occur in a tree. */
enum Properties : unsigned int {
    PROPERTY_VENDOR = 36,        ///< who made it
    PROPERTY_PRODUCT_NAME = 39,  ///< product name, in the form "model - suffix"
    PROPERTY_NAME = 108,         ///< the node's name; of a computer, its host name
};

}  // namespace KO::NodeLexicon
