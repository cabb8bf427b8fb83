#include <gmock/gmock.h>

#include "configuration/Document.h"
#include "support/TemporaryDirectory.h"

using Agent::Document;
using Agent::Problems;
using testing::HasSubstr;
using testing::StartsWith;
using testsupport::TemporaryDirectory;

namespace {

std::optional<std::string> nameIn(const Document& document) {
    Problems problems;
    return document.root(problems).string("name");
}

}  // namespace

TEST(Document, IsReadFromAFile) {
    const TemporaryDirectory directory;
    const Document document = Document::read(directory.write("agent.toml", "name = 'x'\n"));
    EXPECT_EQ(document.problem(), "");
    EXPECT_EQ(nameIn(document), "x");
}

TEST(Document, IsEmptyWithoutAProblemIfTheFileIsAbsent) {
    const TemporaryDirectory directory;
    const Document document = Document::read(directory.file("agent.toml"));
    EXPECT_EQ(document.problem(), "");
    EXPECT_EQ(nameIn(document), std::nullopt);
}

TEST(Document, IsEmptyWithAProblemIfTheFileCannotBeRead) {
    const TemporaryDirectory directory;
    const Document document = Document::read(directory.withSlash());
    EXPECT_EQ(document.problem(), directory.withSlash() + " cannot be read (Is a directory); using the defaults");
    EXPECT_EQ(nameIn(document), std::nullopt);
}

TEST(Document, ReportsTheLineOfInvalidToml) {
    const Document document = Document::parse("name = 'x'\n= nonsense\n", "agent.toml");
    EXPECT_THAT(document.problem(), StartsWith("agent.toml is not valid TOML (line 2: "));
    EXPECT_THAT(document.problem(), HasSubstr("using the defaults"));
    EXPECT_EQ(nameIn(document), std::nullopt);
}

TEST(Document, RejectsNonAsciiOutsideOfStringsAndComments) {
    for (const char* text : {"n\xC3\xA4me = 1\n", "name = 1 \xD2\x97\n", "\xE2\x80\x80name = 1\n", "name = \xFF\n",
                             "name = 'x' \xC2\xA0# y\n", "name = \"\"\"x\"\"\"\xC3\xA4\n", "name = '''x'''\xC3\xA4\n",
                             "name = 2\"\xC3\xA4\"", "name = 2 '\xC3\xA4'\n"}) {
        const Document document = Document::parse(text, "agent.toml");
        EXPECT_THAT(document.problem(), StartsWith("agent.toml is not valid TOML (line 1: ")) << text;
        EXPECT_EQ(nameIn(document), std::nullopt) << text;
    }
}

TEST(Document, AcceptsAnyCharacterInStringsAndComments) {
    for (const char* text :
         {"name = \"\xC3\xA4\"", "name = '\xC3\xA4'", "name = \"\"\"\n\xC3\xA4\"\"\"", "name = '''\n\xC3\xA4'''",
          "# \xD2\x97 \"\n\"n\\u0061me\" = \"\xC3\xA4\" # '\xC3\xA4", "\xEF\xBB\xBFname = \"\\u00e4\"",
          "name = \"\"\"\\\n  \\u00e4\"\"\"", "other = ''\nquotes = \"\"\"\"\"\"\"\"\nname = '\xC3\xA4'"}) {
        const Document document = Document::parse(text, "");
        EXPECT_EQ(document.problem(), "") << text;
        EXPECT_EQ(nameIn(document), "\xC3\xA4") << text;
    }
}

TEST(Document, ContinuesALineWithAnyCharacter) {
    const Document document = Document::parse("name = \"\"\"\\\n\n  \xC2\xA7\"\"\"\n", "agent.toml");
    EXPECT_EQ(document.problem(), "");
    EXPECT_EQ(nameIn(document), "\xC2\xA7");
}

TEST(Document, RejectsUnknownEscapesAndValuesThatDoNotEnd) {
    for (const char* text : {"name = \"\\\xC2\xA7\"\n", "name = \"\"\"\\\xC2\xA7\"\"\"\n", "name = \"x\\\xFF",
                             "name =0=[l0=\"\"\"\xC2\xA7\"\"[", "name = 1\"\xC2\xA7\"", "name = [0='\xC2\xA7']",
                             "name = {b = x[\"\xC2\xA7\"]}"}) {
        const Document document = Document::parse(text, "agent.toml");
        EXPECT_THAT(document.problem(), StartsWith("agent.toml is not valid TOML (line 1: ")) << text;
        EXPECT_EQ(nameIn(document), std::nullopt) << text;
    }
}

TEST(Document, AcceptsAllKindsOfValuesAndKeys) {
    const char* text =
        "name = 'x'\n[table.\"quoted\"]\n[[\"tables\".x]]\n'key' = 1\n[more]\n"
        "array = [ 1,2 ,[ 'a',\"b\" ], {c = 'd',e='f'},\n 3 # '=[\n, 'g' ]\n"
        "inline = {a = 1, b.\"c\" = true,d='e'}\ndate = 1979-05-27 07:32:00 # \"\nfloat=-1e5\r\nlast='\xC2\xA7'";
    const Document document = Document::parse(text, "agent.toml");
    EXPECT_EQ(document.problem(), "");
    EXPECT_EQ(nameIn(document), "x");
}

TEST(Document, AcceptsAnyCharacterAfterABackslashInLiteralStrings) {
    const Document document = Document::parse("name = '\\\xC3\xA4' # \\\xC3\xA4", "");
    EXPECT_EQ(document.problem(), "");
    EXPECT_EQ(nameIn(document), "\\\xC3\xA4");
}

TEST(Document, RejectsInvalidUtf8) {
    EXPECT_EQ(Document::parse("name = 'x'\n'y\xFF'.z = 1", "agent.toml").problem(),
              "agent.toml is not valid TOML (line 2: a character is not UTF-8); using the defaults");
}

TEST(Document, ReportsTheReasonOfTheParserInOneLine) {
    EXPECT_EQ(Document::parse("name = 'x'\nother = 'y'\n= 1", "agent.toml").problem(),
              "agent.toml is not valid TOML (line 3: empty key is not allowed); using the defaults");
}

TEST(Document, RejectsAFileThatIsLargerThanItsLimit) {
    const std::string largest = "name = 'x'\n" + std::string(131072 - 11, '#');
    EXPECT_EQ(nameIn(Document::parse(largest, "agent.toml")), "x");
    const Document document = Document::parse(largest + "#", "agent.toml");
    EXPECT_EQ(document.problem(), "agent.toml is larger than 131072 bytes; using the defaults");
    EXPECT_EQ(nameIn(document), std::nullopt);
}

TEST(Document, MayBeMoved) {
    Document document = Document::parse("name = 'x'", "");
    const Document moved = std::move(document);
    EXPECT_EQ(nameIn(moved), "x");
}
