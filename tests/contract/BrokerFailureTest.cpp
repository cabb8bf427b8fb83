#include <functional>
#include <map>

#include "RecordFixture.h"

// Requests with a broker whose functions fail.

namespace contract {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;
using testsupport::named;
using testsupport::text;
using testsupport::uint32;

constexpr const char* newObjectPath = "CMPIBrokerEncFT.newObjectPath";
constexpr const char* newInstance = "CMPIBrokerEncFT.newInstance";
constexpr const char* setProperty = "CMPIInstanceFT.setProperty";
constexpr CMPIrc brokerCode = CMPI_RC_ERR_ACCESS_DENIED;

class BrokerFailureTest : public RecordTest {
protected:
    /** Makes a call fail, or return null with the status OK. */
    void failOneCall(const std::string& function, int number, bool isSilent) {
        if (isSilent) {
            broker.answerNothing(function, number);
        } else {
            broker.failCall(function, number, brokerCode);
        }
    }
};

TEST_P(BrokerFailureTest, APathThatCannotBeCreatedIsOmitted) {
    createAll({"A", "B", "C"});
    for (const bool isSilent : {false, true}) {
        failOneCall(newObjectPath, 2, isSilent);
        const Outcome outcome = provider().enumerateInstanceNames(allPath());
        EXPECT_THAT(outcome, isOk(1));
        EXPECT_THAT(identifiersOf(outcome.paths()), ElementsAre("A", "C"));
        broker.cancelFailures();
    }
}

TEST_P(BrokerFailureTest, NothingIsReturnedIfNoPathCanBeCreated) {
    createAll({"A", "B", "C"});
    broker.failEvery(newObjectPath, brokerCode);
    broker.forget();
    EXPECT_THAT(provider().enumerateInstanceNames(allPath()), isOk(1));
    EXPECT_THAT(provider().enumerateInstances(allPath()), isOk(1));
    EXPECT_EQ(broker.count("CMPIResultFT.returnObjectPath"), 0);
    EXPECT_EQ(broker.count("CMPIResultFT.returnInstance"), 0);
    EXPECT_EQ(broker.count(newInstance), 0) << "no instance is created without a path";
    EXPECT_EQ(broker.count(newObjectPath), 6) << "the creation is tried for each record";
}

TEST_P(BrokerFailureTest, AnInstanceThatCannotBeCreatedIsOmitted) {
    createAll({"A", "B", "C"});
    for (const char* function : {newInstance, newObjectPath}) {
        for (const bool isSilent : {false, true}) {
            failOneCall(function, 1, isSilent);
            const Outcome all = provider().enumerateInstances(allPath());
            EXPECT_THAT(all, isOk(1));
            EXPECT_THAT(identifiersOf(all.instances()), ElementsAre("B", "C"));
            failOneCall(function, 1, isSilent);
            const Outcome one = get("B");
            EXPECT_THAT(one, isOk(1));
            EXPECT_THAT(one.instances(), IsEmpty());
            broker.cancelFailures();
        }
    }
}

TEST_P(BrokerFailureTest, ARecordIsCreatedEvenIfItsInstanceCannotBeCreated) {
    for (const char* function : {newInstance, newObjectPath}) {
        failOneCall(function, 1, false);
        const Outcome outcome = create(function);
        EXPECT_THAT(outcome, isOk(1));
        EXPECT_THAT(outcome.events, SizeIs(1));
    }
    EXPECT_THAT(identifiers(), ElementsAre(newInstance, newObjectPath));
    EXPECT_EQ(data(), dataOfNew({newInstance, newObjectPath}));
}

TEST_P(BrokerFailureTest, ARecordIsDeletedEvenIfItsInstanceCannotBeCreated) {
    createAll({"A", "B"});
    broker.failEvery(newInstance, brokerCode);
    EXPECT_THAT(remove("A"), isOk(0));
    broker.failEvery(newObjectPath, brokerCode);
    EXPECT_THAT(remove("B"), isOk(0));
    broker.cancelFailures();
    EXPECT_EQ(data(), "0\n");
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(BrokerFailureTest, APropertyThatCannotBeSetIsOmittedAndTheOthersAreSet) {
    createAll({"A"});
    const std::vector<std::string> all = kind().shownRecord("A");
    for (std::size_t index = 0; index < all.size(); ++index) {
        broker.failCall(setProperty, static_cast<int>(index) + 1, brokerCode);
        std::vector<std::string> expected = all;
        expected.erase(expected.begin() + static_cast<std::ptrdiff_t>(index));
        EXPECT_EQ(recordOf("A"), expected);
    }
}

TEST_P(BrokerFailureTest, ADateThatTheBrokerCannotCreateIsNull) {
    createAll({"A"});
    modify("A", {named(kind().dateProperty, text("20240506070809.123456+120"))});
    for (const bool isSilent : {false, true}) {
        failOneCall("CMPIBrokerEncFT.newDateTimeFromChars", 1, isSilent);
        EXPECT_EQ(recordOf("A"), kind().shownRecord("A"));
    }
}

TEST_P(BrokerFailureTest, AKeyThatCannotBeReadIsIgnoredSoDeletionFails) {
    createAll({"A", "B"});
    broker.failEvery("CMPIObjectPathFT.getKey", CMPI_RC_ERR_NOT_FOUND);
    EXPECT_THAT(identifiersOf(get("B").instances()), ElementsAre("A", "B"));
    EXPECT_THAT(remove("B"), isOk(0));
    broker.cancelFailures();
    EXPECT_THAT(caughtFailures(), ElementsAre(kind().identify));
    EXPECT_THAT(identifiers(), ElementsAre("A", "B"));
}

TEST_P(BrokerFailureTest, AKeyCountThatCannotBeReadMeansNoKey) {
    createAll({"A", "B"});
    broker.failEvery("CMPIObjectPathFT.getKeyCount", brokerCode);
    EXPECT_THAT(identifiersOf(get("B").instances()), ElementsAre("A", "B"));
}

TEST_P(BrokerFailureTest, AFailureOfReturnDoneIsIgnored) {
    createAll({"A"});
    broker.failEvery("CMPIResultFT.returnDone", CMPI_RC_ERR_FAILED);
    EXPECT_THAT(get("missing"), isOk(0));
    EXPECT_THAT(provider().enumerateInstanceNames(allPath()), isOk(0));
    EXPECT_EQ(create("B").rc, CMPI_RC_OK);
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

INSTANTIATE_RECORD_TEST(BrokerFailureTest);

/** Each call that a request makes fails once with an error status and once with null. Memory and file stay consistent.
 */
class EveryCallFailsTest : public RecordTest {
protected:
    using RequestCall = std::function<Outcome()>;

    /** Returns the expected code of the request when the call at an index fails. */
    using ExpectedCode = std::function<CMPIrc(std::size_t index, bool isSilent)>;

    EveryCallFailsTest() { broker.serve("VELKO_ComputerSystem", {computer("one"), computer("two")}); }

    static Instance computer(const char* name) { return clientInstance(computerPath(name), {}); }

    /**
     * @param expected code of the request for the failing call
     * @param maximumDone maximum number of calls to returnDone
     * @param after called after each request, to check and restore the state
     */
    void failInTurn(const RequestCall& request, const ExpectedCode& expected, const std::function<void()>& after,
                    int maximumDone = 1) {
        broker.forget();
        EXPECT_EQ(request().rc, CMPI_RC_OK);
        const std::vector<std::string> functions = broker.functions();
        ASSERT_GT(functions.size(), 3U);
        after();
        for (const bool isSilent : {false, true}) {
            std::map<std::string, int> seen;
            for (std::size_t index = 0; index < functions.size(); ++index) {
                const std::string& function = functions[index];
                const int number = ++seen[function];
                SCOPED_TRACE(function + " number " + std::to_string(number) + (isSilent ? " silent" : ""));
                if (isSilent) {
                    broker.answerNothing(function, number);
                } else {
                    broker.failCall(function, number, brokerCode);
                }
                agentEnvironment::forgetLog();
                expectHarmless(request(), expected(index, isSilent), maximumDone);
                broker.cancelFailures();
                after();
            }
        }
    }

    static void expectHarmless(const Outcome& outcome, CMPIrc code, int maximumDone) {
        EXPECT_EQ(outcome.rc, code);
        EXPECT_FALSE(outcome.hasMessage);
        EXPECT_FALSE(outcome.threw);
        EXPECT_LE(outcome.doneCount, maximumDone);
    }

    /** Code for operations that take the class from the path. The first two calls read the class. */
    static CMPIrc byClass(std::size_t index, bool) { return index < 2 ? CMPI_RC_ERR_INVALID_CLASS : CMPI_RC_OK; }

    /** Code for creation. The next two calls read the namespace, and the request returns their code. */
    static CMPIrc byClassAndNamespace(std::size_t index, bool isSilent) {
        return index == 2 || index == 3 ? (isSilent ? CMPI_RC_OK : brokerCode) : byClass(index, isSilent);
    }

    static CMPIrc always(std::size_t, bool) { return CMPI_RC_OK; }

    /** Expects that memory and file contain exactly these new records. */
    void expectRecords(const std::vector<std::string>& expected) {
        EXPECT_EQ(identifiers(), expected);
        EXPECT_EQ(data(), dataOfNew(expected));
    }

    /** Expects these records after the library is loaded again. */
    void expectRecordsAfterReload(const std::vector<std::string>& expected) {
        unload();
        expectRecords(expected);
    }
};

TEST_P(EveryCallFailsTest, DuringEnumerateInstances) {
    createAll({"A", "B"});
    failInTurn([&] { return provider().enumerateInstances(allPath()); }, byClass, [&] { expectRecords({"A", "B"}); });
}

TEST_P(EveryCallFailsTest, DuringEnumerateInstanceNames) {
    createAll({"A", "B"});
    failInTurn([&] { return provider().enumerateInstanceNames(allPath()); }, byClass,
               [&] {
                   expectRecords({"A", "B"});
               });
}

TEST_P(EveryCallFailsTest, DuringGetInstance) {
    createAll({"A", "B"});
    failInTurn([&] { return get("B"); }, byClass, [&] { expectRecords({"A", "B"}); });
}

TEST_P(EveryCallFailsTest, DuringCreateInstance) {
    createAll({"A"});
    const auto putBack = [&] {
        const auto there = identifiers();
        EXPECT_TRUE(there == std::vector<std::string>{"A"} || there == (std::vector<std::string>{"A", "N"}));
        EXPECT_EQ(data(), dataOfNew(there));
        remove("N");
    };
    failInTurn([&] { return create("N"); }, byClassAndNamespace, putBack);
    expectRecordsAfterReload({"A"});
}

TEST_P(EveryCallFailsTest, DuringDeleteInstance) {
    createAll({"A", "B"});
    const auto putBack = [&] {
        const auto there = identifiers();
        EXPECT_EQ(data(), dataOfNew(there));
        EXPECT_EQ(there.front(), "A") << "the other record stays first";
        if (there.size() == 1) {
            createAll({"B"});
        }
    };
    failInTurn([&] { return remove("B"); }, byClass, putBack, 0);
    expectRecordsAfterReload({"A", "B"});
}

TEST_P(EveryCallFailsTest, DuringModifyInstance) {
    createAll({"A"});
    const auto request = [&](const std::string& value, const std::string& date, unsigned int number) {
        return modify("A", {named(kind().textProperty, text(value)), named(kind().dateProperty, text(date)),
                            named(kind().numberProperty, uint32(number))});
    };
    const std::string oldDate = "20010101000000.000000+000";
    const std::string newDate = "20240506070809.123456+120";
    const std::string defaults = kind().defaultFields;
    const auto fileOf = [&](const std::string& value, const std::string& date, unsigned int number) {
        const std::string others = defaults.substr(std::string("*\n00000000000000.000000-000\n0\n").size());
        return "1\nA\n" + value + "\n" + date + "\n" + std::to_string(number) + "\n" + others;
    };
    const auto shownOf = [&](const std::string& value, const std::string& date, unsigned int number) {
        return kind().shownRecord("A", {std::string(kind().textProperty) + "=\"" + value + "\"",
                                        std::string(kind().dateProperty) + "=\"" + date + "\"",
                                        std::string(kind().numberProperty) + "=" + std::to_string(number)});
    };
    const auto putBack = [&] {
        int matches = 0;
        const auto record = recordOf("A");
        for (const char* value : {"old", "new"}) {
            for (const std::string& date : {oldDate, newDate}) {
                for (const unsigned int number : {1U, 2U}) {
                    if (record == shownOf(value, date, number)) {
                        ++matches;
                        EXPECT_EQ(data(), fileOf(value, date, number));
                    }
                }
            }
        }
        EXPECT_EQ(matches, 1) << "each property has its old or its new value";
        request("old", oldDate, 1);
    };
    request("old", oldDate, 1);
    failInTurn([&] { return request("new", newDate, 2); }, byClass, putBack, 0);
    EXPECT_EQ(data(), fileOf("old", oldDate, 1));
}

TEST_P(EveryCallFailsTest, DuringEnumerateInstancesOfAnAssociation) {
    createAll({"A"});
    const ObjectPath all = classPath(std::string(kind().className) + "Setting");
    failInTurn([&] { return provider().enumerateInstances(all); }, byClass, [&] { expectRecords({"A"}); });
    failInTurn([&] { return provider().enumerateInstanceNames(all); }, byClass, [&] { expectRecords({"A"}); });
}

TEST_P(EveryCallFailsTest, DuringAssociators) {
    createAll({"A"});
    const cimhost::AssociationFilter filter{std::string(kind().className) + "Setting", {}, {}, {}};
    for (const ObjectPath& source :
         {computerPath(), path("A"), testsupport::objectPath(nameSpace, "VELKO_ComputerSystem")}) {
        failInTurn([&] { return provider().associators(source, filter); }, always, [&] { expectRecords({"A"}); });
        failInTurn([&] { return provider().associatorNames(source, filter); }, always, [&] { expectRecords({"A"}); });
    }
}

INSTANTIATE_RECORD_TEST(EveryCallFailsTest);

}  // namespace
}  // namespace contract
