#include "ManagedGate.h"
#include "lab/emulation/ManagerEmulation.h"
#include "support/UnderTest.h"

// Creates, reads, changes and deletes instances under each emulated object manager.

namespace gatetest {
namespace {

using cimhost::Request;
using cimhost::lab::Manager;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::SizeIs;
using testing::UnorderedElementsAre;

class ManagerTest : public testing::TestWithParam<Manager> {
protected:
    ManagerTest() { agentEnvironment::clear(); }
    ~ManagerTest() override { agentEnvironment::clear(); }

    /** Expects the status code. Expects a message only for failures. */
    void expectStatus(const cimhost::Status& status, CMPIrc rc) {
        EXPECT_EQ(status.rc, rc) << status.message;
        EXPECT_EQ(status.message.empty(), rc == CMPI_RC_OK);
    }

    ManagedGate gate{GetParam()};
};

TEST_P(ManagerTest, LeasesAndWarrantiesAreCreatedReadChangedAndDeleted) {
    for (const auto& [of, property] : {std::pair(lease, "Lessor"), std::pair(warranty, "Warrantor")}) {
        expectStatus(gate.create("A1", {named(property, text("ACME"))}, of), CMPI_RC_OK);
        expectStatus(gate.create("A2", {}, of), CMPI_RC_OK);
        expectStatus(gate.create("A1", {}, of), CMPI_RC_ERR_ALREADY_EXISTS);
        EXPECT_THAT(gate.identifiers(of), ElementsAre("A1", "A2"));
        const ObjectPath path = keyedPath(of, "A1");
        EXPECT_EQ(valueIn(gate.instanceOf(path), property), "ACME");
        expectStatus(gate.modify(path, {named(property, text("Other"))}), CMPI_RC_OK);
        EXPECT_EQ(valueIn(gate.instanceOf(path), property), "Other");
        expectStatus(gate.modify(path, gate.instanceOf(path).properties), CMPI_RC_OK);
        expectStatus(gate.modify(path, {named("ElementName", text("x"))}), CMPI_RC_ERR_INVALID_PARAMETER);
        expectStatus(gate.remove("A1", of), CMPI_RC_OK);
        EXPECT_THAT(gate.identifiers(of), ElementsAre("A2"));
        EXPECT_THAT(gate.manager().perform(Request::enumerateInstances(classPath(of))).instances, SizeIs(1));
        expectStatus(gate.remove("A1", of), CMPI_RC_ERR_NOT_FOUND);
        expectStatus(gate.modify(path, {named(property, text("x"))}), CMPI_RC_ERR_NOT_FOUND);
        expectStatus(gate.ask({cimhost::Operation::getInstance, path}), CMPI_RC_ERR_NOT_FOUND);
    }
}

TEST_P(ManagerTest, StaysLoadedWhileIdle) {
    expectStatus(gate.create("A1", {named("Lessor", text("ACME"))}), CMPI_RC_OK);
    testsupport::writeFile(agentEnvironment::dataDirectory() / "Lease.dat", "");
    gate.manager().idle();
    EXPECT_TRUE(isLoaded(testsupport::underTest(GATE_LIBRARY)));
    EXPECT_THAT(gate.identifiers(lease), ElementsAre("A1")) << "the library does not read the file again";
}

TEST_P(ManagerTest, ARecordWithoutIdentifierIsNotCreated) {
    const ObjectPath path = classPath(lease);
    expectStatus(gate.ask({cimhost::Operation::createInstance, path, {}, {path, {}}}), CMPI_RC_ERR_INVALID_PARAMETER);
    expectStatus(gate.create("", {}), CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_THAT(gate.identifiers(lease), IsEmpty());
}

TEST_P(ManagerTest, TheAgentIsReadAndCannotBeChanged) {
    const auto paths = gate.paths(agent);
    ASSERT_THAT(paths, SizeIs(1));
    EXPECT_EQ(valueIn(gate.instanceOf(paths.front()), "Version"), "4.2.0");
    EXPECT_THAT(gate.manager().perform(Request::enumerateInstances(classPath(agent))).instances, SizeIs(1));
    expectStatus(gate.modify(paths.front(), {}), CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST_P(ManagerTest, AssetDataAreReadAndChanged) {
    const auto paths = gate.paths(asset);
    ASSERT_THAT(paths, SizeIs(2)) << "one per computer";
    expectStatus(gate.modify(paths.front(), {named("PersonalizedData2", text("second"))}), CMPI_RC_OK);
    std::vector<NamedValue> sent = gate.instanceOf(paths.front()).properties;
    for (NamedValue& property : sent) {
        property = property.name == "AssetNumber" ? named("AssetNumber", text("A 1")) : property;
    }
    expectStatus(gate.modify(paths.front(), sent), CMPI_RC_OK);
    const Instance changed = gate.instanceOf(paths.front());
    EXPECT_EQ(valueIn(changed, "AssetNumber"), "A 1");
    EXPECT_EQ(valueIn(changed, "PersonalizedData2"), "second");
    EXPECT_EQ(valueIn(changed, "PersonalizedData3"), "Null");
}

TEST_P(ManagerTest, AssociationsAgreeInBothDirections) {
    expectStatus(gate.create(firstNode, {}), CMPI_RC_OK);
    expectStatus(gate.create(secondNode, {}), CMPI_RC_OK);
    expectStatus(gate.create(secondNode, {}, warranty), CMPI_RC_OK);
    const auto leases = gate.paths(leaseSetting);
    ASSERT_THAT(leases, SizeIs(2));
    EXPECT_THAT(gate.paths(warrantySetting), SizeIs(1));
    EXPECT_THAT(gate.manager().perform(Request::enumerateInstances(classPath(leaseSetting))).instances, SizeIs(2));
    EXPECT_THAT(gate.instanceOf(leases.front()).properties, SizeIs(2));
    const cimhost::AssociationFilter byLease{leaseSetting, {}, {}, {}};
    const cimhost::AssociationFilter resultLease{{}, leaseSetting, {}, {}};
    const ObjectPath beta = computerPath("beta");
    EXPECT_THAT(identifiersOf(gate.manager().perform(Request::associatorNames(beta, byLease)).paths),
                ElementsAre(secondNode));
    EXPECT_THAT(gate.manager().perform(Request::associators(beta, byLease)).instances, SizeIs(1));
    EXPECT_THAT(gate.manager().perform(Request::references(beta, resultLease)).instances, SizeIs(1));
    EXPECT_THAT(gate.manager().perform(Request::referenceNames(beta, resultLease)).paths, SizeIs(1));
    const ObjectPath element = keyedPath(lease, secondNode);
    EXPECT_THAT(formattedPaths(gate.manager().perform(Request::associatorNames(element, byLease)).paths),
                ElementsAre("root/cimv2:VELKO_ComputerSystem.Name=\"beta\""));
    EXPECT_THAT(gate.manager().perform(Request::associators(element, byLease)).instances, SizeIs(1));
    EXPECT_THAT(gate.manager().perform(Request::references(element, resultLease)).instances, SizeIs(1));
    EXPECT_THAT(gate.manager().perform(Request::referenceNames(element, resultLease)).paths, SizeIs(1));
}

TEST_P(ManagerTest, LossyValuesAreRefused) {
    expectStatus(gate.create("A_1", {}), CMPI_RC_ERR_INVALID_PARAMETER);
    const auto status = gate.create("A1", {named("Lessor", text("ACME_Leasing"))});
    expectStatus(status, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_THAT(status.message, HasSubstr("Lessor"));
    EXPECT_THAT(gate.identifiers(lease), IsEmpty());
}

INSTANTIATE_TEST_SUITE_P(Gate, ManagerTest, testing::ValuesIn(cimhost::lab::everyManager), cimhost::lab::ManagerName());

}  // namespace
}  // namespace gatetest
