#pragma once

#include <string>
#include <string_view>

namespace cimhost::cimxml {

/**
 * Appends a string as character data or attribute value. Escapes with the five predefined entities, since some clients
 * understand no others, and carriage returns with a character reference. Replaces what XML 1.0 cannot represent by
 * U+FFFD, so that the document is well-formed whatever the string is.
 */
void appendEscaped(std::string& xml, std::string_view characters);

/** Appends NAME="value" with a blank before it. */
void appendAttribute(std::string& xml, std::string_view name, std::string_view value);

/** Whether XML 1.0 can represent a string: valid UTF-8 without control characters except tab and line ends. */
bool isRepresentable(std::string_view characters);

/** Appends a start tag with the attributes that a function appends. */
template <class Attributes>
void appendStartTag(std::string& xml, std::string_view name, Attributes&& attributes) {
    xml += '<';
    xml += name;
    attributes();
    xml += '>';
}

inline void appendEndTag(std::string& xml, std::string_view name) {
    xml += "</";
    xml += name;
    xml += '>';
}

/**
 * An element: writes the start tag, and the end tag when it is destroyed. Elements are never self-closed, since some
 * clients do not understand that.
 */
class Element {
public:
    /** @param itsName a literal: only the reference is kept */
    Element(std::string& itsXml, std::string_view itsName) : Element(itsXml, itsName, [] {}) {}

    /** An element with attributes, which a function appends. */
    template <class Attributes>
    Element(std::string& itsXml, std::string_view itsName, Attributes&& attributes) : xml(itsXml), name(itsName) {
        appendStartTag(xml, name, attributes);
    }
    ~Element() { appendEndTag(xml, name); }
    Element(const Element&) = delete;
    Element& operator=(const Element&) = delete;

private:
    std::string& xml;
    std::string_view name;
};

}  // namespace cimhost::cimxml
