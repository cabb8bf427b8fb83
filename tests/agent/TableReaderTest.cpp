#include <gmock/gmock.h>

#include "configuration/Document.h"
#include "configuration/TableReader.h"

using Agent::Document;
using Agent::Problems;
using Agent::TableReader;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;

namespace {

class TableReaderTest : public testing::Test {
protected:
    TableReader read(const char* text) {
        document.emplace(Document::parse(text, "test"));
        EXPECT_EQ(document->problem(), "");
        return document->root(problems);
    }

    std::optional<Document> document;
    Problems problems;
};

TEST_F(TableReaderTest, ReturnsValuesOfTheRightKind) {
    TableReader table = read("text = 'x'\nflag = true\nnumber = 7\n");
    EXPECT_EQ(table.string("text"), "x");
    EXPECT_EQ(table.flag("flag"), true);
    EXPECT_EQ(table.number("number", 0, 10), 7);
    EXPECT_THAT(problems, IsEmpty());
}

TEST_F(TableReaderTest, ReturnsNoValueForAnAbsentKey) {
    TableReader table = read("");
    EXPECT_EQ(table.string("text"), std::nullopt);
    EXPECT_EQ(table.nonEmptyString("text"), std::nullopt);
    EXPECT_EQ(table.flag("flag"), std::nullopt);
    EXPECT_EQ(table.number("number", 0, 10), std::nullopt);
    EXPECT_THAT(table.tables("tables"), IsEmpty());
    EXPECT_EQ(table.table("table").string("text"), std::nullopt);
    EXPECT_THAT(problems, IsEmpty());
}

TEST_F(TableReaderTest, ReportsValuesOfTheWrongKind) {
    TableReader table = read("text = 1\nempty = ''\nflag = 'yes'\nnumber = 11\nword = 'x'\ntable = 1\ntables = [1]\n");
    EXPECT_EQ(table.string("text"), std::nullopt);
    EXPECT_EQ(table.nonEmptyString("empty"), std::nullopt);
    EXPECT_EQ(table.flag("flag"), std::nullopt);
    EXPECT_EQ(table.number("number", 0, 10), std::nullopt);
    EXPECT_EQ(table.number("word", 0, 10), std::nullopt);
    EXPECT_EQ(table.table("table").string("x"), std::nullopt);
    EXPECT_THAT(table.tables("tables"), IsEmpty());
    EXPECT_THAT(problems, ElementsAre("configuration key text must be a string; ignored",
                                      "configuration key empty must not be empty; ignored",
                                      "configuration key flag must be true or false; ignored",
                                      "configuration key number must be an integer from 0 to 10; ignored",
                                      "configuration key word must be an integer from 0 to 10; ignored",
                                      "configuration key table must be a table; ignored",
                                      "configuration key tables must be an array of tables; ignored"));
}

TEST_F(TableReaderTest, NamesKeysOfInnerTablesInFull) {
    TableReader root = read("[outer]\ninner.key = 1\n[[outer.list]]\n[[outer.list]]\nkey = 2\n");
    TableReader outer = root.table("outer");
    outer.table("inner").string("key");
    for (TableReader& each : outer.tables("list")) {
        each.string("key");
    }
    EXPECT_THAT(problems, ElementsAre("configuration key outer.inner.key must be a string; ignored",
                                      "configuration key outer.list[1].key must be a string; ignored"));
}

TEST_F(TableReaderTest, ReportsUnknownKeys) {
    TableReader table = read("known = 'x'\nunknown = 'y'\n[section]\n");
    table.string("known");
    table.rejectUnknownKeys();
    EXPECT_THAT(problems, ElementsAre("configuration key section is unknown; ignored",
                                      "configuration key unknown is unknown; ignored"));
}

TEST_F(TableReaderTest, ReturnsAllStringsAndReportsOtherValues) {
    TableReader table = read("b = 'second'\na = ''\nc = 3\n");
    EXPECT_THAT(table.allStrings(), ElementsAre(Pair("a", ""), Pair("b", "second")));
    EXPECT_THAT(problems, ElementsAre("configuration key c must be a string; ignored"));
}

TEST_F(TableReaderTest, TreatsAnEmptyArrayAsNoTables) {
    TableReader table = read("tables = []\n");
    EXPECT_THAT(table.tables("tables"), IsEmpty());
    EXPECT_THAT(problems, IsEmpty());
}

}  // namespace
