#include <algorithm>
#include <sstream>

#include "LoadClient.h"
#include "Threads.h"
#include "lab/emulation/ManagerEmulation.h"
#include "support/Files.h"

// Checks that responses, enumerations and files agree after a mixed load of concurrent clients.

namespace gatetest {
namespace {

using cimhost::lab::Manager;
using testing::IsEmpty;
using testing::UnorderedElementsAreArray;
using testsupport::RecordModel;

constexpr int rounds = 3;

/** Returns the expected records of a class, sorted by identifier. */
RecordModel modelOf(const LoadedKind& kind, const ExpectedState& expected) {
    RecordModel model(kind.fields);
    for (const auto& [id, record] : expected.records.at(kind.className)) {
        model.records.push_back(record);
    }
    return model;
}

/** Returns the values of a class's instances. */
std::vector<std::vector<std::string>> inTable(ManagedGate& gate, const LoadedKind& kind) {
    const auto answer = gate.manager().perform(cimhost::Request::enumerateInstances(classPath(kind.className)));
    EXPECT_TRUE(answer.ok()) << answer.status.message;
    std::vector<std::vector<std::string>> shown;
    for (const Instance& instance : answer.instances) {
        shown.push_back(RecordModel(kind.fields).shownFields(instance));
    }
    return shown;
}

/** Returns a record file with its records sorted by identifier. */
std::string inFile(const LoadedKind& kind) {
    const std::string content = testsupport::readFile(agentEnvironment::dataDirectory() / kind.file);
    RecordModel model(kind.fields);
    model.read(content);
    EXPECT_EQ(model.written(), content) << "the file contains only records";
    std::sort(model.records.begin(), model.records.end());
    return model.written();
}

std::map<std::string, std::string> assetInTable(ManagedGate& gate) {
    const Instance instance = gate.instanceOf(gate.paths(asset).at(0));
    std::map<std::string, std::string> shown;
    for (const char* property : loadedAssetProperties()) {
        shown[property] = valueIn(instance, property).value_or("(none)");
    }
    return shown;
}

/** Returns the non-empty values of the asset data file. */
std::vector<std::string> assetInFile() {
    std::istringstream file(testsupport::readFile(agentEnvironment::dataDirectory() / "asset.dat"));
    std::vector<std::string> values;
    for (std::string line; std::getline(file, line);) {
        const auto value = line.find('=');
        if (value != std::string::npos && value + 1 < line.size()) {
            values.push_back(line.substr(value + 1));
        }
    }
    return values;
}

void expectAgreement(ManagedGate& gate, const ExpectedState& expected) {
    for (const LoadedKind& kind : loadedKinds()) {
        const RecordModel model = modelOf(kind, expected);
        EXPECT_THAT(inTable(gate, kind), UnorderedElementsAreArray(model.shownRecords())) << kind.className;
        EXPECT_EQ(inFile(kind), model.written()) << kind.file;
        EXPECT_THAT(gate.paths(kind.setting), testing::SizeIs(1)) << "the association of the first computer";
    }
    EXPECT_EQ(assetInTable(gate), expected.asset);
    std::vector<std::string> stored;
    for (const auto& [property, value] : expected.asset) {
        stored.push_back(value);
    }
    EXPECT_THAT(assetInFile(), UnorderedElementsAreArray(stored));
}

class LoadTest : public testing::TestWithParam<Manager> {
protected:
    LoadTest() { agentEnvironment::clear(); }
    ~LoadTest() override { agentEnvironment::clear(); }

    /** Creates a lease and a warranty of the first computer. */
    static ExpectedState createFirst(ManagedGate& gate) {
        ExpectedState expected;
        for (const LoadedKind& kind : loadedKinds()) {
            const auto record = filledRecord(kind, firstNode, 1);
            EXPECT_TRUE(gate.create(firstNode, propertiesOf(kind, record), kind.className).ok());
            expected.records[kind.className][firstNode] = record;
        }
        return expected;
    }

    /** Merges the expected state of a client. The expected states of the clients are disjoint. */
    static void merge(ExpectedState& all, const LoadClient& client) {
        EXPECT_THAT(client.problems, IsEmpty());
        for (const auto& [className, records] : client.expected.records) {
            for (const auto& [id, record] : records) {
                EXPECT_TRUE(all.records[className].emplace(id, record).second) << id << " was created twice";
            }
        }
        all.asset.insert(client.expected.asset.begin(), client.expected.asset.end());
    }

    SilentLog silence;
};

TEST_P(LoadTest, ResponsesEnumerationsAndFilesAgreeAfterAMixedLoad) {
    ExpectedState expected;
    {
        ManagedGate gate(GetParam());
        expected = createFirst(gate);
        std::vector<LoadClient> clients;
        for (int number = 0; number < clientCount; ++number) {
            clients.emplace_back(gate, number);
        }
        onThreads(clientCount, [&](int number) {
            for (int round = 0; round < rounds; ++round) {
                clients[static_cast<std::size_t>(number)].work(round);
            }
        });
        for (const LoadClient& client : clients) {
            merge(expected, client);
        }
        expectAgreement(gate, expected);
    }
    ManagedGate again(GetParam());
    expectAgreement(again, expected);
}

INSTANTIATE_TEST_SUITE_P(Gate, LoadTest, testing::ValuesIn(cimhost::lab::everyManager), cimhost::lab::ManagerName());

}  // namespace
}  // namespace gatetest
