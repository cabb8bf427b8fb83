#include "cimxml/XmlElement.h"

#include <libxml/SAX2.h>
#include <libxml/parser.h>

#include <algorithm>
#include <array>
#include <limits>
#include <memory>
#include <optional>

#include "cimxml/XmlWriter.h"

namespace cimhost::cimxml {
namespace {

std::string stringOf(const xmlChar* characters) {
    return reinterpret_cast<const char*>(characters);
}

/** The length of a start or end tag in bytes. @throws XmlError if it has too many attributes */
std::size_t lengthOfTag(std::string_view markup) {
    constexpr std::size_t most = 64;
    std::size_t attributes = 0;
    char quote = '\0';
    for (std::size_t at = 1; at < markup.size(); ++at) {
        const char each = markup[at];
        if (quote != '\0') {
            quote = each == quote ? '\0' : quote;
        } else if (each == '"' || each == '\'') {
            quote = each;
        } else if (each == '>') {
            return at;
        } else if (each == '=' && ++attributes > most) {
            throw XmlError("an element has more than " + std::to_string(most) + " attributes");
        }
    }
    return markup.size();
}

/** Refuses elements with many attributes before they are parsed: libxml2 compares each attribute with all others. */
void requireFewAttributes(std::string_view document) {
    constexpr std::array<std::pair<std::string_view, std::string_view>, 3> others{
        {{"<!--", "-->"}, {"<![CDATA[", "]]>"}, {"<?", "?>"}}};
    for (std::size_t at = document.find('<'); at != std::string_view::npos; at = document.find('<', at)) {
        const std::string_view markup = document.substr(at);
        const auto* const other = std::find_if(others.begin(), others.end(), [&](const auto& each) {
            return markup.substr(0, each.first.size()) == each.first;
        });
        at = other == others.end() ? at + lengthOfTag(markup) : document.find(other->second, at + other->first.size());
    }
}

/** Uses this thread's parser for one document, since creating a parser takes longer than parsing a usual request. */
class BorrowedParser {
public:
    BorrowedParser(xmlSAXHandler events, void* builder) {
        if (ofThread() == nullptr) {
            ofThread().reset(xmlCreatePushParserCtxt(&events, nullptr, nullptr, 0, nullptr));
        }
        // After a reset, a parser reads UTF-8 whatever the first bytes are.
        if (ofThread() == nullptr || xmlCtxtResetPush(get(), nullptr, 0, nullptr, nullptr) != 0) {
            throw std::bad_alloc();
        }
        get()->userData = builder;
    }
    /** Frees the document, and the parser if it has stored many names. */
    ~BorrowedParser() {
        constexpr std::size_t mostBytesOfNames = std::size_t{64} << 10U;
        xmlCtxtReset(get());
        if (xmlDictGetUsage(get()->dict) > mostBytesOfNames) {
            ofThread().reset();
        }
    }
    BorrowedParser(const BorrowedParser&) = delete;
    BorrowedParser& operator=(const BorrowedParser&) = delete;

    xmlParserCtxt* get() const { return ofThread().get(); }

private:
    using Parser = std::unique_ptr<xmlParserCtxt, decltype(&xmlFreeParserCtxt)>;

    static Parser& ofThread() {
        thread_local Parser parser(nullptr, &xmlFreeParserCtxt);
        return parser;
    }
};

/** Builds the tree from the events of libxml2's parser. */
class TreeBuilder {
public:
    explicit TreeBuilder(const XmlLimits& itsLimits) : limits(itsLimits) {}

    XmlElement build(std::string_view document) {
        constexpr std::string_view byteOrderMark = "\xEF\xBB\xBF";
        if (document.substr(0, byteOrderMark.size()) == byteOrderMark) {
            document.remove_prefix(byteOrderMark.size());
        }
        static const bool isInitialized = (xmlInitParser(), true);
        static_cast<void>(isInitialized);
        if (document.size() > static_cast<std::size_t>(std::numeric_limits<int>::max())) {
            throw XmlError("the document is too large");
        }
        if (!isRepresentable(document)) {
            throw XmlError("the document is not UTF-8, or has a character that XML cannot represent");
        }
        requireFewAttributes(document);
        const BorrowedParser borrowed(handler(), this);
        parser = borrowed.get();
        // Without XML_PARSE_NOENT, ampersands in attributes would remain encoded. It is safe, since document type
        // declarations, which could declare entities, are refused.
        // A declared encoding such as UTF-7 could hide attributes from requireFewAttributes().
        // Without XML_PARSE_HUGE, documents of more than 10 MB would be refused, even if the settings permit them.
        xmlCtxtUseOptions(parser, XML_PARSE_NONET | XML_PARSE_NOENT | XML_PARSE_IGNORE_ENC | XML_PARSE_HUGE);
        const int result = xmlParseChunk(parser, document.data(), static_cast<int>(document.size()), 1);
        if (refusal) {
            throw XmlError(*refusal + " (line " + std::to_string(refusedLine) + ")");
        }
        if (result != XML_ERR_OK || !hasRoot) {
            throw XmlError(parserMessage());
        }
        return std::move(root);
    }

private:
    static TreeBuilder& of(void* builder) { return *static_cast<TreeBuilder*>(builder); }

    static xmlSAXHandler handler() {
        xmlSAXHandler events{};
        events.startElement = [](void* self, const xmlChar* name, const xmlChar** attributes) {
            of(self).guarded([&] { of(self).start(name, attributes); });
        };
        events.endElement = [](void* self, const xmlChar*) { of(self).open.pop_back(); };
        events.characters = [](void* self, const xmlChar* characters, int size) {
            of(self).guarded([&] { of(self).append(characters, size); });
        };
        events.ignorableWhitespace = events.characters;
        events.cdataBlock = events.characters;
        events.internalSubset = [](void* self, const xmlChar*, const xmlChar*, const xmlChar*) {
            of(self).refuse("a document type declaration is not permitted");
        };
        events.getEntity = [](void*, const xmlChar* name) { return xmlGetPredefinedEntity(name); };
        return events;
    }

    /** Runs an action; exceptions must not pass through the parser, which is written in C. */
    template <class Action>
    void guarded(Action&& action) {
        try {
            action();
        } catch (const std::exception& error) {
            refuse(error.what());
        }
    }

    void start(const xmlChar* name, const xmlChar** attributes) {
        if (open.size() >= limits.depth) {
            return refuse("elements are nested deeper than " + std::to_string(limits.depth));
        }
        if (++count > limits.elements) {
            return refuse("there are more than " + std::to_string(limits.elements) + " elements");
        }
        XmlElement& element = open.empty() ? root : open.back()->children.emplace_back();
        hasRoot = true;
        element.name = stringOf(name);
        for (const xmlChar** each = attributes; each != nullptr && *each != nullptr; each += 2) {
            element.attributes.emplace_back(stringOf(each[0]), each[1] == nullptr ? "" : stringOf(each[1]));
        }
        open.push_back(&element);
    }

    void append(const xmlChar* characters, int size) {
        if (!open.empty()) {
            open.back()->characters.append(reinterpret_cast<const char*>(characters), static_cast<std::size_t>(size));
        }
    }

    void refuse(const std::string& reason) {
        if (!refusal) {
            refusal = reason;
            refusedLine = xmlSAX2GetLineNumber(parser);
        }
        xmlStopParser(parser);
    }

    std::string parserMessage() const {
        const xmlError* error = xmlCtxtGetLastError(parser);
        if (error == nullptr || error->message == nullptr) {
            return "the document has no element";
        }
        std::string message = error->message;
        message.erase(message.find_last_not_of('\n') + 1);
        return message + " (line " + std::to_string(error->line) + ")";
    }

    const XmlLimits& limits;
    xmlParserCtxt* parser = nullptr;
    XmlElement root;
    bool hasRoot = false;
    std::vector<XmlElement*> open;  ///< the path from the root to the element that is being read
    std::size_t count = 0;
    std::optional<std::string> refusal;
    int refusedLine = 0;
};

}  // namespace

const std::string* XmlElement::attribute(std::string_view attributeName) const {
    const auto found = std::find_if(attributes.begin(), attributes.end(),
                                    [&](const auto& each) { return each.first == attributeName; });
    return found == attributes.end() ? nullptr : &found->second;
}

const XmlElement* XmlElement::child(std::string_view childName) const {
    const auto found =
        std::find_if(children.begin(), children.end(), [&](const auto& each) { return each.name == childName; });
    return found == children.end() ? nullptr : &*found;
}

XmlElement parseXml(std::string_view document, const XmlLimits& limits) {
    return TreeBuilder(limits).build(document);
}

}  // namespace cimhost::cimxml
