#include "GateFixture.h"

#include "broker/RequestScope.h"

#include <functional>

// Creations whose path the object manager does not take, after others had the turn while it was handed out.

namespace gatetest {
namespace {

using testing::ElementsAre;

/** A result that does something when it is handed a path, and then does not take it. */
class RefusingResult {
public:
    RefusingResult(const CMPIResult& real, std::function<void()> itsWork) : functions(*real.ft), result(real) {
        work = std::move(itsWork);
        functions.returnObjectPath = &returnObjectPath;
        result.ft = &functions;
    }
    RefusingResult(const RefusingResult&) = delete;
    RefusingResult& operator=(const RefusingResult&) = delete;

    const CMPIResult* handle() const { return &result; }

private:
    static CMPIStatus returnObjectPath(const CMPIResult*, const CMPIObjectPath*) {
        work();
        return {CMPI_RC_ERR_ACCESS_DENIED, nullptr};
    }

    static inline std::function<void()> work{};

    CMPIResultFT functions;
    CMPIResult result;
};

class UnansweredCreationTest : public GateTest {
protected:
    /** Creates a lease "L1" of the lessor "ACME". */
    Outcome createWhile(const std::function<void()>& meanwhile) {
        const ObjectPath path = keyedPath(lease, "L1");
        const Instance sent = testsupport::instance(path, {named("Lessor", text("ACME"))});
        return gate().call([&](cimhost::RequestScope& scope, const CMPIContext* context, const CMPIResult* result) {
            const RefusingResult refusing(*result, meanwhile);
            CMPIInstanceMI* mi = gate().instanceMI();
            return mi->ft->createInstance(mi, context, refusing.handle(), scope.objectPath(path), scope.instance(sent));
        });
    }

    std::string file() { return testsupport::readFile(dataFile("Lease.dat")); }
};

TEST_F(UnansweredCreationTest, IsTakenBack) {
    create("bystander");
    const std::string before = file();
    EXPECT_THAT(createWhile([] {}), isRefused(CMPI_RC_ERR_FAILED, "object manager"));
    EXPECT_THAT(identifiers(), ElementsAre("bystander"));
    EXPECT_EQ(file(), before);
}

TEST_F(UnansweredCreationTest, IsTakenBackAlsoAfterOthersWereDeletedMeanwhile) {
    create("bystander");
    create("L2");
    const auto deleteAnother = [&] {
        EXPECT_THAT(identifiers(), ElementsAre("bystander", "L2", "L1"));
        EXPECT_THAT(remove("L2"), isDone());
    };
    EXPECT_THAT(createWhile(deleteAnother), isRefused(CMPI_RC_ERR_FAILED, "object manager"));
    EXPECT_THAT(identifiers(), ElementsAre("bystander"));
}

TEST_F(UnansweredCreationTest, IsNotTakenBackWhereAnotherClientMadeTheRecordAnew) {
    const auto makeAnew = [&] {
        EXPECT_THAT(remove("L1"), isDone());
        EXPECT_THAT(create("L1", {named("Lessor", text("Another"))}), isAnswered(1));
    };
    EXPECT_THAT(createWhile(makeAnew), isRefused(CMPI_RC_ERR_FAILED, "object manager"));
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
    EXPECT_EQ(valueIn(got("L1"), "Lessor"), "Another");
}

TEST_F(UnansweredCreationTest, LeavesNothingWhereAnotherClientDeletedTheRecord) {
    create("bystander");
    const std::string before = file();
    EXPECT_THAT(createWhile([&] { EXPECT_THAT(remove("L1"), isDone()); }),
                isRefused(CMPI_RC_ERR_FAILED, "object manager"));
    EXPECT_THAT(identifiers(), ElementsAre("bystander"));
    EXPECT_EQ(file(), before);
}

}  // namespace
}  // namespace gatetest
