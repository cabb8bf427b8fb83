#include <algorithm>
#include <map>
#include <regex>
#include <set>

#include "TranscriptFixture.h"

// Content of transcripts: levels, loggers, and records that differ between scenarios.

namespace contract {
namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr const char* logger = "Tarvik.LeaseAndWarrantyProvider";
constexpr const char* shortLogger = "Tarvik.LeaseWarrantyProvider";

/** Returns whether the entry and exit of a record's function are logged at error level. */
bool isRaised(const LogRecord& record) {
    static const std::map<std::string, std::set<std::string>> raised{
        {"CMPIComputerSystem.cpp", {"setObjectPath", "getCMPIInstance"}},
        {"CMPILeaseSetting.cpp",
         {"CMPILeaseSetting", "getCMPIInstance", "getAssociator", "locateLease", "locateComputer"}},
        {"CMPIWarrantySetting.cpp",
         {"CMPIWarrantySetting", "getCMPIInstance", "getAssociator", "locateWarranty", "locateComputer"}},
        {"LeaseSetting.cpp", {"getLeaseMoniker", "getComputerMoniker"}},
        {"WarrantySetting.cpp", {"getWarrantyMoniker", "getComputerMoniker"}},
        {"OstrelAgent.cpp", {"setFilter"}},
        {"AssetIDDetails.cpp", {"setFilter"}},
    };
    const auto found = raised.find(record.file);
    return found != raised.end() && found->second.count(record.function) == 1;
}

/** Returns messages that do not report failures, and failures that are logged at flow level only. */
const std::set<std::string>& flowMessages() {
    static const std::set<std::string> all{"Asset.dat file opened in write mode Successfully",
                                           "Opening File",
                                           "File Locked successfully",
                                           "File Open successfully",
                                           "Throwing Exception in Constructor",
                                           "Throwing Exception while writing Data"};
    return all;
}

constexpr const char* loudMessage = "Failed while opening Asset.dat in write mode";

int expectedLevel(const LogRecord& record, const Line& line) {
    if (line.kind == Line::message) {
        return flowMessages().count(line.value) == 1 ? 4000 : line.value == loudMessage ? 6000 : 3000;
    }
    const bool isFlow = line.kind == Line::entering || line.kind == Line::exiting;
    return isFlow && isRaised(record) ? 3000 : 4000;
}

TEST_F(TranscriptPropertyTest, LevelsMatchTheKindOfRecord) {
    std::set<std::string> foundMessages;
    std::set<std::string> foundRaised;
    forEachRecord([&](const LogRecord& record, const Line& line) {
        EXPECT_EQ(record.level, expectedLevel(record, line)) << record.file << " " << record.text;
        if (line.kind == Line::message) {
            foundMessages.insert(line.value);
        } else if (record.level == 3000) {
            foundRaised.insert(record.file + " " + record.function);
        }
    });
    for (const std::string& message : flowMessages()) {
        EXPECT_THAT(foundMessages, Contains(message)) << "no scenario logs this message";
    }
    EXPECT_THAT(foundMessages, Contains(loudMessage));
    EXPECT_EQ(foundRaised.size(), 18U) << "functions whose entry or exit is at error level";
}

TEST_F(TranscriptPropertyTest, AFailureToOpenTheAssetFileIsLoggedOnceAtLevel6000) {
    for (const char* name : {"AssetIDDetails-enumerate-unreadable", "AssetIDDetails-modify-unwritable"}) {
        const auto records = logged(name);
        EXPECT_EQ(
            std::count_if(records.begin(), records.end(), [](const LogRecord& record) { return record.level == 6000; }),
            1)
            << name;
    }
}

TEST_F(TranscriptPropertyTest, TwoSourceFilesUseTheShorterLoggerName) {
    std::set<std::string> files;
    forEachRecord([&](const LogRecord& record, const Line&) {
        const bool isShort = record.file == "OstrelAgent.cpp" || record.file == "AssetIDDetails.cpp";
        EXPECT_EQ(record.logger, isShort ? shortLogger : logger) << record.file;
        files.insert(record.file);
    });
    EXPECT_EQ(files.size(), 17U) << "sixteen source files and the markers";
}

TEST_F(TranscriptPropertyTest, OnlyLeasesLogTheirCreation) {
    const auto created = [&](const std::string& scenario, const std::string& file) {
        const auto names = namesOf(scenario, Line::variable, file);
        return std::count(names.begin(), names.end(), "Instance Created");
    };
    EXPECT_EQ(created("Lease-create", "CMPILease.cpp"), 1);
    EXPECT_EQ(created("Lease-create-first", "CMPILease.cpp"), 1);
    EXPECT_EQ(created("Lease-create-duplicate", "CMPILease.cpp"), 0);
    forEachRecord([](const LogRecord& record, const Line& line) {
        if (line.kind == Line::variable && line.name == "Instance Created") {
            EXPECT_EQ(record.file, "CMPILease.cpp");
            EXPECT_EQ(line.value, "1");
        }
    });
}

/** Returns the address of the property list in a parameter list, "0" for null; empty if there is none. */
std::string propertyListIn(const std::string& parameters) {
    static const std::regex list(".* properties=?(0x[0-9a-f]+|0)( .*)?");
    std::smatch part;
    return std::regex_match(parameters, part, list) ? part[1].str() : std::string();
}

TEST_F(TranscriptPropertyTest, APropertyListIsLoggedWhereverItIsPassed) {
    const auto loggedBy = [&](const std::string& scenario) {
        std::vector<std::string> functions;
        for (const LogRecord& record : logged(scenario)) {
            const Line line = lineOf(record.text);
            const std::string list = propertyListIn(line.value);
            if (line.kind == Line::entering && !list.empty() && list != "0") {
                functions.push_back(record.file + " " + record.function);
            }
        }
        return functions;
    };
    for (const std::string kind : {"Lease", "Warranty"}) {
        const std::string adapter = "CMPI" + kind + ".cpp ";
        const std::string setting = "CMPI" + kind + "Setting.cpp ";
        EXPECT_THAT(loggedBy(kind + "-get"), IsEmpty());
        EXPECT_THAT(loggedBy(kind + "-get-listed"), ElementsAre(adapter + "getCMPIInstance"));
        EXPECT_THAT(loggedBy(kind + "-modify-listed"), ElementsAre(adapter + "modifyCMPIInstance"));
        EXPECT_THAT(loggedBy(kind + "Setting-enumerate-listed"),
                    ElementsAre(setting + "getCMPIInstance", setting + "getCMPIInstance"));
        EXPECT_THAT(loggedBy(kind + "Setting-from-computer-listed"),
                    ElementsAre(setting + "getAssociator", adapter + "getCMPIInstance"));
        EXPECT_THAT(loggedBy(kind + "Setting-from-element-listed"),
                    ElementsAre(setting + "getAssociator", "CMPIComputerSystem.cpp getCMPIInstance"));
    }
}

TEST_F(TranscriptPropertyTest, AssociationsLogConstructionAndDestructionOfTheirParts) {
    forEachTranscript([](const Scenario& scenario, const std::vector<LogRecord>& records) {
        const std::size_t found = scenario.name.find("Setting-");
        if (found == std::string::npos) {
            return;
        }
        const std::string setting = scenario.name.substr(0, found + 7);
        std::vector<std::string> noted;
        for (const LogRecord& record : channel(records, "log")) {
            const Line line = lineOf(record.text);
            if (line.kind == Line::method) {
                noted.push_back(line.name + " " + record.file);
            }
        }
        const std::string computer = "CMPILAWComputerSystem CMPIComputerSystem.cpp";
        const std::string element = setting + " " + setting + ".cpp";
        const std::string adapter = "CMPI" + setting + " CMPI" + setting + ".cpp";
        const bool isMade = scenario.name.find("-get") == std::string::npos;
        const bool isFinished = std::find(noted.begin(), noted.end(), "~" + adapter) != noted.end();
        if (!isMade) {
            EXPECT_THAT(noted, IsEmpty());
        } else if (isFinished) {
            EXPECT_THAT(noted, ElementsAre(computer, element, "~" + adapter, "~" + element, "~" + computer));
        } else {
            EXPECT_THAT(noted, ElementsAre(computer, element, "~" + element, "~" + computer))
                << "the adapter was not constructed completely";
        }
    });
}

TEST_F(TranscriptPropertyTest, ACountOfZeroIsLoadedLikeAMissingFile) {
    const auto messagesOfScenario = [&](const char* scenario) {
        std::vector<std::string> strings;
        for (const LogRecord& record : logged(scenario)) {
            strings.push_back(std::to_string(record.level) + " " + record.function + " " + record.text);
        }
        return strings;
    };
    EXPECT_EQ(messagesOfScenario("load-with-zero-counts"), messagesOfScenario("load-without-files"));
}

TEST_F(TranscriptPropertyTest, OperationsWithAFixedStatusLogOneRecordEach) {
    EXPECT_THAT(
        namesOf("only-noted", Line::method, entryUnit),
        ElementsAre("LeaseAndWarranty_ExecQuery", "LeaseAndWarranty_References", "LeaseAndWarranty_ReferenceNames",
                    "LeaseAndWarranty_Cleanup", "LeaseAndWarranty_AssociationCleanup"));
    EXPECT_EQ(logged("only-noted").size(), 5U);
}

TEST_F(TranscriptPropertyTest, EveryDispatchedOperationLogsItsName) {
    EXPECT_THAT(namesOf("unknown-class", Line::entering, markerFile),
                ElementsAre("LeaseAndWarranty_EnumInstanceNames", "LeaseAndWarranty_EnumInstances",
                            "LeaseAndWarranty_GetInstance", "LeaseAndWarranty_CreateInstance",
                            "LeaseAndWarranty_ModifyInstance", "LeaseAndWarranty_DeleteInstance",
                            "LeaseAndWarranty_AssociatorNames", "LeaseAndWarranty_Associators"));
    EXPECT_EQ(logged("unknown-class").size(), 8U * 5U) << "separator, entry, class id, exit, separator";
}

TEST_F(TranscriptPropertyTest, ExceptionsAreLoggedWhereTheyAreThrownAndCaught) {
    const std::map<std::string, std::string> failures{
        {"Lease-create-duplicate", "Lease with the supplied instance Id exists."},
        {"Warranty-create-duplicate", "Warranty with the supplied instance Id exists."},
        {"Lease-create-unwritable", "Could not open Lease record."},
        {"Warranty-create-unwritable", "Could not open Warranty record."},
        {"Lease-delete-unwritable", "Could not open Lease record."},
        {"Warranty-delete-unwritable", "Could not open Warranty record."},
        {"Lease-modify-absent", "Lease record not available"},
        {"Warranty-modify-absent", "Warranty record not available"},
        {"Lease-delete-absent", "Lease record not available"},
        {"Warranty-delete-absent", "Warranty record not available"},
        {"Lease-delete-without-key", "Identify a Lease to remove."},
        {"Warranty-delete-without-key", "Identify a Warranty to remove."},
        {"LeaseSetting-enumerate-names-no-computer", "Could not obtain an instance of Computer System"},
        {"WarrantySetting-enumerate-names-no-computer", "Could not obtain an instance of Computer System"},
        {"LeaseSetting-names-from-element-no-computer", "Could not obtain an instance of Computer System"},
        {"WarrantySetting-names-from-element-no-computer", "Could not obtain an instance of Computer System"},
        {"LeaseSetting-names-from-computer-without-name", "Could not find 'Name' Key in Moniker"},
        {"WarrantySetting-names-from-computer-without-name", "Could not find 'Name' Key in Moniker"},
        {"LeaseSetting-names-from-element-without-identifier", "Could not find 'InstanceID' Key in Moniker"},
        {"WarrantySetting-names-from-element-without-identifier", "Could not find 'InstanceID' Key in Moniker"},
        {"LeaseSetting-names-from-element-without-place", "Name Property on computer not available."},
        {"WarrantySetting-names-from-element-without-place", "Name Property on computer not available."},
        {"OstrelAgent-get-other-vendor", "Could not find specified Agent."},
    };
    forEachTranscript([&](const Scenario& scenario, const std::vector<LogRecord>& records) {
        std::vector<std::string> thrown;
        std::vector<std::string> caught;
        for (const LogRecord& record : channel(records, "log")) {
            const Line line = lineOf(record.text);
            if (line.kind == Line::message && record.level == 3000) {
                (record.file == entryUnit ? caught : thrown).push_back(line.value);
            }
        }
        const auto failure = failures.find(scenario.name);
        const auto expected =
            failure == failures.end() ? std::vector<std::string>{} : std::vector<std::string>{failure->second};
        EXPECT_EQ(thrown, expected);
        EXPECT_EQ(caught, expected);
    });
}

}  // namespace
}  // namespace contract
