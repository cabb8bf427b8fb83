#include "Formatting.h"
#include "ManagedGate.h"
#include "OperationRows.h"
#include "lab/emulation/ManagerEmulation.h"

// Every operation of every class under every object manager, through the gate and with the bare provider.

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

    /** Sends the request to a newly loaded library with the same initial files. */
    cimhost::Response ask(const Row& row, Served served) {
        agentEnvironment::clear();
        writeRecords(recordsOfRows());
        const DataFiles before;
        ManagedGate gate(GetParam(), served);
        cimhost::Response response = gate.manager().perform(row.request);
        received = formatted(response) + before.changes();
        return response;
    }

    std::string received;  ///< response to the client and changes to the files
    SilentLog silence;
};

/**
 * Returns the rows for a manager: all rows, or a share of them such that each row is tested with at least one manager.
 */
std::vector<Row> rowsOf(Manager manager) {
    const std::vector<Row> all = operationRows();
    std::vector<Row> rows;
    for (auto index = static_cast<std::size_t>(manager) % SHARES; index < all.size(); index += SHARES) {
        rows.push_back(all[index]);
    }
    return rows;
}

/** Expects that a failure has a message and no results, and that a success has no message. */
void expectStandardForm(const ProviderResponse& answer) {
    EXPECT_FALSE(answer.threw);
    if (answer.status.ok()) {
        EXPECT_FALSE(answer.hasMessage) << answer.status.message;
    } else {
        EXPECT_THAT(answer.status.message, Not(IsEmpty()));
        EXPECT_THAT(answer.events, IsEmpty());
    }
}

TEST_P(OperationTest, TheGateReturnsTheExpectedResponsesUnderEveryManager) {
    for (const Row& row : rowsOf(GetParam())) {
        SCOPED_TRACE(row.name);
        const cimhost::Response response = ask(row, Served::byGate);
        EXPECT_EQ(received, row.gate);
        EXPECT_THAT(response.providers, Not(IsEmpty()));
        for (const ProviderResponse& answer : response.providers) {
            expectStandardForm(answer);
        }
    }
}

TEST_P(OperationTest, TheBareProviderReturnsTheExpectedResponsesOfEachManager) {
    for (const Row& row : rowsOf(GetParam())) {
        SCOPED_TRACE(row.name);
        const cimhost::Response response = ask(row, Served::byProvider);
        EXPECT_EQ(received, row.bare.under(GetParam()));
        for (const ProviderResponse& answer : response.providers) {
            EXPECT_FALSE(answer.threw);
            EXPECT_FALSE(answer.hasMessage) << answer.status.message;
        }
    }
}

/** Creates two leases under a manager that passes empty keys in paths. @return the identifiers after a restart */
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

TEST(EmptyKeyTest, TheGateTakesTheKeyFromTheInstance) {
    EXPECT_THAT(afterEmptyKeys(Served::byGate), testing::ElementsAre("A", "B", "C"));
    agentEnvironment::clear();
}

TEST(EmptyKeyTest, WithoutTheGateAnEmptyIdentifierShiftsTheFollowingRecords) {
    const auto identifiers = afterEmptyKeys(Served::byProvider);
    EXPECT_THAT(identifiers, testing::Not(testing::Contains("B")));
    EXPECT_THAT(identifiers, testing::Contains("*")) << "a value of the empty record is read as its key";
    agentEnvironment::clear();
}

INSTANTIATE_TEST_SUITE_P(Managers, OperationTest, testing::ValuesIn(cimhost::lab::everyManager),
                         cimhost::lab::ManagerName());

}  // namespace
}  // namespace gatetest
