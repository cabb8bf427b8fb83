#include <algorithm>
#include <sstream>

#include "LoadClient.h"
#include "Threads.h"
#include "lab/emulation/ManagerEmulation.h"
#include "support/Files.h"

// Many clients at a time: what they were told, what the tables hold and what the files hold are the same.

namespace gatetest {
namespace {

using cimhost::lab::Manager;
using testing::IsEmpty;
using testing::UnorderedElementsAreArray;
using testsupport::RecordModel;

constexpr int rounds = 3;

/** All that clients were told of a class, in the order of the identifiers. */
RecordModel modelOf(const LoadedKind& kind, const Told& told) {
    RecordModel model(kind.fields);
    for (const auto& [id, record] : told.records.at(kind.className)) {
        model.records.push_back(record);
    }
    return model;
}

/** What the instances of a class show. */
std::vector<std::vector<std::string>> inTable(ManagedGate& gate, const LoadedKind& kind) {
    const auto answer = gate.manager().perform(cimhost::Request::enumerateInstances(classPath(kind.className)));
    EXPECT_TRUE(answer.ok()) << answer.status.message;
    std::vector<std::vector<std::string>> shown;
    for (const Instance& instance : answer.instances) {
        shown.push_back(RecordModel(kind.fields).shownFields(instance));
    }
    return shown;
}

/** A record file line by line, with the records in the order of their identifiers. */
std::string inFile(const LoadedKind& kind) {
    const std::string content = testsupport::readFile(agentEnvironment::dataDirectory() / kind.file);
    RecordModel model(kind.fields);
    model.read(content);
    EXPECT_EQ(model.written(), content) << "there is more in the file than its records";
    std::sort(model.records.begin(), model.records.end());
    return model.written();
}

std::map<std::string, std::string> assetShown(ManagedGate& gate) {
    const Instance instance = gate.got(gate.paths(asset).at(0));
    std::map<std::string, std::string> shown;
    for (const char* property : loadedAssetProperties()) {
        shown[property] = valueIn(instance, property).value_or("(none)");
    }
    return shown;
}

/** The values in the file of asset data that are not empty. */
std::vector<std::string> assetStored() {
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

void expectAgreement(ManagedGate& gate, const Told& told) {
    for (const LoadedKind& kind : loadedKinds()) {
        const RecordModel model = modelOf(kind, told);
        EXPECT_THAT(inTable(gate, kind), UnorderedElementsAreArray(model.shownRecords())) << kind.className;
        EXPECT_EQ(inFile(kind), model.written()) << kind.file;
        EXPECT_THAT(gate.paths(kind.setting), testing::SizeIs(1)) << "that of the first computer";
    }
    EXPECT_EQ(assetShown(gate), told.asset);
    std::vector<std::string> stored;
    for (const auto& [property, value] : told.asset) {
        stored.push_back(value);
    }
    EXPECT_THAT(assetStored(), UnorderedElementsAreArray(stored));
}

class LoadTest : public testing::TestWithParam<Manager> {
protected:
    LoadTest() { agentEnvironment::clear(); }
    ~LoadTest() override { agentEnvironment::clear(); }

    /** Gives the first computer a lease and a warranty. */
    static Told begin(ManagedGate& gate) {
        Told told;
        for (const LoadedKind& kind : loadedKinds()) {
            const auto record = filledRecord(kind, firstPlace, 1);
            EXPECT_TRUE(gate.create(firstPlace, propertiesOf(kind, record), kind.className).ok());
            told.records[kind.className][firstPlace] = record;
        }
        return told;
    }

    /** Takes over what a client was told, of which nobody else was told. */
    static void gather(Told& all, const LoadClient& client) {
        EXPECT_THAT(client.problems, IsEmpty());
        for (const auto& [className, records] : client.told.records) {
            for (const auto& [id, record] : records) {
                EXPECT_TRUE(all.records[className].emplace(id, record).second) << id << " was created twice";
            }
        }
        all.asset.insert(client.told.asset.begin(), client.told.asset.end());
    }

    SilentLog silence;
};

TEST_P(LoadTest, ClientsTablesAndFilesAgreeAfterAMixedLoad) {
    Told told;
    {
        ManagedGate gate(GetParam());
        told = begin(gate);
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
            gather(told, client);
        }
        expectAgreement(gate, told);
    }
    ManagedGate again(GetParam());
    expectAgreement(again, told);
}

INSTANTIATE_TEST_SUITE_P(Gate, LoadTest, testing::ValuesIn(cimhost::lab::everyManager), cimhost::lab::ManagerName());

}  // namespace
}  // namespace gatetest
