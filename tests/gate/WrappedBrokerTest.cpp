#include "WrappedBroker.h"

#include "Gate.h"

#include <gtest/gtest.h>

#include <utility>

// What goes on to the object manager's broker, and how.

namespace gatetest {
namespace {

using gate::WrappedBroker;

/** An object manager's broker, which is more than the structure that providers know. */
struct Manager : CMPIBroker {
    int calls = 0;
};

/** Counts a call that brought the manager's own pointer; an answer of zero. */
template <auto slot, bool isUpCall>
struct Counting;

template <class Table, class Result, class... Arguments, Result (*Table::*slot)(const CMPIBroker*, Arguments...),
          bool isUpCall>
struct Counting<slot, isUpCall> {
    static Result call(const CMPIBroker* broker, Arguments...) {
        ++static_cast<Manager*>(const_cast<CMPIBroker*>(broker))->calls;
        if (isUpCall) {
            const gate::Turn turn;  // not to be had but while the gate stands open
            const gate::Turn* const held = &turn;
            EXPECT_NE(held, nullptr);
        }
        return Result();
    }

    static Result callWrapped(const Table& table, const CMPIBroker* broker) {
        return (table.*slot)(broker, Arguments()...);
    }
};

/** Fills a manager's slots, calls each through the wrapper, and expects it to arrive. */
template <bool isUpCall, auto... slots, class Table>
void expectForwarded(Table& managers, Manager& manager, Table* CMPIBroker::*table) {
    manager.*table = &managers;
    ((managers.*slots = &Counting<slots, isUpCall>::call), ...);
    const WrappedBroker wrapped(&manager);
    const gate::Turn turn;
    const Table& tables = *(wrapped.handle()->*table);
    (Counting<slots, isUpCall>::callWrapped(tables, wrapped.handle()), ...);
    EXPECT_EQ(manager.calls, static_cast<int>(sizeof...(slots)));
    manager.calls = 0;
}

/** Expects each slot that the manager lacks to be lacking. */
template <auto... slots, class Table>
void expectMissing(Table* CMPIBroker::*table, Table& empty) {
    Manager manager{};
    manager.*table = &empty;
    const WrappedBroker wrapped(&manager);
    const Table& tables = *(wrapped.handle()->*table);
    EXPECT_TRUE(((tables.*slots == nullptr) && ...));
}

TEST(WrappedBrokerTest, EveryServiceGoesOnWithTheGateOpen) {
    Manager manager{};
    CMPIBrokerFT services{};
    using T = CMPIBrokerFT;
    expectForwarded<true, &T::prepareAttachThread, &T::attachThread, &T::detachThread, &T::deliverIndication,
                    &T::enumerateInstanceNames, &T::getInstance, &T::createInstance, &T::modifyInstance,
                    &T::deleteInstance, &T::execQuery, &T::enumerateInstances, &T::associators, &T::associatorNames,
                    &T::references, &T::referenceNames, &T::invokeMethod, &T::setProperty, &T::getProperty>(
        services, manager, &CMPIBroker::bft);
}

TEST(WrappedBrokerTest, EveryMakerGoesOn) {
    Manager manager{};
    CMPIBrokerEncFT makers{};
    using T = CMPIBrokerEncFT;
    expectForwarded<false, &T::newInstance, &T::newObjectPath, &T::newArgs, &T::newString, &T::newArray,
                    &T::newDateTime, &T::newDateTimeFromBinary, &T::newDateTimeFromChars, &T::newSelectExp,
                    &T::classPathIsA, &T::toString, &T::isOfType, &T::getType, &T::logMessage, &T::trace,
                    &T::newCMPIError, &T::openMessageFile, &T::closeMessageFile>(makers, manager, &CMPIBroker::eft);
}

TEST(WrappedBrokerTest, EveryMemoryFunctionGoesOn) {
    Manager manager{};
    CMPIBrokerMemFT memory{};
    using T = CMPIBrokerMemFT;
    expectForwarded<false, &T::mark, &T::release, &T::cmpiMalloc, &T::cmpiCalloc, &T::cmpiRealloc, &T::cmpiStrDup,
                    &T::cmpiFree, &T::freeInstance, &T::freeObjectPath, &T::freeArgs, &T::freeString, &T::freeArray,
                    &T::freeDateTime, &T::freeSelectExp>(memory, manager, &CMPIBroker::mft);
}

TEST(WrappedBrokerTest, WhatTheManagerLacksIsLackingHere) {
    CMPIBrokerFT services{};
    expectMissing<&CMPIBrokerFT::enumerateInstances, &CMPIBrokerFT::getProperty>(&CMPIBroker::bft, services);
    CMPIBrokerEncFT makers{};
    expectMissing<&CMPIBrokerEncFT::newCMPIError, &CMPIBrokerEncFT::getMessage, &CMPIBrokerEncFT::newString>(
        &CMPIBroker::eft, makers);
    CMPIBrokerMemFT memory{};
    expectMissing<&CMPIBrokerMemFT::cmpiMalloc, &CMPIBrokerMemFT::mark>(&CMPIBroker::mft, memory);
    Manager bare{};
    EXPECT_EQ(WrappedBroker(&bare).handle()->mft, nullptr);
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
    const WrappedBroker wrapped(&manager);
    EXPECT_EQ(wrapped.handle()->bft->brokerCapabilities, 5U);
    EXPECT_EQ(wrapped.handle()->bft->brokerVersion, 0U);
    EXPECT_STREQ(wrapped.handle()->bft->brokerName, "some manager");
    EXPECT_EQ(wrapped.handle()->eft->ftVersion, 1);
    EXPECT_EQ(wrapped.handle()->xft, &threads);
}

TEST(WrappedBrokerTest, NotesAnswersThatCannotBeMade) {
    Manager manager{};
    CMPIBrokerEncFT makers{};
    makers.newObjectPath = &Counting<&CMPIBrokerEncFT::newObjectPath, false>::call;
    makers.newDateTimeFromChars = &Counting<&CMPIBrokerEncFT::newDateTimeFromChars, false>::call;
    manager.eft = &makers;
    WrappedBroker wrapped(&manager);
    const CMPIBroker* broker = wrapped.handle();
    EXPECT_EQ(broker->eft->newDateTimeFromChars(broker, "no date", nullptr), nullptr);
    EXPECT_FALSE(wrapped.hasFailed()) << "a text that is no date is no failure";
    EXPECT_EQ(broker->eft->newObjectPath(broker, "root", "C", nullptr), nullptr);
    EXPECT_TRUE(wrapped.hasFailed());
    wrapped.forgetFailures();
    EXPECT_FALSE(wrapped.hasFailed());
}

}  // namespace
}  // namespace gatetest
