#include "GateFixture.h"
#include "broker/RequestScope.h"

// Creations whose path the object manager does not accept.

namespace gatetest {
namespace {

using testing::ElementsAre;

CMPIStatus refuse(const CMPIResult*, const CMPIObjectPath*) {
    return {CMPI_RC_ERR_ACCESS_DENIED, nullptr};
}

class UnansweredCreationTest : public GateTest {
protected:
    /** Creates a lease "L1". The result refuses the path of the lease. */
    Outcome createUnanswered() {
        const ObjectPath path = keyedPath(lease, "L1");
        const Instance sent = testsupport::instance(path, {named("Lessor", text("ACME"))});
        return gate().call([&](cimhost::RequestScope& scope, const CMPIContext* context, const CMPIResult* result) {
            CMPIResultFT functions = *result->ft;
            functions.returnObjectPath = &refuse;
            const CMPIResult refusing{result->hdl, &functions};
            CMPIInstanceMI* mi = gate().instanceMI();
            return mi->ft->createInstance(mi, context, &refusing, scope.objectPath(path), scope.instance(sent));
        });
    }

    std::string file() { return testsupport::readFile(dataFile("Lease.dat")); }
};

TEST_F(UnansweredCreationTest, IsRolledBack) {
    create("bystander");
    const std::string before = file();
    EXPECT_THAT(createUnanswered(), isRefused(CMPI_RC_ERR_FAILED, "object manager could not accept the results"));
    EXPECT_THAT(identifiers(), ElementsAre("bystander"));
    EXPECT_EQ(file(), before);
}

TEST_F(UnansweredCreationTest, LeavesTheIdentifierFree) {
    EXPECT_THAT(createUnanswered(), isRefused(CMPI_RC_ERR_FAILED, "object manager"));
    EXPECT_THAT(create("L1", {named("Lessor", text("Another"))}), isAnswered(1));
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "Another");
}

}  // namespace
}  // namespace gatetest
