#include <cmpift.h>

#include <functional>

#include "AssetFixture.h"

// Checks that the provider holds no lock while it calls the object manager, since such a call can lead to another
// request that needs the asset file.

namespace contract {
namespace {

using testing::SizeIs;
using testsupport::named;
using testsupport::text;

/** Functions of the object manager that run an action first. Only one instance may exist at a time. */
class Interruption {
public:
    Interruption(const CMPIBroker& original, std::function<void()> itsBody)
        : body(std::move(itsBody)), brokerHandle(original), factories(*original.eft), originalFactories(original.eft) {
        factories.newObjectPath = &newObjectPath;
        factories.newInstance = &newInstance;
        brokerHandle.eft = &factories;
        active = this;
    }
    ~Interruption() { active = nullptr; }
    Interruption(const Interruption&) = delete;
    Interruption& operator=(const Interruption&) = delete;

    /** Returns a broker whose functions that create paths and instances run the action. */
    const CMPIBroker* broker() const { return &brokerHandle; }

    /** Returns a result whose functions run the action. */
    const CMPIResult* result(const CMPIResult* original) {
        originalResult = original;
        resultTable = *original->ft;
        resultTable.returnInstance = &returnInstance;
        resultTable.returnObjectPath = &returnObjectPath;
        resultTable.returnDone = &returnDone;
        resultHandle = {nullptr, &resultTable};
        return &resultHandle;
    }

    int count = 0;

private:
    /** Runs the action unless it is already running, since the action calls the same functions. */
    void interrupt() {
        if (!isRunning) {
            isRunning = true;
            ++count;
            body();
            isRunning = false;
        }
    }

    static CMPIObjectPath* newObjectPath(const CMPIBroker* broker, const char* nameSpaceName, const char* className,
                                         CMPIStatus* rc) {
        active->interrupt();
        return active->originalFactories->newObjectPath(broker, nameSpaceName, className, rc);
    }
    static CMPIInstance* newInstance(const CMPIBroker* broker, const CMPIObjectPath* path, CMPIStatus* rc) {
        active->interrupt();
        return active->originalFactories->newInstance(broker, path, rc);
    }
    static CMPIStatus returnInstance(const CMPIResult*, const CMPIInstance* instance) {
        active->interrupt();
        return active->originalResult->ft->returnInstance(active->originalResult, instance);
    }
    static CMPIStatus returnObjectPath(const CMPIResult*, const CMPIObjectPath* path) {
        active->interrupt();
        return active->originalResult->ft->returnObjectPath(active->originalResult, path);
    }
    static CMPIStatus returnDone(const CMPIResult*) {
        active->interrupt();
        return active->originalResult->ft->returnDone(active->originalResult);
    }

    inline static Interruption* active = nullptr;
    std::function<void()> body;
    bool isRunning = false;
    CMPIBroker brokerHandle;
    CMPIBrokerEncFT factories;
    const CMPIBrokerEncFT* originalFactories;
    const CMPIResult* originalResult = nullptr;
    CMPIResultFT resultTable{};
    CMPIResult resultHandle{};
};

class AssetLockTest : public AssetTest {
protected:
    /**
     * Makes requests for the asset data, which fail if this thread holds the lock: the mutex detects recursive locking.
     */
    void readAndWrite() {
        const Outcome outcome = provider().enumerateInstances(path());
        EXPECT_THAT(outcome, isOk(1));
        ASSERT_THAT(outcome.instances(), SizeIs(1));
        EXPECT_EQ(shownProperty(outcome.instances()[0], "AssetNumber"), "\"A-1\"");
        const Instance changes = clientInstance(path(), {named("AssetNumber", text("A-1"))});
        EXPECT_THAT(provider().modifyInstance(path(), changes), isOk(0));
        EXPECT_THAT(loggedFailures(), testing::IsEmpty());
    }
};

TEST_F(AssetLockTest, ResultFunctionsCanMakeAnotherRequest) {
    writeData(assetFile, "USER.AssetNumber=A-1\n");
    Interruption interruption(*broker.handle(), [this] { readAndWrite(); });
    CMPIInstanceMI* interface = provider().instanceMI();
    for (const bool names : {false, true}) {
        const Outcome outcome =
            provider().call([&](cimhost::RequestScope& scope, const CMPIContext* context, const CMPIResult* result) {
                const CMPIResult* interrupted = interruption.result(result);
                const CMPIObjectPath* all = scope.objectPath(path());
                return names ? interface->ft->enumerateInstanceNames(interface, context, interrupted, all)
                             : interface->ft->enumerateInstances(interface, context, interrupted, all, nullptr);
            });
        EXPECT_THAT(outcome, isOk(1));
        EXPECT_THAT(outcome.events, SizeIs(2));
    }
    EXPECT_EQ(interruption.count, 4);
}

TEST_F(AssetLockTest, BrokerFunctionsCanMakeAnotherRequest) {
    writeData(assetFile, "USER.AssetNumber=A-1\n");
    Interruption interruption(*broker.handle(), [this] { readAndWrite(); });
    CMPIStatus status{CMPI_RC_OK, nullptr};
    provider().createInstanceMI(interruption.broker(), &status);
    const Outcome outcome = provider().enumerateInstances(path());
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(outcome.instances(), SizeIs(1));
    EXPECT_EQ(interruption.count, 2);
}

TEST_F(AssetLockTest, TheLockIsReleasedAfterEveryFailure) {
    blockData(assetFile);
    provider().enumerateInstances(path());
    provider().modifyInstance(path(), clientInstance(path(), {}));
    freeData(assetFile);
    writeData(assetFile, "USER.AssetNumber=A-1\n");
    readAndWrite();
}

}  // namespace
}  // namespace contract
