#pragma once

#include <cstddef>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace cimhost::cimxml {

/** An XML element with its attributes, its child elements and its character data, without the markup between them. */
struct XmlElement {
    std::string name{};
    std::vector<std::pair<std::string, std::string>> attributes{};
    std::vector<XmlElement> children{};
    std::string characters{};

    /** The value of an attribute; null if there is none. */
    const std::string* attribute(std::string_view attributeName) const;

    /** The first child element of that name; null if there is none. */
    const XmlElement* child(std::string_view childName) const;
};

struct XmlLimits {
    std::size_t depth = 64;         ///< elements within elements
    std::size_t elements = 50'000;  ///< elements of a document
};

/** A document that is not well-formed, has a document type declaration, many attributes or more than a limit permits.
 */
class XmlError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/**
 * Parses an XML document in UTF-8; the encoding that it declares is ignored. Only the five predefined entities and
 * character references are expanded; nothing outside of the document is read.
 * @return the root element
 * @throws XmlError with the reason and the line
 */
XmlElement parseXml(std::string_view document, const XmlLimits& limits = {});

}  // namespace cimhost::cimxml
