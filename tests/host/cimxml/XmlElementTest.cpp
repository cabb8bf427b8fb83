#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "cimxml/XmlElement.h"
#include "cimxml/XmlWriter.h"

using namespace cimhost::cimxml;
using testing::HasSubstr;

namespace {

std::string reasonFor(const std::string& document, const XmlLimits& limits = {}) {
    try {
        parseXml(document, limits);
    } catch (const XmlError& error) {
        return error.what();
    }
    return "accepted";
}

TEST(XmlElementTest, ElementsHaveAttributesChildrenAndCharacters) {
    const XmlElement root =
        parseXml("<?xml version=\"1.0\"?><A X=\"1&amp;2\"><B>b</B><C/><B>c&#65;<![CDATA[<d>]]></B></A>");
    EXPECT_EQ(root.name, "A");
    EXPECT_EQ(*root.attribute("X"), "1&2");
    EXPECT_EQ(root.attribute("Y"), nullptr);
    ASSERT_EQ(root.children.size(), 3U);
    EXPECT_EQ(root.child("B")->characters, "b");
    EXPECT_EQ(root.children[2].characters, "cA<d>");
    EXPECT_EQ(root.child("D"), nullptr);
}

TEST(XmlElementTest, DocumentsAreUtf8WhateverTheyDeclare) {
    const std::string latin = "<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?>";
    EXPECT_EQ(parseXml(latin + "<A>\xC3\xA4</A>").characters, "\xC3\xA4");
    EXPECT_THAT(reasonFor(latin + "<A>\xE4</A>"), HasSubstr("not UTF-8"));
    // In UTF-7, this is an element with an attribute.
    EXPECT_NE(reasonFor("<?xml version=\"1.0\" encoding=\"UTF-7\"?><A X+AD0-'1'/>"), "accepted");
}

TEST(XmlElementTest, Utf16IsRefusedAndAByteOrderMarkOfUtf8IsAccepted) {
    using namespace std::string_literals;
    for (const std::string& utf16 : {"\xFF\xFE<\0A\0/\0>\0"s, "<\0?\0x\0m\0l\0"s, "\xFE\xFF\0<\0A\0/\0>"s}) {
        EXPECT_THAT(reasonFor(utf16), HasSubstr("not UTF-8"));
    }
    EXPECT_EQ(parseXml("\xEF\xBB\xBF<A/>").name, "A");
    EXPECT_EQ(parseXml("\xEF\xBB\xBF<A/>").name, "A") << "with the parser of the first document";
}

TEST(XmlElementTest, MalformedDocumentsAreRefusedWithTheLine) {
    EXPECT_THAT(reasonFor("<A>\n<B></A>"), HasSubstr("line 2"));
    for (const char* document : {"", " ", "A", "<A>", "<A/><B/>", "<A X='1' X='2'/>", "<A>\x01</A>", "<A>\xFF</A>",
                                 "<A>&undefined;</A>", "<A>&#0;</A>", "<A/>rest"}) {
        EXPECT_NE(reasonFor(document), "accepted") << document;
    }
}

TEST(XmlElementTest, DocumentTypesAreRefusedBeforeTheirEntitiesAreRead) {
    EXPECT_THAT(reasonFor("<!DOCTYPE A [<!ENTITY a \"aaaa\"><!ENTITY b \"&a;&a;\">]><A>&b;</A>"),
                HasSubstr("document type declaration"));
    EXPECT_THAT(reasonFor("<!DOCTYPE A SYSTEM \"file:///etc/passwd\"><A/>"), HasSubstr("document type declaration"));
}

TEST(XmlElementTest, DepthAndNumberOfElementsAreLimited) {
    const auto nested = [](std::size_t depth) {
        std::string document;
        for (std::size_t i = 0; i < depth; ++i) {
            document += "<A>";
        }
        for (std::size_t i = 0; i < depth; ++i) {
            document += "</A>";
        }
        return document;
    };
    EXPECT_EQ(reasonFor(nested(5), {5, 100}), "accepted");
    EXPECT_THAT(reasonFor(nested(6), {5, 100}), HasSubstr("nested deeper than 5"));
    EXPECT_THAT(reasonFor(nested(100'000)), HasSubstr("nested deeper"));
    EXPECT_EQ(reasonFor("<A><B/><B/></A>", {5, 3}), "accepted");
    EXPECT_THAT(reasonFor("<A><B/><B/><B/></A>", {5, 3}), HasSubstr("more than 3 elements"));
}

TEST(XmlElementTest, LargeDocumentsAreRead) {
    const std::string characters(std::size_t{20} << 20U, 'a');
    EXPECT_EQ(parseXml("<A B='" + characters + "'>" + characters + "</A>").characters.size(), characters.size());
    EXPECT_EQ(reasonFor("<A><!--" + characters + "--><?p " + characters + "?></A>"), "accepted");
}

TEST(XmlWriterTest, EscapesWithNamedEntitiesOnly) {
    std::string xml;
    appendEscaped(xml, "a<b>&\"c'\n\xC3\xA4");
    EXPECT_EQ(xml, "a&lt;b&gt;&amp;&quot;c&apos;\n\xC3\xA4");
}

TEST(XmlElementTest, TheNumberOfAttributesIsLimited) {
    const auto attributes = [](int count) {
        std::string names;
        for (int i = 0; i < count; ++i) {
            names += " a" + std::to_string(i) + "='>='";
        }
        return names;
    };
    EXPECT_EQ(parseXml("<A" + attributes(64) + "><B" + attributes(64) + "/></A>").attributes.size(), 64U);
    for (const char* before : {"", "<!--><![CDATA[-->", "<?p <!-- ?>"}) {
        EXPECT_THROW(parseXml(before + ("<A" + attributes(65) + "/>")), XmlError) << before;
    }
    const std::string quoted = "<a" + attributes(65) + ">";
    EXPECT_EQ(parseXml("<A><![CDATA[" + quoted + "]]><!--" + quoted + "--></A>").characters, quoted);
    // The parser itself would compare 10,000,000,000 pairs.
    EXPECT_THROW(parseXml("<A" + attributes(100'000) + "/>"), XmlError);
}

TEST(XmlWriterTest, RecognizesStringsThatXmlCanRepresent) {
    EXPECT_TRUE(isRepresentable("a\t\r\n\xC3\xA4\xF0\x9F\x98\x80"));
    for (const char* string : {"\x01", "a\x1F", "\xFF", "\xC3", "\xEF\xBF\xBF", "\xED\xA0\x80"}) {
        EXPECT_FALSE(isRepresentable(string)) << string;
    }
}

TEST(XmlWriterTest, WritesEachStringAsWellFormedXml) {
    for (const char* string : {"\x01", "a\x1F", "\xFF", "\xC3", "\xEF\xBF\xBF", "\xED\xA0\x80", "a\x01z]]>&"}) {
        std::string xml = "<A";
        appendAttribute(xml, "B", string);
        xml += ">";
        appendEscaped(xml, string);
        const XmlElement parsed = parseXml(xml + "</A>");
        EXPECT_THAT(parsed.characters, HasSubstr("\xEF\xBF\xBD")) << string;
        EXPECT_EQ(parsed.characters, *parsed.attribute("B")) << string;
    }
}

TEST(XmlWriterTest, LineEndsSurviveInCharacters) {
    std::string xml = "<A>";
    appendEscaped(xml, "a\rb\r\nc\nd\t");
    EXPECT_THAT(xml, HasSubstr("&#13;"));
    EXPECT_EQ(parseXml(xml + "</A>").characters, "a\rb\r\nc\nd\t");
}

TEST(XmlWriterTest, ElementsAreNeverSelfClosed) {
    std::string xml;
    {
        const Element element(xml, "A", [&] { appendAttribute(xml, "X", "<1>"); });
    }
    EXPECT_EQ(xml, "<A X=\"&lt;1&gt;\"></A>");
}

}  // namespace
