#include <algorithm>
#include <fstream>
#include <random>

#include "RecordFixture.h"
#include "support/Files.h"

// Malicious strings from clients in memory, in the file and in the log.

namespace contract {
namespace {

using testing::IsEmpty;
using testsupport::Form;
using testsupport::ModelRecord;
using testsupport::named;
using testsupport::RecordModel;
using testsupport::text;

/** Returns a string of this length, which repeats all special characters. */
std::string longString(std::size_t length) {
    std::string all;
    while (all.size() < length) {
        all += "some words_and\ttabs\nlines \xC3\xA4 * ";
    }
    return all.substr(0, length);
}

const std::vector<std::string>& hostileStrings() {
    static const std::vector<std::string> strings{
        "",
        "*",
        "X",
        "_",
        " ",
        "  ",
        "**",
        "* ",
        "__",
        "a b",
        "a_b",
        " leading",
        "trailing ",
        "tab\there",
        "line\nfeed",
        "carriage\r\nreturn",
        "\n",
        "\t\n ",
        "a\vb\fc",
        "1",
        "0",
        "12abc",
        "0\n1\nX",
        "quote\"back\\slash",
        "%s%n%d%1000000d",
        "\x1b[31mred",
        "\x7f",
        "\xC3\xA4\xC3\xB6\xC3\xBC \xE2\x82\xAC",
        "\xE6\x97\xA5\xE6\x9C\xAC",
        "\xC2\xA0",
        "\xE2\x80\xA8",
        "\xff\xfe broken",
        "\xC3",
        "x\n2024-05-06T07:08:09.123456+02:00\tlog\t3000\tTarvik.LeaseAndWarrantyProvider\tf\tf.cpp\t1\tforged",
        std::string(10000, 'x'),
        std::string(10000, ' '),
        std::string(10000, '\n'),
        longString(10000)};
    return strings;
}

/** Returns all fields of a log record except its message. */
std::string shapeOf(const LogRecord& record) {
    return record.channel + " " + std::to_string(record.level) + " " + record.logger + " " + record.function + " " +
           record.file + " " + std::to_string(record.line);
}

std::vector<std::string> shapeOfLog() {
    std::vector<std::string> shapes;
    for (const LogRecord& record : agentEnvironment::log()) {
        shapes.push_back(shapeOf(record));
    }
    return shapes;
}

/** Returns the invalid lines of the log file. A valid line has eight fields of printable characters. */
std::vector<std::string> malformedLogLines() {
    std::vector<std::string> malformed;
    std::ifstream stream(agentEnvironment::logFile(), std::ios::binary);
    for (std::string line; std::getline(stream, line);) {
        const bool hasControls = std::any_of(line.begin(), line.end(), [](char character) {
            return character != '\t' && (static_cast<unsigned char>(character) < ' ' || character == '\x7f');
        });
        if (hasControls || std::count(line.begin(), line.end(), '\t') != 7) {
            malformed.push_back(line);
        }
    }
    return malformed;
}

class HostileTextTest : public RecordTest {
protected:
    HostileTextTest() : model(kind().fields()) {}

    /** @name Requests that also change the model */
    ///@{
    void createBoth(const std::string& instanceId) {
        const bool isTaken = model.find(instanceId) != nullptr;
        const Outcome outcome = create(instanceId);
        EXPECT_THAT(outcome, isOk(isTaken ? 0 : 1));
        EXPECT_EQ(outcome.instances().size(), isTaken ? 0U : 1U);
        if (!isTaken) {
            model.records.push_back(model.newRecord(instanceId));
        }
    }

    /** Sets all string properties of a record to a value. */
    void modifyBoth(const std::string& instanceId, const std::string& value) {
        std::vector<NamedValue> properties;
        ModelRecord* record = model.find(instanceId);
        for (std::size_t index = 0; index < model.fields.size(); ++index) {
            if (model.fields[index].form == Form::text) {
                properties.push_back(named(model.fields[index].property, text(value)));
                if (record != nullptr) {
                    (*record)[index] = value;
                }
            }
        }
        EXPECT_THAT(modify(instanceId, properties), isOk(0));
    }

    void removeBoth(const std::string& instanceId) {
        model.remove(instanceId);
        EXPECT_THAT(remove(instanceId), isOk(0));
    }

    void restartBoth() {
        unload();
        if (const auto content = data()) {
            model.read(*content);
        }
    }
    ///@}

    /** Expects that the records in memory match the model. */
    void expectRecords() {
        const Outcome outcome = provider().enumerateInstances(allPath());
        EXPECT_THAT(outcome, isOk(1));
        std::vector<std::vector<std::string>> there;
        for (const Instance& instance : outcome.instances()) {
            there.push_back(model.shownFields(instance));
        }
        EXPECT_EQ(there, model.shownRecords());
    }

    /** Expects that memory and file match the model. */
    void expectAgreement() {
        EXPECT_EQ(data().value_or("0\n"), model.written());
        expectRecords();
    }

    /** Restarts, and expects that memory matches the model, which is read from the same file. */
    void expectAgreementAfterRestart() {
        restartBoth();
        const std::string before = data().value_or("");
        expectRecords();
        EXPECT_EQ(data().value_or(""), before);
    }

    /** Restarts without records and log. */
    void restartEmpty() {
        unload();
        agentEnvironment::clear();
        model.records.clear();
    }

    /**
     * Returns the log records, without messages, of creating, modifying and deleting a record with this identifier and
     * value.
     */
    std::vector<std::string> logOfLife(const std::string& instanceId, const std::string& value) {
        restartEmpty();
        create(instanceId);
        get(instanceId);
        modify(instanceId, {named(kind().textProperty, text(value))});
        identifiers();
        remove(instanceId);
        EXPECT_THAT(malformedLogLines(), IsEmpty());
        return shapeOfLog();
    }

    RecordModel model;
};

TEST_P(HostileTextTest, IdentifiersAreKeptInMemoryAndReloadedFromTheFile) {
    for (const std::string& hostile : hostileStrings()) {
        SCOPED_TRACE(testing::PrintToString(hostile.substr(0, 50)));
        restartEmpty();
        createBoth("before");
        createBoth(hostile);
        createBoth("after");
        modifyBoth(hostile, "some value");
        expectAgreement();
        expectAgreementAfterRestart();
    }
}

TEST_P(HostileTextTest, ValuesAreKeptInMemoryAndReloadedFromTheFile) {
    for (const std::string& hostile : hostileStrings()) {
        SCOPED_TRACE(testing::PrintToString(hostile.substr(0, 50)));
        restartEmpty();
        createBoth("before");
        createBoth("hostile");
        createBoth("after");
        modifyBoth("before", "first value");
        modifyBoth("hostile", hostile);
        expectAgreement();
        expectAgreementAfterRestart();
    }
}

TEST_P(HostileTextTest, RecordsWithHostileIdentifiersCanBeFoundAndDeleted) {
    for (const std::string& hostile : hostileStrings()) {
        createBoth(hostile);
    }
    expectAgreement();
    for (const std::string& hostile : hostileStrings()) {
        SCOPED_TRACE(testing::PrintToString(hostile.substr(0, 50)));
        EXPECT_EQ(identifiersOf(get(hostile).instances()), std::vector<std::string>{hostile});
        removeBoth(hostile);
    }
    EXPECT_EQ(data(), "0\n");
}

TEST_P(HostileTextTest, LogRecordsCannotBeForged) {
    const auto harmless = logOfLife("harmless", "harmless");
    for (const std::string& hostile : hostileStrings()) {
        SCOPED_TRACE(testing::PrintToString(hostile.substr(0, 50)));
        EXPECT_EQ(logOfLife(hostile, "harmless"), harmless);
        EXPECT_EQ(logOfLife("harmless", hostile), harmless);
    }
}

TEST_P(HostileTextTest, ADuplicateIsLoggedInTheSameWayForAnyIdentifier) {
    for (const std::string& hostile : hostileStrings()) {
        restartEmpty();
        create(hostile);
        create(hostile);
        EXPECT_EQ(caughtFailures(), std::vector<std::string>{kind().exists});
        EXPECT_THAT(malformedLogLines(), IsEmpty());
    }
}

TEST_P(HostileTextTest, ClassNamesCannotForgeLogRecords) {
    provider();
    for (const std::string& hostile : hostileStrings()) {
        agentEnvironment::forgetLog();
        EXPECT_THAT(provider().getInstance(keyedPath(hostile, hostile)), isRefused(CMPI_RC_ERR_INVALID_CLASS));
        EXPECT_EQ(shapeOfLog().size(), 10U) << "two separators, entry, class id and exit, on two channels";
        EXPECT_THAT(malformedLogLines(), IsEmpty());
    }
}

/** Random requests, each of which can damage the file for the next load. */
TEST_P(HostileTextTest, RandomRequestsAndRestartsMatchTheModel) {
    std::mt19937 random(20240506);
    const auto below = [&](std::size_t limit) { return static_cast<std::size_t>(random() % limit); };
    const auto word = [&] {
        static const std::string alphabet = "ab01_* \n\t";
        std::string made;
        for (std::size_t left = below(5); left > 0; --left) {
            made += alphabet[below(alphabet.size())];
        }
        return made;
    };
    const auto someIdentifier = [&] {
        return model.records.empty() || below(4) == 0 ? word() : model.records[below(model.records.size())].front();
    };
    constexpr std::size_t maximumRecords = 6;
    for (int step = 0; step < 80 && !HasFailure(); ++step) {
        SCOPED_TRACE(step);
        const std::size_t choice = below(20);
        if (model.records.size() >= maximumRecords || choice < 4) {
            removeBoth(someIdentifier());
        } else if (choice < 11) {
            createBoth(word());
        } else if (choice < 18) {
            modifyBoth(someIdentifier(), word());
        } else {
            expectAgreementAfterRestart();
            createBoth("step" + std::to_string(step));
        }
        expectAgreement();
        agentEnvironment::forgetLog();
    }
}

INSTANTIATE_RECORD_TEST(HostileTextTest);

}  // namespace
}  // namespace contract
