#include <gmock/gmock.h>

#include <sstream>

#include "host/schema/Schemas.h"
#include "schema/Registration.h"
#include "support/TemporaryDirectory.h"

namespace cimhost::test {
namespace {

using testing::ElementsAre;
using testing::EndsWith;
using testing::HasSubstr;
using testing::StartsWith;

std::vector<ProviderRegistration> read(const std::string& text) {
    std::istringstream stream(text);
    return readRegistrations(stream, "test.reg");
}

std::string messageOf(const std::string& text) {
    try {
        read(text);
        return "";
    } catch (const LoadError& error) {
        return error.what();
    }
}

TEST(Registration, ReadsAStanza) {
    const auto stanzas = read(
        "[A_Class]\n"
        "   provider: TheProvider\n"
        "   location: TheLibrary\n"
        "   type: instance association\n"
        "   namespace: root/cimv2 root/other\n"
        "   namespace: root/third\n"
        "   group: together\n"
        "   unload: never\n"
        "#\n");
    ASSERT_EQ(stanzas.size(), 1U);
    const ProviderRegistration& stanza = stanzas[0];
    EXPECT_EQ(stanza.className, "A_Class");
    EXPECT_EQ(stanza.provider, "TheProvider");
    EXPECT_EQ(stanza.location, "TheLibrary");
    EXPECT_TRUE(stanza.instance);
    EXPECT_TRUE(stanza.association);
    EXPECT_THAT(stanza.nameSpaces, ElementsAre("root/cimv2", "root/other", "root/third"));
    EXPECT_EQ(stanza.group, "together");
    EXPECT_EQ(stanza.unload, "never");
    EXPECT_EQ(stanza.source, "test.reg:1");
}

TEST(Registration, ReadsManyStanzasWithCommentsBlanksAndCarriageReturns) {
    const auto stanzas = read(
        "# a comment\r\n\r\n"
        "[ One ]\r\n\tprovider : P1\r\n\tlocation:L1\r\n# in between\r\n\ttype: instance method\r\n"
        "\tnamespace:\troot/cimv2\r\n"
        "[Two]\r\nPROVIDER: P2\r\nLocation: L2\r\nType: Association\r\nNamespace: root/cimv2");
    ASSERT_EQ(stanzas.size(), 2U);
    EXPECT_EQ(stanzas[0].className, "One");
    EXPECT_EQ(stanzas[0].provider, "P1");
    EXPECT_TRUE(stanzas[0].instance);
    EXPECT_FALSE(stanzas[0].association);
    EXPECT_EQ(stanzas[1].location, "L2");
    EXPECT_FALSE(stanzas[1].instance);
    EXPECT_TRUE(stanzas[1].association);
    EXPECT_EQ(stanzas[1].group, "");
    EXPECT_EQ(stanzas[1].source, "test.reg:9");
}

TEST(Registration, IgnoresUnknownKeywords) {
    const auto stanzas = read(
        "[One]\nprovider: P\nlocation: L\ntype: instance indication\nnamespace: n\nuser: root\nparameters: a b: c\n");
    ASSERT_EQ(stanzas.size(), 1U);
    EXPECT_EQ(stanzas[0].provider, "P");
}

TEST(Registration, AnEmptyFileRegistersNothing) {
    EXPECT_TRUE(read("").empty());
    EXPECT_TRUE(read("#\n#\n\n").empty());
}

TEST(RegistrationError, NamesFileAndLine) {
    EXPECT_THAT(messageOf("#\nprovider: P\n"), StartsWith("test.reg:2: expected [CLASS] before"));
    EXPECT_THAT(messageOf("[One]\nprovider P\n"), StartsWith("test.reg:2: expected [CLASS], \"keyword: value\""));
    EXPECT_THAT(messageOf("[One\n"), StartsWith("test.reg:1: expected ]"));
    EXPECT_THAT(messageOf("[]\n"), StartsWith("test.reg:1: expected a class name"));
    EXPECT_THAT(messageOf("[a b]\n"), StartsWith("test.reg:1: expected a class name"));
    EXPECT_THAT(messageOf("[One]\nprovider:\n"), StartsWith("test.reg:2: expected one word after \"provider:\""));
    EXPECT_THAT(messageOf("[One]\nlocation: a b\n"), StartsWith("test.reg:2: expected one word"));
}

TEST(RegistrationError, AStanzaMustNameProviderLibraryAndNamespace) {
    EXPECT_THAT(messageOf("[One]\nlocation: L\nnamespace: n\n"),
                StartsWith("test.reg:1: the section [One] has no line"));
    EXPECT_THAT(messageOf("[One]\nlocation: L\nnamespace: n\n"), HasSubstr("provider: NAME"));
    EXPECT_THAT(messageOf("[One]\nprovider: P\nnamespace: n\n[Two]"), HasSubstr("location: LIBRARY"));
    EXPECT_THAT(messageOf("[One]\nprovider: P\nlocation: L\n"), HasSubstr("namespace: root/cimv2"));
}

TEST(RegistrationFile, IsReadWithThePositionOfEachSection) {
    const testsupport::TemporaryDirectory directory;
    const auto file = directory.write("one.reg", "#\n[One]\nprovider: P\nlocation: L\nnamespace: n\n");
    const auto stanzas = readRegistrationFile(file);
    ASSERT_EQ(stanzas.size(), 1U);
    EXPECT_EQ(stanzas[0].source, file + ":2");
}

TEST(RegistrationFile, ThatIsMissingOrADirectoryIsAnError) {
    const testsupport::TemporaryDirectory directory;
    try {
        readRegistrationFile(directory.path() / "none.reg");
        FAIL() << "there is no such file";
    } catch (const LoadError& error) {
        EXPECT_THAT(error.what(), EndsWith("none.reg: this file does not exist"));
    }
    EXPECT_THROW(readRegistrationFile(directory.path()), LoadError);
}

}  // namespace
}  // namespace cimhost::test
