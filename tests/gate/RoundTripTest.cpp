#include <condition_variable>
#include <mutex>
#include <thread>

#include "ManagedGate.h"
#include "lab/emulation/ManagerEmulation.h"
#include "support/Files.h"

// Instances that clients read, change and send back, under object managers that alter values.

namespace gatetest {
namespace {

using cimhost::Request;
using cimhost::lab::Manager;
using testing::UnorderedElementsAre;

class RoundTripTest : public testing::TestWithParam<Manager> {
protected:
    RoundTripTest() {
        agentEnvironment::clear();
        testsupport::writeFile(
            agentEnvironment::dataDirectory() / "Lease.dat",
            "1\nL1\nBail_Ren\xc3\xa9\n20260101000000.000000-000\n0\n0\n0\n0\n0\nACME_\n*\n*\n*\n0\n");
        testsupport::writeFile(agentEnvironment::dataDirectory() / "asset.dat",
                               "USER.AssetIdTag=TAG-7 \xc3\xa9\nUSER.Name=Jo \nUSER.PersonalizedLabel2=Room \n");
    }
    ~RoundTripTest() override { agentEnvironment::clear(); }

    /** Sends all read properties back with one of them changed, like clients that do not send a property list. */
    void change(const ObjectPath& path, const NamedValue& changed) {
        const Instance before = gate.instanceOf(path);
        std::vector<NamedValue> sent = before.properties;
        for (NamedValue& property : sent) {
            property = property.name == changed.name ? changed : property;
        }
        const cimhost::Status status = gate.modify(path, sent);
        EXPECT_EQ(status.rc, CMPI_RC_OK) << status.message;
        const Instance after = gate.instanceOf(path);
        EXPECT_EQ(valueIn(after, changed.name), valueIn(testsupport::instance(path, {changed}), changed.name));
        for (const NamedValue& property : before.properties) {
            if (property.name != changed.name && property.name != "LocalDateTime") {
                EXPECT_EQ(valueIn(after, property.name), valueIn(before, property.name)) << property.name;
            }
        }
    }

    ManagedGate gate{GetParam()};
};

TEST_P(RoundTripTest, OfALeaseChangesOnlyTheChangedProperty) {
    change(keyedPath(lease, "L1"), named("LeaseTerm", uint32(3)));
    change(keyedPath(lease, "L1"), named("TerminationValue", text("12 EUR")));
}

TEST_P(RoundTripTest, OfAssetDataChangesOnlyTheChangedProperty) {
    const ObjectPath path = gate.paths(asset).front();
    change(path, named("AssetNumber", text("A 1")));
    change(path, named("PersonalizedData4", text("12")));
}

TEST_P(RoundTripTest, AppliesPropertyListsToReadingAndChanging) {
    const ObjectPath path = keyedPath(lease, "L1");
    const auto received = gate.manager().perform(Request::getInstance(path, {{"lessor"}}));
    ASSERT_TRUE(received.ok()) << received.status.message;
    EXPECT_THAT(testsupport::namesOf(received.instance().properties), UnorderedElementsAre("InstanceID", "Lessor"));
    const auto listed = gate.manager().perform(Request::enumerateInstances(classPath(lease), {{"LeaseTerm"}}));
    ASSERT_EQ(listed.instances.size(), 1U) << listed.status.message;
    EXPECT_THAT(testsupport::namesOf(listed.instance().properties), UnorderedElementsAre("InstanceID", "LeaseTerm"));
    const Instance sent =
        testsupport::instance(path, {named("LeaseTerm", uint32(9)), named("FairMarketValue", text("not listed"))});
    EXPECT_TRUE(gate.manager().perform(Request::modifyInstance(path, sent, {{"LeaseTerm"}})).ok());
    EXPECT_EQ(valueIn(gate.instanceOf(path), "LeaseTerm"), "9");
    EXPECT_EQ(valueIn(gate.instanceOf(path), "FairMarketValue"), "");
}

INSTANTIATE_TEST_SUITE_P(Gate, RoundTripTest, testing::ValuesIn(cimhost::lab::everyManager),
                         cimhost::lab::ManagerName());

/** A result that blocks when it receives the first instance, as for a client that reads slowly. */
class SlowReader {
public:
    explicit SlowReader(const CMPIResult& itsReal) : real(itsReal), functions(*real.ft), result(real) {
        functions.returnInstance = &returnInstance;
        result.ft = &functions;
        current = this;
    }
    SlowReader(const SlowReader&) = delete;
    SlowReader& operator=(const SlowReader&) = delete;

    const CMPIResult* handle() const { return &result; }

    static void awaitFirst() {
        std::unique_lock<std::mutex> lock(mutex);
        changed.wait(lock, [] { return hasFirst; });
    }

    static void resume() {
        const std::lock_guard<std::mutex> lock(mutex);
        isReading = true;
        changed.notify_all();
    }

private:
    static CMPIStatus returnInstance(const CMPIResult*, const CMPIInstance* instance) {
        {
            std::unique_lock<std::mutex> lock(mutex);
            hasFirst = true;
            changed.notify_all();
            changed.wait(lock, [] { return isReading; });
        }
        return current->real.ft->returnInstance(&current->real, instance);
    }

    static inline SlowReader* current = nullptr;
    static inline std::mutex mutex{};
    static inline std::condition_variable changed{};
    static inline bool hasFirst = false;
    static inline bool isReading = false;

    const CMPIResult& real;
    CMPIResultFT functions;
    CMPIResult result;
};

class SlowReaderTest : public GateTest {};

TEST_F(SlowReaderTest, DoesNotBlockOtherRequests) {
    create("L1");
    create("L2");
    std::thread slow([&] {
        const Outcome outcome =
            gate().call([&](cimhost::RequestScope& scope, const CMPIContext* context, const CMPIResult* result) {
                const SlowReader reader(*result);
                CMPIInstanceMI* mi = gate().instanceMI();
                return mi->ft->enumerateInstances(mi, context, reader.handle(), scope.objectPath(classPath(lease)),
                                                  nullptr);
            });
        EXPECT_THAT(outcome, isAnswered(2));
    });
    SlowReader::awaitFirst();
    EXPECT_THAT(modify("L1", {named("LeaseTerm", uint32(3))}), isDone());
    EXPECT_THAT(remove("L2"), isDone());
    EXPECT_THAT(identifiers(), testing::ElementsAre("L1"));
    SlowReader::resume();
    slow.join();
}

}  // namespace
}  // namespace gatetest
