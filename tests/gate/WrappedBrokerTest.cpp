#include <gtest/gtest.h>

#include <utility>

#include "gate/cmpi/WrappedBroker.h"

// Forwarding to the object manager's broker.

namespace gatetest {
namespace {

using gate::WrappedBroker;

bool isHeld = true;
const WrappedBroker::Lock lock{[] { isHeld = false; }, [] { isHeld = true; }};

/** An object manager's broker, which has further members after the CMPI structure. */
struct Manager : CMPIBroker {
    int calls = 0;
};

/**
 * Counts the calls that the manager's broker receives. Checks that the lock is released for a service and held for a
 * constructor. Returns zero.
 */
template <auto slot, bool isService>
struct Counting;

template <class Table, class Result, class... Arguments, Result (*Table::*slot)(const CMPIBroker*, Arguments...),
          bool isService>
struct Counting<slot, isService> {
    static Result call(const CMPIBroker* broker, Arguments...) {
        ++static_cast<Manager*>(const_cast<CMPIBroker*>(broker))->calls;
        EXPECT_EQ(isHeld, !isService);
        return Result();
    }

    static Result callWrapped(const Table& table, const CMPIBroker* broker) {
        return (table.*slot)(broker, Arguments()...);
    }
};

/** Fills a manager's slots, calls each through the wrapper, and expects that the manager receives the call. */
template <bool isService, auto... slots, class Table>
void expectForwarded(Table& managers, Manager& manager, Table* CMPIBroker::*table) {
    manager.*table = &managers;
    ((managers.*slots = &Counting<slots, isService>::call), ...);
    const WrappedBroker wrapped(&manager, lock);
    const Table& tables = *(wrapped.handle()->*table);
    (Counting<slots, isService>::callWrapped(tables, wrapped.handle()), ...);
    EXPECT_EQ(manager.calls, static_cast<int>(sizeof...(slots)));
    EXPECT_TRUE(isHeld);
    manager.calls = 0;
}

/** Expects that slots of the wrapper are null if the manager's slots are null. */
template <auto... slots, class Table>
void expectMissing(Table* CMPIBroker::*table, Table& empty) {
    Manager manager{};
    manager.*table = &empty;
    const WrappedBroker wrapped(&manager, lock);
    const Table& tables = *(wrapped.handle()->*table);
    EXPECT_TRUE(((tables.*slots == nullptr) && ...));
}

TEST(WrappedBrokerTest, EveryServiceIsForwardedWithTheLockReleased) {
    Manager manager{};
    CMPIBrokerFT services{};
    using T = CMPIBrokerFT;
    expectForwarded<true, &T::prepareAttachThread, &T::attachThread, &T::detachThread, &T::deliverIndication,
                    &T::enumerateInstanceNames, &T::getInstance, &T::createInstance, &T::modifyInstance,
                    &T::deleteInstance, &T::execQuery, &T::enumerateInstances, &T::associators, &T::associatorNames,
                    &T::references, &T::referenceNames, &T::invokeMethod, &T::setProperty, &T::getProperty>(
        services, manager, &CMPIBroker::bft);
}

TEST(WrappedBrokerTest, EveryConstructorIsForwarded) {
    Manager manager{};
    CMPIBrokerEncFT makers{};
    using T = CMPIBrokerEncFT;
    expectForwarded<false, &T::newInstance, &T::newObjectPath, &T::newArgs, &T::newString, &T::newArray,
                    &T::newDateTime, &T::newDateTimeFromBinary, &T::newDateTimeFromChars, &T::newSelectExp,
                    &T::classPathIsA, &T::toString, &T::isOfType, &T::getType, &T::logMessage, &T::trace,
                    &T::newCMPIError, &T::openMessageFile, &T::closeMessageFile>(makers, manager, &CMPIBroker::eft);
}

TEST(WrappedBrokerTest, EveryMemoryFunctionIsForwarded) {
    Manager manager{};
    CMPIBrokerMemFT memory{};
    using T = CMPIBrokerMemFT;
    expectForwarded<false, &T::mark, &T::release, &T::cmpiMalloc, &T::cmpiCalloc, &T::cmpiRealloc, &T::cmpiStrDup,
                    &T::cmpiFree, &T::freeInstance, &T::freeObjectPath, &T::freeArgs, &T::freeString, &T::freeArray,
                    &T::freeDateTime, &T::freeSelectExp>(memory, manager, &CMPIBroker::mft);
}

TEST(WrappedBrokerTest, FunctionsThatTheManagerLacksAreNull) {
    CMPIBrokerFT services{};
    expectMissing<&CMPIBrokerFT::enumerateInstances, &CMPIBrokerFT::getProperty>(&CMPIBroker::bft, services);
    CMPIBrokerEncFT makers{};
    expectMissing<&CMPIBrokerEncFT::newCMPIError, &CMPIBrokerEncFT::getMessage, &CMPIBrokerEncFT::newString>(
        &CMPIBroker::eft, makers);
    CMPIBrokerMemFT memory{};
    expectMissing<&CMPIBrokerMemFT::cmpiMalloc, &CMPIBrokerMemFT::mark>(&CMPIBroker::mft, memory);
    Manager bare{};
    EXPECT_EQ(WrappedBroker(&bare, lock).handle()->mft, nullptr);
}

TEST(WrappedBrokerTest, VersionsNameAndThreadTableAreTheManagers) {
    Manager manager{};
    CMPIBrokerFT services{};
    services.brokerCapabilities = 5;
    services.brokerVersion = 0;
    services.brokerName = "some manager";
    CMPIBrokerEncFT makers{};
    makers.ftVersion = 1;
    CMPIBrokerExtFT threads{};
    manager.bft = &services;
    manager.eft = &makers;
    manager.xft = &threads;
    const WrappedBroker wrapped(&manager, lock);
    EXPECT_EQ(wrapped.handle()->bft->brokerCapabilities, 5U);
    EXPECT_EQ(wrapped.handle()->bft->brokerVersion, 0U);
    EXPECT_STREQ(wrapped.handle()->bft->brokerName, "some manager");
    EXPECT_EQ(wrapped.handle()->eft->ftVersion, 1);
    EXPECT_EQ(wrapped.handle()->xft, &threads);
}

TEST(WrappedBrokerTest, RecordsThatTheManagerCouldNotCreateAPath) {
    Manager manager{};
    CMPIBrokerEncFT makers{};
    makers.newObjectPath = &Counting<&CMPIBrokerEncFT::newObjectPath, false>::call;
    makers.newDateTimeFromChars = &Counting<&CMPIBrokerEncFT::newDateTimeFromChars, false>::call;
    manager.eft = &makers;
    WrappedBroker wrapped(&manager, lock);
    const CMPIBroker* broker = wrapped.handle();
    EXPECT_EQ(broker->eft->newDateTimeFromChars(broker, "no date", nullptr), nullptr);
    EXPECT_FALSE(wrapped.hasFailed) << "a string that is not a datetime is not a failure";
    EXPECT_EQ(broker->eft->newObjectPath(broker, "root", "C", nullptr), nullptr);
    EXPECT_TRUE(wrapped.hasFailed);
}

}  // namespace
}  // namespace gatetest
