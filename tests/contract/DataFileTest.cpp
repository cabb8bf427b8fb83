#include <algorithm>
#include <filesystem>
#include <utility>

#include "RecordFixture.h"
#include "support/Umask.h"

// Content of the record files, byte for byte, and the records that are read from it after a restart.

namespace contract {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;
using testsupport::named;
using testsupport::text;
using testsupport::uint32;

constexpr const char* noDate = "00000000000000.000000-000";

class DataFileTest : public RecordTest {
protected:
    /** Returns a file with one record: its identifier, these two lines, and default values in the other lines. */
    std::string oneRecord(const std::string& textLine, const std::string& dateLine,
                          const std::string& identifier = "A") {
        const std::string defaults = kind().defaultFields;
        return "1\n" + identifier + "\n" + textLine + "\n" + dateLine + "\n" +
               defaults.substr(std::string("*\n").size() + std::string(noDate).size() + 1);
    }

    /** Sets the string property of record "A". Returns its value after a restart. */
    std::string afterRestart(const std::string& sent) {
        modify("A", {named(kind().textProperty, text(sent))});
        unload();
        const auto instances = get("A").instances();
        EXPECT_THAT(instances, SizeIs(1));
        return testsupport::stringOf(instances.at(0).properties, kind().textProperty).value_or("(none)");
    }
};

TEST_P(DataFileTest, BlanksAreWrittenAsUnderscoresAndReadBackAsBlanks) {
    createAll({"A"});
    EXPECT_EQ(afterRestart("ACME Leasing Co"), "ACME Leasing Co");
    EXPECT_EQ(data(), oneRecord("ACME_Leasing_Co", noDate));
    EXPECT_EQ(afterRestart("with_underscore"), "with underscore");
    EXPECT_EQ(data(), oneRecord("with_underscore", noDate));
}

TEST_P(DataFileTest, StringsOfOneCharacterAreLostAtARestart) {
    createAll({"A"});
    for (const char* lost : {"X", "*", " ", "_", ""}) {
        EXPECT_EQ(afterRestart(lost), "") << lost;
        EXPECT_EQ(data(), oneRecord("*", noDate)) << lost;
    }
    EXPECT_EQ(afterRestart("XY"), "XY");
    EXPECT_EQ(afterRestart("**"), "**");
}

TEST_P(DataFileTest, IdentifiersWithBlanksAndUnderscoresAreReadBackWithBlanks) {
    createAll({"record 1"});
    EXPECT_EQ(data(), dataOfNew({"record_1"}));
    createAll({"record_1"});
    EXPECT_EQ(data(), dataOfNew({"record_1", "record_1"}));
    unload();
    EXPECT_THAT(identifiers(), ElementsAre("record 1", "record 1"));
    EXPECT_THAT(recordOf("record_1"), IsEmpty());
}

TEST_P(DataFileTest, DatesShorterThanADatetimeAreWrittenAsTheDefaultDate) {
    createAll({"A"});
    for (const char* brief : {"", "x", "20240506070809.123456+12"}) {
        modify("A", {named(kind().dateProperty, text("20240506070809.123456+120"))});
        modify("A", {named(kind().dateProperty, text(brief))});
        EXPECT_EQ(data(), oneRecord("*", noDate)) << brief;
    }
}

TEST_P(DataFileTest, DatesOfAtLeastADatetimesLengthAreWrittenUnchanged) {
    createAll({"A"});
    for (const char* date :
         {"20240506070809.123456+120", "20240506070809.123456+1200", "no date but long enough here"}) {
        modify("A", {named(kind().dateProperty, text(date))});
        EXPECT_EQ(data(), oneRecord("*", date));
    }
}

TEST_P(DataFileTest, ARecordHasAFixedNumberOfLines) {
    createAll({"A", "B", "C"});
    modify("B", {named(kind().textProperty, text("a b c")), named(kind().numberProperty, uint32(4294967295U))});
    const std::string content = *data();
    EXPECT_EQ(static_cast<std::size_t>(std::count(content.begin(), content.end(), '\n')), 1 + 3 * kind().linesOfRecord);
    EXPECT_EQ(content.find('\r'), std::string::npos);
    EXPECT_EQ(content.back(), '\n');
}

TEST_P(DataFileTest, ARestartKeepsTheOrderOfTheRecordsAndOmitsDeletedRecords) {
    createAll({"C", "A", "B", "D"});
    remove("A");
    createAll({"A"});
    remove("C");
    EXPECT_EQ(data(), dataOfNew({"B", "D", "A"}));
    unload();
    EXPECT_THAT(identifiers(), ElementsAre("B", "D", "A"));
    EXPECT_EQ(data(), dataOfNew({"B", "D", "A"}));
}

TEST_P(DataFileTest, ManyRecordsSurviveARestart) {
    std::vector<std::string> many;
    for (int number = 0; number < 40; ++number) {
        many.push_back("record" + std::to_string(number));
    }
    createAll(many);
    EXPECT_EQ(data(), dataOfNew(many));
    unload();
    EXPECT_EQ(identifiers(), many);
}

TEST_P(DataFileTest, AnEmptyIdentifierShiftsTheFieldsOfItsRecord) {
    createAll({""});
    modify("", {named(kind().textProperty, text("the text"))});
    EXPECT_EQ(data(), oneRecord("the_text", noDate, ""));
    unload();
    EXPECT_THAT(identifiers(), ElementsAre("the text"));
}

TEST_P(DataFileTest, AFileWithFewerRecordsThanItsCountRepeatsTheLastRecord) {
    writeData(kind().dataFile, "3\n" + dataOfNew({"A"}).substr(2));
    EXPECT_THAT(identifiers(), ElementsAre("A", "A", "A"));
    EXPECT_THAT(loggedFailures(), IsEmpty());
    createAll({"B"});
    EXPECT_EQ(data(), dataOfNew({"A", "A", "A", "B"}));
}

TEST_P(DataFileTest, RecordsBeyondTheCountAreIgnoredAndRemovedByTheNextChange) {
    writeData(kind().dataFile, "1\n" + dataOfNew({"A", "B"}).substr(2));
    EXPECT_THAT(identifiers(), ElementsAre("A"));
    remove("A");
    EXPECT_EQ(data(), "0\n");
}

TEST_P(DataFileTest, AnInvalidCountMeansNoRecords) {
    for (const char* count : {"", "\n", "0\n", "0", "none\n", "-1\n", "99999999999999999999\n", ".5\n", "\xff\n"}) {
        writeData(kind().dataFile, count + dataOfNew({"A"}).substr(2));
        EXPECT_THAT(identifiers(), IsEmpty()) << count;
        EXPECT_THAT(provider().deleteInstance(path("A")), isOk(0));
        createAll({"N"});
        EXPECT_EQ(data(), dataOfNew({"N"})) << count;
        unload();
    }
}

TEST_P(DataFileTest, ACountThatExceedsMemoryMeansNoRecords) {
    writeData(kind().dataFile, "4294967295\n");
    EXPECT_THAT(identifiers(), IsEmpty());
    createAll({"N"});
    EXPECT_EQ(data(), dataOfNew({"N"}));
}

TEST_P(DataFileTest, CarriageReturnsAreIgnored) {
    std::string content;
    for (const char character : dataOfNew({"A", "B"})) {
        content += character == '\n' ? "\r\n" : std::string(1, character);
    }
    writeData(kind().dataFile, "  " + content);
    EXPECT_THAT(identifiers(), ElementsAre("A", "B"));
    EXPECT_EQ(recordOf("B"), kind().shownRecord("B"));
}

TEST_P(DataFileTest, AnInvalidNumberEndsReadingAndLaterRecordsAreCopies) {
    testsupport::RecordModel model(kind().fields());
    model.records = {model.newRecord("A"), model.newRecord("B"), model.newRecord("C")};
    const std::string sound = model.written();
    const std::size_t second = sound.find("\nB\n") + 3;
    const std::string number = std::string(noDate) + "\n";
    std::string broken = sound;
    broken.replace(sound.find(number, second) + number.size(), 1, "many");
    writeData(kind().dataFile, broken);
    EXPECT_THAT(identifiers(), ElementsAre("A", "B", "B"));
}

TEST_P(DataFileTest, NumbersWithAPlusSignAreAccepted) {
    const std::string sound = dataOfNew({"A", "B"});
    std::string signedNumbers = "+" + sound;
    const std::string number = std::string(noDate) + "\n";
    signedNumbers.insert(signedNumbers.find(number) + number.size(), "+");
    writeData(kind().dataFile, signedNumbers);
    EXPECT_THAT(identifiers(), ElementsAre("A", "B"));
    createAll({"N"});
    EXPECT_EQ(data(), dataOfNew({"A", "B", "N"}));
}

TEST_P(DataFileTest, ANewFileHasTheModeThatTheUmaskPermitsAndARewriteKeepsTheMode) {
    const std::filesystem::path file = dataFile(kind().dataFile);
    const auto modeOf = [&] { return static_cast<unsigned int>(std::filesystem::status(file).permissions()); };
    for (const auto& [mask, mode] : {std::pair(mode_t{0}, 0666U), std::pair(mode_t{027}, 0640U)}) {
        const testsupport::Umask umask(mask);
        std::filesystem::remove(file);
        createAll({"made with mask " + std::to_string(mask)});
        EXPECT_EQ(modeOf(), mode);
    }
    std::filesystem::permissions(file, std::filesystem::perms::owner_read | std::filesystem::perms::owner_write);
    createAll({"another"});
    EXPECT_EQ(modeOf(), 0600U);
}

INSTANTIATE_RECORD_TEST(DataFileTest);

TEST_F(ProviderTest, ANonNumericFlagEndsReadingOfLeases) {
    writeData("Lease.dat",
              "2\nA\nThe_Lessor\n00000000000000.000000-000\n12\ntrue\n1\n1\n1\n100\n200\n300\n400\n5\n"
              "B\n*\n00000000000000.000000-000\n0\n0\n0\n0\n0\n*\n*\n*\n*\n0\n");
    const auto instances = provider().enumerateInstances(classPath("VELKO_Lease")).instances();
    const std::vector<std::string> asRead = lease.shownRecord("A", {"Lessor=\"The Lessor\"", "LeaseTerm=12"});
    ASSERT_THAT(instances, SizeIs(2));
    EXPECT_EQ(shown(instances[0].properties), asRead);
    EXPECT_EQ(shown(instances[1].properties), asRead) << "nothing more is read, so the record repeats";
}

}  // namespace
}  // namespace contract
