#include "ManagedGate.h"
#include "OperationRows.h"
#include "Shown.h"
#include "lab/emulation/ManagerEmulation.h"

// Every operation of every class under every object manager: through the gate, and from the provider itself.

namespace gatetest {
namespace {

using cimhost::ProviderResponse;
using cimhost::lab::Manager;
using testing::IsEmpty;
using testing::Not;

class OperationTest : public testing::TestWithParam<Manager> {
protected:
    OperationTest() { agentEnvironment::clear(); }
    ~OperationTest() override { agentEnvironment::clear(); }

    /** The library that serves the classes is loaded again for each request, over the same files. */
    cimhost::Response ask(const Row& row, Served served) {
        agentEnvironment::clear();
        writeRecords(recordsOfRows());
        const DataFiles before;
        ManagedGate gate(GetParam(), served);
        cimhost::Response response = gate.manager().perform(row.request);
        got = shown(response) + before.changes();
        return response;
    }

    std::string got;  ///< what the client got, and what became of the files
    SilentLog silence;
};

/** The rows that are this manager's: all of them, or its share, so that each is some manager's. */
std::vector<Row> rowsOf(Manager manager) {
    const std::vector<Row> all = operationRows();
    std::vector<Row> rows;
    for (auto index = static_cast<std::size_t>(manager) % SHARES; index < all.size(); index += SHARES) {
        rows.push_back(all[index]);
    }
    return rows;
}

/** A failure has a message of the provider's own and no answers; whatever else, none. */
void expectStandardForm(const ProviderResponse& answer) {
    EXPECT_FALSE(answer.threw);
    if (answer.status.ok()) {
        EXPECT_FALSE(answer.hasMessage) << answer.status.message;
    } else {
        EXPECT_THAT(answer.status.message, Not(IsEmpty()));
        EXPECT_THAT(answer.events, IsEmpty());
    }
}

TEST_P(OperationTest, ThroughTheGateEveryOperationIsAnsweredAsTheStandardPromises) {
    for (const Row& row : rowsOf(GetParam())) {
        SCOPED_TRACE(row.name);
        const cimhost::Response response = ask(row, Served::byGate);
        EXPECT_EQ(got, row.gate);
        EXPECT_THAT(response.providers, Not(IsEmpty()));
        for (const ProviderResponse& answer : response.providers) {
            expectStandardForm(answer);
        }
    }
}

TEST_P(OperationTest, TheProviderItselfAnswersAsItAlwaysDid) {
    for (const Row& row : rowsOf(GetParam())) {
        SCOPED_TRACE(row.name);
        const cimhost::Response response = ask(row, Served::byProvider);
        EXPECT_EQ(got, row.bare.under(GetParam()));
        for (const ProviderResponse& answer : response.providers) {
            EXPECT_FALSE(answer.threw);
            EXPECT_FALSE(answer.hasMessage) << answer.status.message;
        }
    }
}

/** Creates two leases under a manager whose paths have empty keys. @return the identifiers after the next start */
std::vector<std::string> afterEmptyKeys(Served served) {
    agentEnvironment::clear();
    writeRecords({"A"});
    {
        ManagedGate gate(Manager::openPegasusEmptyKey, served);
        gate.create("B", {});
        gate.create("C", {named("Lessor", text("ACME"))});
        gate.modify(keyedPath(lease, "A"), {named("LeaseTerm", uint32(3))});
    }
    return ManagedGate(Manager::standard, served).identifiers(lease);
}

TEST(EmptyKeyTest, ThroughTheGateTheKeyIsThatOfTheInstance) {
    EXPECT_THAT(afterEmptyKeys(Served::byGate), testing::ElementsAre("A", "B", "C"));
    agentEnvironment::clear();
}

TEST(EmptyKeyTest, WithoutItAnEmptyIdentifierShiftsTheRecordsThatFollow) {
    const auto identifiers = afterEmptyKeys(Served::byProvider);
    EXPECT_THAT(identifiers, testing::Not(testing::Contains("B")));
    EXPECT_THAT(identifiers, testing::Contains("*")) << "a line of the empty record's values is taken for its key";
    agentEnvironment::clear();
}

INSTANTIATE_TEST_SUITE_P(Managers, OperationTest, testing::ValuesIn(cimhost::lab::everyManager),
                         cimhost::lab::ManagerName());

}  // namespace
}  // namespace gatetest
