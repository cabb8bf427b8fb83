#pragma once

#include <string>
#include <string_view>

namespace cimhost::cimxml {

/**
 * Appends a string as character data or attribute value. Escapes with the five predefined entities, since some clients
 * understand no others, and carriage returns with a character reference. Replaces characters that XML 1.0 cannot
 * represent with U+FFFD, so that the document is always well-formed.
 */
void appendEscaped(std::string& xml, std::string_view characters);

/** Appends a space and NAME="value". */
void appendAttribute(std::string& xml, std::string_view name, std::string_view value);

/** Whether a string is valid UTF-8 and XML 1.0 can represent all its characters. */
bool isRepresentable(std::string_view characters);

/** Appends a start tag. @param attributes function that appends the attributes */
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
 * Writes the start tag of an element when constructed, and the end tag when destroyed. Writes no self-closing tags,
 * since some clients do not understand them.
 */
class Element {
public:
    /** @param itsName must outlive this object, like a string literal */
    Element(std::string& itsXml, std::string_view itsName) : Element(itsXml, itsName, [] {}) {}

    /** @param attributes function that appends the attributes */
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
