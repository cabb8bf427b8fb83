#include "configuration/Document.h"

#include "agent/TemporaryDirectory.h"

#include <gmock/gmock.h>

using Agent::Document;
using Agent::Problems;
using agent_test::TemporaryDirectory;
using testing::HasSubstr;
using testing::StartsWith;

namespace {

std::optional<std::string> nameIn(const Document& document) {
    Problems problems;
    return document.root(problems).text("name");
}

}  // namespace

TEST(Document, IsReadFromAFile) {
    const TemporaryDirectory directory;
    const Document document = Document::read(directory.write("agent.toml", "name = 'x'\n"));
    EXPECT_EQ(document.problem(), "");
    EXPECT_EQ(nameIn(document), "x");
}

TEST(Document, IsEmptyAndNoProblemWhenTheFileIsAbsent) {
    const TemporaryDirectory directory;
    const Document document = Document::read(directory.file("agent.toml"));
    EXPECT_EQ(document.problem(), "");
    EXPECT_EQ(nameIn(document), std::nullopt);
}

TEST(Document, IsEmptyWithAProblemWhenTheFileCannotBeRead) {
    const TemporaryDirectory directory;
    const Document document = Document::read(directory.path());
    EXPECT_EQ(document.problem(), directory.path() + " cannot be read (Is a directory); using the defaults");
    EXPECT_EQ(nameIn(document), std::nullopt);
}

TEST(Document, IsEmptyWithAProblemThatNamesTheLineWhenItIsNoToml) {
    const Document document = Document::parse("name = 'x'\n= nonsense\n", "agent.toml");
    EXPECT_THAT(document.problem(), StartsWith("agent.toml is not valid TOML (line 2: "));
    EXPECT_THAT(document.problem(), HasSubstr("using the defaults"));
    EXPECT_EQ(nameIn(document), std::nullopt);
}

TEST(Document, MayBeMoved) {
    Document document = Document::parse("name = 'x'", "");
    const Document moved = std::move(document);
    EXPECT_EQ(nameIn(moved), "x");
}
