// Writing and reading one record.

#include "RecordKinds.h"

namespace {

using namespace providerTest;

template <class Kind>
class RecordFile : public RecordStore<Kind> {
protected:
    using Unit = typename Kind::Unit;

    static std::string line(const Unit& unit, std::size_t index) {
        return linesOf(RecordStore<Kind>::written(unit)).at(index);
    }
};

TYPED_TEST_SUITE(RecordFile, RecordKinds, KindNames);

TYPED_TEST(RecordFile, ContainsDefaultsForANewRecord) {
    EXPECT_EQ(this->written(typename TypeParam::Unit("A")), std::string("A\n") + TypeParam::defaultRecord);
}

TYPED_TEST(RecordFile, ContainsOneLinePerField) {
    typename TypeParam::Unit unit;
    EXPECT_EQ(linesOf(this->written(unit)).size(), TypeParam::linesOfRecord);
    unit.InstanceID = "with blanks ";
    unit.*TypeParam::date().member = "a date with blanks, not escaped";
    for (const auto& value : TypeParam::values()) {
        unit.*value.member = "some text ";
    }
    EXPECT_EQ(linesOf(this->written(unit)).size(), TypeParam::linesOfRecord);
}

TYPED_TEST(RecordFile, ContainsLineFeedsOfStringsUnescaped) {
    for (const auto& value : TypeParam::values()) {
        typename TypeParam::Unit unit("A");
        unit.*value.member = "two\nlines";
        const auto lines = linesOf(this->written(unit));
        ASSERT_EQ(lines.size(), TypeParam::linesOfRecord + 1);
        EXPECT_EQ(lines[value.line], "two");
        EXPECT_EQ(lines[value.line + 1], "lines");
        EXPECT_EQ(this->reread(unit).*value.member, "two") << "the rest is read as the next field";
    }
    const typename TypeParam::Unit unit("two\nlines");
    EXPECT_EQ(linesOf(this->written(unit)).size(), TypeParam::linesOfRecord + 1);
    EXPECT_EQ(this->reread(unit).InstanceID, "two");
    EXPECT_EQ(this->reread(unit).*TypeParam::textMember, "lines");
}

TYPED_TEST(RecordFile, ContainsBlanksAsUnderscoresAndReadsThemBack) {
    for (const auto& value : TypeParam::values()) {
        typename TypeParam::Unit unit("A");
        unit.*value.member = "ACME Leasing  Co";
        EXPECT_EQ(this->line(unit, value.line), "ACME_Leasing__Co");
        EXPECT_EQ(this->reread(unit).*value.member, "ACME Leasing  Co");
    }
}

TYPED_TEST(RecordFile, ReadsUnderscoresBackAsBlanks) {
    for (const auto& value : TypeParam::values()) {
        typename TypeParam::Unit unit("A");
        unit.*value.member = "ACME_Leasing Co";
        EXPECT_EQ(this->line(unit, value.line), "ACME_Leasing_Co");
        EXPECT_EQ(this->reread(unit).*value.member, "ACME Leasing Co");
    }
}

TYPED_TEST(RecordFile, LosesValuesOfAtMostOneCharacter) {
    for (const auto& value : TypeParam::values()) {
        for (const char* text : {"", "X", "*", " ", "_", "7"}) {
            typename TypeParam::Unit unit("A");
            unit.*value.member = text;
            EXPECT_EQ(this->line(unit, value.line), "*") << text;
            EXPECT_EQ(this->reread(unit).*value.member, "") << text;
        }
    }
}

TYPED_TEST(RecordFile, KeepsValuesOfTwoCharacters) {
    for (const auto& value : TypeParam::values()) {
        for (const char* text : {"XY", "**", "*X", "\xC3\xBC"}) {
            typename TypeParam::Unit unit("A");
            unit.*value.member = text;
            EXPECT_EQ(this->line(unit, value.line), text);
            EXPECT_EQ(this->reread(unit).*value.member, text);
        }
    }
}

TYPED_TEST(RecordFile, ContainsTheBytesOfAnyEncoding) {
    typename TypeParam::Unit unit("M\xFCller");
    unit.*TypeParam::textMember = "M\xC3\xBCller \xFE\x80\x01";
    EXPECT_EQ(this->line(unit, 0), "M\xFCller");
    EXPECT_EQ(this->line(unit, 1), "M\xC3\xBCller_\xFE\x80\x01");
    EXPECT_EQ(this->reread(unit).InstanceID, "M\xFCller");
    EXPECT_EQ(this->reread(unit).*TypeParam::textMember, "M\xC3\xBCller \xFE\x80\x01");
}

TYPED_TEST(RecordFile, ContainsTheDefaultDateForAShortDate) {
    const std::string date24 = "20240101000000.000000+00";
    for (const std::string& text : {std::string(), std::string("2024"), date24}) {
        typename TypeParam::Unit unit("A");
        unit.*TypeParam::date().member = text;
        EXPECT_EQ(this->line(unit, TypeParam::date().line), "00000000000000.000000-000") << text;
        EXPECT_EQ(this->reread(unit).*TypeParam::date().member, "00000000000000.000000-000") << text;
    }
}

TYPED_TEST(RecordFile, KeepsDatesOfAtLeast25Characters) {
    for (const std::string& text : {std::string("20240101000000.000000+000"), std::string("20240101000000.000000+0000"),
                                    std::string("no_date_but_long_enough_to_be_one"), std::string(300, '9')}) {
        typename TypeParam::Unit unit("A");
        unit.*TypeParam::date().member = text;
        EXPECT_EQ(this->line(unit, TypeParam::date().line), text);
        EXPECT_EQ(this->reread(unit).*TypeParam::date().member, text);
    }
}

TYPED_TEST(RecordFile, LeavesTheBlanksOfADateUnescaped) {
    typename TypeParam::Unit unit("A");
    unit.*TypeParam::date().member = "20240101 000000 000000+000";
    EXPECT_EQ(this->line(unit, TypeParam::date().line), "20240101 000000 000000+000");
    EXPECT_EQ(this->reread(unit).*TypeParam::date().member, "20240101");
}

TYPED_TEST(RecordFile, ContainsBlanksOfAnIdentifierAsUnderscoresAndReadsThemBack) {
    const typename TypeParam::Unit withBlank("lease 1");
    EXPECT_EQ(this->line(withBlank, 0), "lease_1");
    EXPECT_EQ(this->reread(withBlank).InstanceID, "lease 1");
    const typename TypeParam::Unit withUnderscore("lease_1");
    EXPECT_EQ(this->line(withUnderscore, 0), "lease_1");
    EXPECT_EQ(this->reread(withUnderscore).InstanceID, "lease 1");
}

TYPED_TEST(RecordFile, KeepsIdentifiersOfOneCharacter) {
    for (const char* text : {"L", "*", "0"}) {
        const typename TypeParam::Unit unit(text);
        EXPECT_EQ(this->line(unit, 0), text);
        EXPECT_EQ(this->reread(unit).InstanceID, text);
    }
}

TYPED_TEST(RecordFile, ContainsAnEmptyIdentifierAsAnEmptyLine) {
    EXPECT_EQ(this->written(typename TypeParam::Unit("")), std::string("\n") + TypeParam::defaultRecord);
}

TYPED_TEST(RecordFile, ShiftsTheFieldsAfterAnEmptyIdentifierOnReading) {
    typename TypeParam::Unit unit("");
    unit.*TypeParam::textMember = "ACME Co";
    unit.*TypeParam::date().member = "20240101000000.000000+000";
    unit.*TypeParam::numberMember = 36;
    const auto read = this->reread(unit);
    EXPECT_EQ(read.InstanceID, "ACME Co");
    EXPECT_EQ(read.*TypeParam::textMember, "20240101000000.000000+000");
    EXPECT_EQ(read.*TypeParam::date().member, "36");
}

TYPED_TEST(RecordFile, ContainsNumbersAsUnsignedDecimalsWithoutPadding) {
    for (const auto& number : TypeParam::numbers()) {
        for (const auto& [value, text] : {std::pair(0U, "0"), std::pair(7U, "7"), std::pair(1234567U, "1234567"),
                                          std::pair(2147483648U, "2147483648"), std::pair(4294967295U, "4294967295")}) {
            typename TypeParam::Unit unit("A");
            unit.*number.member = value;
            EXPECT_EQ(this->line(unit, number.line), text);
            EXPECT_EQ(this->reread(unit).*number.member, value);
        }
    }
}

TYPED_TEST(RecordFile, ReadsEveryRecordAsInUse) {
    typename TypeParam::Unit unit("A");
    EXPECT_TRUE(this->reread(unit).inUse);
}

TYPED_TEST(RecordFile, ReadsARecordFromTheStreamsPosition) {
    const std::string record = std::string("A_1\n") + TypeParam::defaultRecord;
    write(this->path(), "first line\n" + record + "next");
    std::ifstream stream(this->path());
    std::string firstLine;
    std::getline(stream, firstLine);
    typename TypeParam::Unit unit("before");
    EXPECT_EQ(&(stream >> unit), &stream);
    EXPECT_EQ(unit.InstanceID, "A 1");
    std::string next;
    stream >> next;
    EXPECT_EQ(next, "next");
}

TYPED_TEST(RecordFile, KeepsTheValuesOfMissingFieldsWhenReading) {
    for (const char* text : {"before_reading", "*", "_", "plain", ""}) {
        typename TypeParam::Unit before(text);
        before.*TypeParam::date().member = text;
        before.*TypeParam::numberMember = 7;
        for (const auto& value : TypeParam::values()) {
            before.*value.member = text;
        }
        auto expected = before;
        for (const char* content : {"", "B_1\n", "B_1 Bee_Co"}) {
            const std::string file = content;
            write(this->path(), file);
            std::ifstream stream(this->path());
            auto unit = before;
            stream >> unit;
            expected.InstanceID = file.empty() ? text : "B 1";
            expected.*TypeParam::textMember = file.find(' ') == std::string::npos ? text : "Bee Co";
            EXPECT_EQ(TypeParam::members(unit), TypeParam::members(expected)) << text << " before " << content;
        }
    }
}

TYPED_TEST(RecordFile, KeepsTheInUseFlagWhenReading) {
    write(this->path(), std::string("A\n") + TypeParam::defaultRecord);
    std::ifstream stream(this->path());
    typename TypeParam::Unit unit;
    unit.inUse = false;
    stream >> unit;
    EXPECT_EQ(unit.InstanceID, "A");
    EXPECT_FALSE(unit.inUse);
}

TYPED_TEST(RecordFile, FlushesEachLine) {
    std::ofstream stream(this->path());
    EXPECT_EQ(&(stream << typename TypeParam::Unit("A")), &stream);
    EXPECT_EQ(this->file(), std::string("A\n") + TypeParam::defaultRecord);
}

TYPED_TEST(RecordFile, CopiesEveryField) {
    const auto cache = this->load("1\nA\nACME_Co\n20240101000000.000000+000\n36\n1\n0\n1\n1\n100\n90\n80\n70\n5\n");
    auto original = cache->table.at(0);
    original.inUse = false;
    const typename TypeParam::Unit copy(original);
    EXPECT_EQ(TypeParam::members(copy), TypeParam::members(original));
    typename TypeParam::Unit assigned("other");
    assigned = original;
    EXPECT_EQ(TypeParam::members(assigned), TypeParam::members(original));
    const typename TypeParam::Unit fresh;
    EXPECT_NE(TypeParam::members(copy), TypeParam::members(fresh));
}

}  // namespace
