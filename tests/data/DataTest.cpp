#include <unistd.h>

#include <functional>
#include <nlohmann/json.hpp>
#include <regex>

#include "gate/GateFixture.h"
#include "support/Command.h"
#include "support/Files.h"
#include "support/TemporaryDirectory.h"
#include "support/UnderTest.h"

// Tests lease-warranty-data with record files that the gate has written.

namespace gatetest {
namespace {

namespace fs = std::filesystem;
using nlohmann::ordered_json;
using testing::AllOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testsupport::Ended;
using testsupport::readFile;
using testsupport::writeFile;

testing::Matcher<const Ended&> hasEnded(int status, const std::string& words) {
    return AllOf(testing::Field("status", &Ended::status, status),
                 testing::Field("output", &Ended::output, HasSubstr(words)));
}

/** @param before commands of the shell */
Ended run(const std::string& arguments, const std::string& before = "") {
    return testsupport::runCommand(before + "exec " + testsupport::underTest(DATA_PROGRAM) + " " + arguments);
}

class DataTest : public GateTest {
protected:
    DataTest() {
        create("L1", {named("Lessor", text("Änne \"&\" \\ Co")), named("LeaseTerm", uint32(4294967295U)),
                      named("BaseTermCommencementDate", text("20260101000000.000000+060"))});
        create("L 2");
        unload();
        content = readFile(leases());
    }

    static fs::path leases() { return dataFile("Lease.dat"); }

    static void removeCopies() {
        fs::remove(dataFile("Lease.dat.saved1"));
        fs::remove(dataFile("Lease.dat.saved2"));
    }

    Ended import(const std::string& text, const std::string& before = "") {
        writeFile(document, text);
        return run("import '" + document.string() + "'", before);
    }

    /** The leases as a document. */
    static ordered_json exported() {
        const Ended ended = run("export VELKO_Lease");
        EXPECT_EQ(ended.status, 0) << ended.output;
        return ordered_json::parse(ended.output);
    }

    std::string content;  ///< of Lease.dat
    const testsupport::TemporaryDirectory directory;
    const fs::path document = directory.path() / "document.json";
};

// --- export and import ---------------------------------------------------------------------------------------------

TEST_F(DataTest, ImportingAnExportRestoresTheFile) {
    writeFile(leases(), std::regex_replace(content, std::regex("Co\n"), "Co\x01\xC3(_\xFF\n"));
    const std::string changed = readFile(leases());
    const std::string exportedLeases = run("export VELKO_Lease").output;
    EXPECT_THAT(exportedLeases, HasSubstr("\"Lessor\": {\n        \"bytes\": \"c3846e6e65202226222"));
    writeFile(leases(), "0\n");
    EXPECT_THAT(import(exportedLeases), hasEnded(0, "Lease.dat was replaced (records: 2).\n"));
    EXPECT_EQ(readFile(leases()), changed);
    EXPECT_EQ(run("export VELKO_Lease").output, exportedLeases);
}

TEST_F(DataTest, WarrantiesAreExportedAndImported) {
    create("W1", {named("Warrantor", text("ACME")), named("WarrantyDuration", uint32(24))}, warranty);
    unload();
    const std::string warranties = readFile(dataFile("Warranty.dat"));
    const std::string exportedWarranties = run("export VELKO_Warranty").output;
    EXPECT_EQ(ordered_json::parse(exportedWarranties),
              ordered_json::parse(R"({"class": "VELKO_Warranty", "records": [{"InstanceID": "W1", "Warrantor": "ACME",
                                      "WarrantyStartDate": null, "WarrantyDuration": 24}]})"));
    fs::remove(dataFile("Warranty.dat"));
    EXPECT_THAT(import(exportedWarranties), hasEnded(0, "Warranty.dat was replaced (records: 1).\n"));
    EXPECT_EQ(readFile(dataFile("Warranty.dat")), warranties);
    EXPECT_EQ(readFile(leases()), content);
}

TEST_F(DataTest, ADateThatIsNotSetIsNullAndAnEmptyStringIsEmpty) {
    const ordered_json second = exported().at("records").at(1);
    EXPECT_TRUE(second.at("BaseTermCommencementDate").is_null());
    EXPECT_EQ(second.at("Lessor"), "");
    EXPECT_EQ(second.at("InstanceID"), "L 2");
}

TEST_F(DataTest, TheGateReadsEditedRecordsAfterTheImport) {
    ordered_json edited = exported();
    edited["records"][1]["Lessor"] = "Other Co";
    edited["records"].erase(0);
    EXPECT_THAT(import(edited.dump()), hasEnded(0, "(records: 1)"));
    EXPECT_THAT(identifiers(), ElementsAre("L 2"));
    EXPECT_EQ(valueIn(instanceOf("L 2"), "Lessor"), "Other Co");
    EXPECT_THAT(create("L3"), isAnswered(1));
}

TEST_F(DataTest, AMissingFileIsExportedWithoutRecords) {
    EXPECT_EQ(ordered_json::parse(run("export VELKO_Warranty").output).at("records").size(), 0U);
    EXPECT_THAT(run("check"), hasEnded(0, "Warranty.dat does not exist, so there are no records.\n"));
}

TEST_F(DataTest, AFileWithoutRecordsNeedsNoLineEnd) {
    writeFile(leases(), "0");
    EXPECT_EQ(exported().at("records").size(), 0U);
    EXPECT_THAT(run("check"), hasEnded(0, "Lease.dat is complete (records: 0).\n"));
}

TEST_F(DataTest, RecordsThatAnImportReplacesCanBeRestored) {
    EXPECT_THAT(import(R"({"class": "VELKO_Lease", "records": []})"),
                hasEnded(0, "Lease.dat was replaced (records: 0).\n"));
    EXPECT_EQ(readFile(leases()), "0\n");
    EXPECT_THAT(run("restore VELKO_Lease"), hasEnded(0, "Lease.dat: It was restored from the saved copy of 20"));
    EXPECT_EQ(readFile(leases()), content);
}

TEST_F(DataTest, AnImportReplacesADamagedFile) {
    const ordered_json before = exported();
    for (const bool hasCopy : {true, false}) {
        if (!hasCopy) {
            removeCopies();
        }
        const std::string cut = content.substr(0, content.size() - 3);
        writeFile(leases(), cut);
        EXPECT_THAT(import(before.dump()), hasEnded(0, "Lease.dat was incomplete"));
        EXPECT_EQ(readFile(leases()), content);
        EXPECT_EQ(readFile(dataFile("Lease.dat.damaged")), cut);
    }
}

TEST_F(DataTest, AFailedImportChangesNothing) {
    const std::string edited = content + "edited\n";  // so that a copy is written, too
    const std::string empty = R"({"class": "VELKO_Lease", "records": []})";
    writeFile(leases(), edited);
    EXPECT_THAT(import(empty, "trap '' XFSZ; ulimit -f 0; "), hasEnded(1, "File too large"));
    EXPECT_EQ(readFile(leases()), edited);
    fs::create_directory(dataFile("Lease.dat.new"));
    EXPECT_THAT(import(empty), hasEnded(1, "Lease.dat.new: File exists"));
    EXPECT_EQ(readFile(leases()), edited);
    fs::remove(dataFile("Lease.dat.new"));
    EXPECT_THAT(run("restore VELKO_Lease"), hasEnded(0, "Lease.dat"));
    EXPECT_THAT(readFile(leases()), testing::StartsWith(content));
}

TEST_F(DataTest, InvalidDocumentsAreRefused) {
    using Edit = std::function<void(ordered_json&)>;
    const auto value = [](const char* name, const ordered_json& given) {
        return Edit([=](ordered_json& edited) { edited["records"][1][name] = given; });
    };
    const std::vector<std::pair<Edit, std::string>> cases{
        {[](auto& edited) { edited["class"] = "VELKO_AssetIDDetails"; },
         "/class must be VELKO_Lease or VELKO_Warranty, not \"VELKO_AssetIDDetails\"."},
        {[](auto& edited) { edited["class"] = "VELKO_Warranty"; }, "/records/0/Warrantor is missing."},
        {[](auto& edited) { edited.erase("class"); }, "/class must be"},
        {[](auto& edited) { edited = ordered_json::array(); }, "/class must be"},
        {[](auto& edited) { edited["records"] = "none"; }, "/records must be a list."},
        {[](auto& edited) { edited["records"][0] = 3; }, "/records/0/InstanceID is missing."},
        {[](auto& edited) { edited["records"][1].erase("BaseRent"); }, "/records/1/BaseRent is missing."},
        {[](auto& edited) { edited["comment"] = "edited"; }, "/comment cannot be stored"},
        {value("Owner", "ACME"), "/records/1/Owner cannot be stored: the provider reads no such value."},
        {value("LeaseTerm", "36"), "/records/1/LeaseTerm must be an integer from 0 to 4294967295."},
        {value("LeaseTerm", -1), "/records/1/LeaseTerm must be an integer"},
        {value("LeaseTerm", 4294967296U), "/records/1/LeaseTerm must be an integer"},
        {value("LeaseTerm", 1.5), "/records/1/LeaseTerm must be an integer"},
        {value("RenewalOption", 1), "/records/1/RenewalOption must be true or false."},
        {value("Lessor", nullptr), "/records/1/Lessor must be a string."},
        {value("Lessor", {{"bytes", "f"}}), "/records/1/Lessor must be a string, or {\"bytes\""},
        {value("Lessor", {{"bytes", 3}}), "/records/1/Lessor must be a string, or {\"bytes\""},
        {value("Lessor", {{"bytes", "41"}}), "/records/1/Lessor cannot be stored"},
        {value("Lessor", "a_b"), "/records/1/Lessor cannot be stored: the provider reads \"a b\"."},
        {value("Lessor", "x"), "/records/1/Lessor cannot be stored: the provider reads \"\"."},
        {value("Lessor", "a\nb"), "/records/1/Lessor cannot be stored"},
        {value("Lessor", std::string("a\0b", 3)), "a null character"},
        {value("BaseTermCommencementDate", ""), "/records/1/BaseTermCommencementDate cannot be stored"},
        {value("BaseTermCommencementDate", 2026), "/records/1/BaseTermCommencementDate must be a string or null."},
        {value("InstanceID", ""), "cannot be stored"},
        {value("InstanceID", "L1"), "Two records have the identifier \"L1\"."},
    };
    const ordered_json valid = exported();
    for (const auto& [edit, words] : cases) {
        ordered_json edited = valid;
        edit(edited);
        EXPECT_THAT(import(edited.dump()), hasEnded(1, words)) << edited;
        EXPECT_EQ(readFile(leases()), content) << edited;
    }
}

TEST_F(DataTest, UnreadableDocumentsAreRefused) {
    EXPECT_THAT(import("{\"class\": "), hasEnded(1, "document.json is not JSON: parse error at line 1, column 11"));
    EXPECT_THAT(import("\"\xFF\""), hasEnded(1, "is not JSON: "));
    fs::remove(document);
    EXPECT_THAT(run("import " + document.string()), hasEnded(1, "document.json: No such file or directory"));
    EXPECT_THAT(run("import " + directory.path().string()), hasEnded(1, "Is a directory"));
    EXPECT_EQ(readFile(leases()), content);
}

// --- check and restore ---------------------------------------------------------------------------------------------

TEST_F(DataTest, CheckReportsCompleteFiles) {
    const Ended ended = run("check");
    EXPECT_THAT(ended, hasEnded(0, "Lease.dat is complete (records: 2).\n"));
    EXPECT_EQ(readFile(leases()), content);
}

TEST_F(DataTest, DamagedFilesAreReportedAndNotExported) {
    const std::vector<std::pair<std::string, std::string>> cases{
        {content.substr(0, content.size() - 10), "Lease.dat was incomplete (records declared: 2, present: 1)."},
        {"3" + content.substr(1), "Lease.dat was incomplete (records declared: 3, present: 2)."},
        {"two" + content.substr(1), "Lease.dat had no count of records."},
        {"", "Lease.dat had no count of records."},
    };
    for (const bool hasCopy : {true, false}) {
        for (const auto& [damaged, words] : cases) {
            writeFile(leases(), damaged);
            const std::string remedy = hasCopy ? " The gate or the command restore will restore it.\n"
                                               : " There is no saved copy. Repair it.\n";
            EXPECT_THAT(run("check"), hasEnded(1, words + remedy));
            EXPECT_THAT(run("export VELKO_Lease"), hasEnded(1, "lease-warranty-data: " + words + remedy));
            EXPECT_EQ(readFile(leases()), damaged);
        }
        removeCopies();
    }
}

TEST_F(DataTest, TheLastLineOfARestoredCopyIsNotARecord) {
    const std::string before = exported().dump();
    writeFile(leases(), content + "saved copy 7 of Lease.dat\n");
    EXPECT_THAT(run("check"), hasEnded(0, "Lease.dat is complete (records: 2).\n"));
    EXPECT_EQ(exported().dump(), before);
}

TEST_F(DataTest, AMissingFileWithASavedCopyAndAnUnfinishedChangeAreReported) {
    const std::string newRecord = "new\n*\n00000000000000.000000-000\n0\n0\n0\n0\n0\n*\n*\n*\n*\n0\n";
    writeFile(dataFile("Lease.dat.saved1"), content + "saved copy 99 of Lease.dat, in use\n");
    writeFile(leases(), "3" + content.substr(1) + newRecord);
    EXPECT_THAT(run("check"), hasEnded(1, "Lease.dat held an unfinished change."));
    EXPECT_THAT(run("export VELKO_Lease"), hasEnded(1, "Lease.dat held an unfinished change."));
    fs::remove(leases());
    EXPECT_THAT(run("check"), hasEnded(1, "Lease.dat was missing. The gate or the command restore will restore it."));
}

TEST_F(DataTest, ValuesThatTheProviderReadsDifferentlyAreReportedAndNotExported) {
    const auto edited = [&](const char* pattern, const char* replacement) {
        return std::regex_replace(content, std::regex(pattern), replacement, std::regex_constants::format_first_only);
    };
    const std::vector<std::pair<std::string, std::string>> cases{
        {edited("4294967295", "36m"), R"(line 5: the file has "36m", but the provider reads "36".)"},
        {edited("4294967295", "036"), R"(line 5: the file has "036", but the provider reads "36".)"},
        {edited("Änne_", "Änne "),
         R"(line 3: the file has "\u00c4nne \"&\"_\\_Co", but the provider reads "\u00c4nne".)"},
        {edited("20260101000000.000000.060", "2026"),
         R"(line 4: the file has "2026", but the provider reads "00000000000000.000000-000".)"},
        {content + "more\n", R"(line 28: the file has "more", but the provider reads no line.)"},
    };
    for (const auto& [file, words] : cases) {
        writeFile(leases(), file);
        const auto isReported = hasEnded(1, "Lease.dat, " + words);
        EXPECT_THAT(run("check"), isReported) << file;
        EXPECT_THAT(run("export VELKO_Lease"), isReported) << file;
    }
}

TEST_F(DataTest, EqualIdentifiersAreReportedAndExported) {
    writeFile(leases(), std::regex_replace(content, std::regex("L_2"), "L1"));
    EXPECT_THAT(run("check"), hasEnded(1, "Two records have the identifier \"L1\"."));
    EXPECT_EQ(exported().at("records").at(1).at("InstanceID"), "L1");
}

TEST_F(DataTest, RestoreReplacesAnEditedFile) {
    writeFile(leases(), "0\n");
    EXPECT_THAT(run("restore VELKO_Lease"), hasEnded(0, "The former file is now Lease.dat.damaged."));
    EXPECT_EQ(readFile(leases()), content);
    EXPECT_EQ(readFile(dataFile("Lease.dat.damaged")), "0\n");
    EXPECT_THAT(identifiers(), ElementsAre("L1", "L 2"));
}

TEST_F(DataTest, RestoringAMissingOrEmptyFileKeepsNoFormerFile) {
    const std::string saved = content + "saved copy 1 of Lease.dat\n";
    removeCopies();
    for (const bool isEmpty : {false, true}) {
        writeFile(dataFile("Lease.dat.saved1"), saved);
        std::filesystem::remove(leases());
        if (isEmpty) {
            writeFile(leases(), "");
        }
        EXPECT_THAT(run("restore VELKO_Lease"), hasEnded(0, "Z.\n")) << "with the time at the end";
        EXPECT_EQ(readFile(leases()), content);
        EXPECT_FALSE(std::filesystem::exists(dataFile("Lease.dat.damaged")));
    }
}

TEST_F(DataTest, RestoreNeedsACompleteSavedCopy) {
    const std::string saved = content + "saved copy 1 of Lease.dat\n";
    removeCopies();
    writeFile(leases(), "0\n");
    for (const std::size_t size : {saved.size() - 1, std::size_t(0)}) {
        writeFile(dataFile("Lease.dat.saved1"), saved.substr(0, size));
        EXPECT_THAT(run("restore VELKO_Lease"),
                    hasEnded(1, "Lease.dat has no complete saved copy. Nothing is changed."));
        EXPECT_EQ(readFile(leases()), "0\n");
    }
}

// --- lock and command line -----------------------------------------------------------------------------------------

TEST_F(DataTest, CommandsAreRefusedWhileAProcessUsesTheDirectory) {
    const std::string before = exported().dump();
    EXPECT_THAT(create("L3"), isAnswered(1));
    const std::string owner =
        "is in use by process " + std::to_string(getpid()) + " (data_test). End that process first.";
    const std::string now = readFile(leases());
    for (const char* command : {"check", "restore VELKO_Lease", "export VELKO_Lease"}) {
        EXPECT_THAT(run(command), hasEnded(3, owner)) << command;
    }
    EXPECT_THAT(import(before), hasEnded(3, owner));
    EXPECT_EQ(readFile(leases()), now);
    unload();
    EXPECT_THAT(run("check"), hasEnded(0, "Lease.dat is complete (records: 3)."));
}

TEST_F(DataTest, ADirectoryThatCannotBeLockedIsNotUsed) {
    fs::remove(dataFile("owner"));
    fs::create_directory(dataFile("owner"));
    for (const char* command : {"check", "restore VELKO_Lease", "export VELKO_Lease"}) {
        EXPECT_THAT(run(command), hasEnded(3, "owner: Is a directory")) << command;
    }
    fs::remove(dataFile("owner"));
    EXPECT_EQ(readFile(leases()), content);
}

TEST_F(DataTest, AMissingDirectoryIsReported) {
    const fs::path elsewhere = agentEnvironment::directory() / "elsewhere";
    fs::rename(agentEnvironment::dataDirectory(), elsewhere);
    EXPECT_THAT(run("check"), hasEnded(3, "No such file or directory"));
    fs::rename(elsewhere, agentEnvironment::dataDirectory());
}

TEST_F(DataTest, AnOutputThatCannotBeWrittenIsReported) {
    EXPECT_THAT(run("export VELKO_Lease >/dev/full"), hasEnded(1, "The output cannot be written"));
}

TEST_F(DataTest, WrongCommandLinesAreRefused) {
    EXPECT_THAT(run(""), hasEnded(2, "A subcommand is required"));
    EXPECT_THAT(run("delete"), hasEnded(2, "--help"));
    EXPECT_THAT(run("export"), hasEnded(2, "CLASS is required"));
    EXPECT_THAT(run("export VELKO_AssetIDDetails"), hasEnded(2, "VELKO_Lease"));
    EXPECT_THAT(run("import"), hasEnded(2, "FILE is required"));
    EXPECT_THAT(run("check VELKO_Lease"), hasEnded(2, "VELKO_Lease"));
    EXPECT_THAT(run("--help"), hasEnded(0, "import"));
    EXPECT_THAT(run("--version"), hasEnded(0, "lease-warranty-data 1."));
}

}  // namespace
}  // namespace gatetest
