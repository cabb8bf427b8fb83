#include "ProviderFixture.h"

// The two factories and their results.

namespace contract {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

constexpr CMPIrc untouchedCode = static_cast<CMPIrc>(77);

class FactoryTest : public ProviderTest {
protected:
    CMPIInstanceMI* makeInstanceMI(CMPIStatus* status = nullptr) {
        return provider().createInstanceMI(broker.handle(), status);
    }
    CMPIAssociationMI* makeAssociationMI(CMPIStatus* status = nullptr) {
        return provider().createAssociationMI(broker.handle(), status);
    }
};

TEST_F(FactoryTest, TheInstanceInterfaceHasItsNameAndVersion200) {
    const CMPIInstanceMI* interface = makeInstanceMI();
    ASSERT_NE(interface, nullptr);
    EXPECT_EQ(interface->hdl, nullptr);
    ASSERT_NE(interface->ft, nullptr);
    EXPECT_EQ(interface->ft->ftVersion, 200);
    EXPECT_EQ(interface->ft->miVersion, 200);
    EXPECT_STREQ(interface->ft->miName, "instanceLeaseAndWarrantyProvider");
    EXPECT_NE(interface->ft->cleanup, nullptr);
    EXPECT_NE(interface->ft->enumerateInstanceNames, nullptr);
    EXPECT_NE(interface->ft->enumerateInstances, nullptr);
    EXPECT_NE(interface->ft->getInstance, nullptr);
    EXPECT_NE(interface->ft->createInstance, nullptr);
    EXPECT_NE(interface->ft->modifyInstance, nullptr);
    EXPECT_NE(interface->ft->deleteInstance, nullptr);
    EXPECT_NE(interface->ft->execQuery, nullptr);
}

TEST_F(FactoryTest, TheAssociationInterfaceHasItsNameAndVersion200) {
    const CMPIAssociationMI* interface = makeAssociationMI();
    ASSERT_NE(interface, nullptr);
    EXPECT_EQ(interface->hdl, nullptr);
    ASSERT_NE(interface->ft, nullptr);
    EXPECT_EQ(interface->ft->ftVersion, 200);
    EXPECT_EQ(interface->ft->miVersion, 200);
    EXPECT_STREQ(interface->ft->miName, "associationLeaseAndWarrantyProvider");
    EXPECT_NE(interface->ft->cleanup, nullptr);
    EXPECT_NE(interface->ft->associators, nullptr);
    EXPECT_NE(interface->ft->associatorNames, nullptr);
    EXPECT_NE(interface->ft->references, nullptr);
    EXPECT_NE(interface->ft->referenceNames, nullptr);
}

TEST_F(FactoryTest, FactoriesWriteNoStatusCallNothingAndLogNothing) {
    provider();
    agentEnvironment::forgetLog();
    CMPIString* untouchedText = broker.string("untouched");
    CMPIStatus status{untouchedCode, untouchedText};
    EXPECT_NE(makeInstanceMI(&status), nullptr);
    EXPECT_NE(makeAssociationMI(&status), nullptr);
    EXPECT_EQ(status.rc, untouchedCode);
    EXPECT_EQ(status.msg, untouchedText);
    EXPECT_THAT(broker.calls(), IsEmpty());
    EXPECT_THAT(agentEnvironment::log(), IsEmpty());
}

TEST_F(FactoryTest, FactoriesReturnTheSameInterfaceBeforeAndAfterRequests) {
    CMPIInstanceMI* instances = makeInstanceMI();
    CMPIAssociationMI* associations = makeAssociationMI();
    EXPECT_THAT(provider().enumerateInstances(classPath("VELKO_Lease")), isOk(1));
    EXPECT_THAT(provider().cleanupInstanceMI(true), isOk(0));
    EXPECT_EQ(makeInstanceMI(), instances);
    EXPECT_EQ(makeAssociationMI(), associations);
    EXPECT_EQ(makeInstanceMI(), instances);
    EXPECT_THAT(provider().enumerateInstances(classPath("VELKO_Lease")), isOk(1));
}

TEST_F(FactoryTest, RequestsWorkAfterCleanup) {
    EXPECT_THAT(provider().cleanupInstanceMI(false), isOk(0));
    EXPECT_THAT(provider().cleanupAssociationMI(false), isOk(0));
    const ObjectPath path = keyedPath("VELKO_Lease", "A");
    EXPECT_THAT(provider().createInstance(path, clientInstance(path, {})).instances(), SizeIs(1));
    EXPECT_THAT(provider().cleanupInstanceMI(true), isOk(0));
    EXPECT_THAT(provider().enumerateInstanceNames(classPath("VELKO_Lease")).paths(), SizeIs(1));
}

/** Two brokers that count the objects they create for a request. */
class TwoBrokersTest : public FactoryTest {
protected:
    TwoBrokersTest() { writeData("Lease.dat", "1\nA\n*\n00000000000000.000000-000\n0\n0\n0\n0\n0\n*\n*\n*\n*\n0\n"); }

    /** Returns the number of object paths that each broker created for an enumeration of names. */
    std::vector<int> createdPaths() {
        broker.forget();
        other.forget();
        EXPECT_THAT(provider().enumerateInstanceNames(classPath("VELKO_Lease")).paths(), SizeIs(1));
        return {broker.count(newObjectPath), other.count(newObjectPath)};
    }

    static constexpr const char* newObjectPath = "CMPIBrokerEncFT.newObjectPath";
    testsupport::RecordingBroker other;
};

TEST_F(TwoBrokersTest, TheBrokerOfTheLaterFactoryCallServesAllRequests) {
    provider().createInstanceMI(broker.handle(), nullptr);
    EXPECT_THAT(createdPaths(), ElementsAre(1, 0));
    provider().createAssociationMI(other.handle(), nullptr);
    EXPECT_THAT(createdPaths(), ElementsAre(0, 1)) << "both interfaces use the same broker";
    provider().createInstanceMI(broker.handle(), nullptr);
    EXPECT_THAT(createdPaths(), ElementsAre(1, 0));
    provider().createInstanceMI(other.handle(), nullptr);
    EXPECT_THAT(createdPaths(), ElementsAre(0, 1));
}

TEST_F(TwoBrokersTest, AssociationRequestsUseTheBrokerOfTheLaterFactoryCallToo) {
    provider().createAssociationMI(broker.handle(), nullptr);
    provider().createInstanceMI(other.handle(), nullptr);
    const cimhost::AssociationFilter filter{"VELKO_LeaseSetting", {}, {}, {}};
    EXPECT_THAT(provider().associatorNames(testsupport::objectPath(nameSpace, "VELKO_ComputerSystem"), filter).paths(),
                SizeIs(1));
    EXPECT_EQ(broker.count(newObjectPath), 0);
    EXPECT_GT(other.count(newObjectPath), 0);
}

TEST_F(TwoBrokersTest, CleanupKeepsTheBroker) {
    provider().createInstanceMI(broker.handle(), nullptr);
    provider().cleanupInstanceMI(true);
    EXPECT_THAT(createdPaths(), ElementsAre(1, 0));
}

TEST_F(FactoryTest, ANullBrokerIsAcceptedAndRequestsReturnNoObjects) {
    writeData("Lease.dat", "1\nA\n*\n00000000000000.000000-000\n0\n0\n0\n0\n0\n*\n*\n*\n*\n0\n");
    EXPECT_NE(provider().createInstanceMI(nullptr, nullptr), nullptr);
    const Outcome outcome = provider().enumerateInstances(classPath("VELKO_Lease"));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(outcome.instances(), IsEmpty());
}

}  // namespace
}  // namespace contract
