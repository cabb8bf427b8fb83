#pragma once

#include <cstddef>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace cimhost::cimxml {

/** An XML element with its attributes, its child elements and its character data. */
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
    std::size_t depth = 64;         ///< of nested elements
    std::size_t elements = 50'000;  ///< in a document
};

/** Reports a document that is not well-formed, has a document type declaration, or exceeds a limit. */
class XmlError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/**
 * Parses an XML document in UTF-8. Ignores the encoding that the document declares. Expands only the five predefined
 * entities and character references, and reads nothing outside of the document.
 * @return the root element
 * @throws XmlError with the reason and the line
 */
XmlElement parseXml(std::string_view document, const XmlLimits& limits = {});

}  // namespace cimhost::cimxml
