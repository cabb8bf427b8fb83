#include <cmpift.h>

#include "AssociationFixture.h"

// Failures of each function of the object manager during association requests.

namespace contract {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr const char* noComputer = "Could not obtain an instance of Computer System";

/** Values other than 1. Only 1 means true. */
constexpr CMPIBoolean otherThanTrue[] = {0, 2, 255};

/** Two computer systems, "alpha" and "beta", and the records "A" and "B". */
class AssociationFailureTest : public AssociationTest {
protected:
    AssociationFailureTest() {
        writeRecordFile({"A", "B"});
        setComputers({"alpha", "beta"});
    }

    /** Expects that a request returned neither results nor their end, and logged one failure. */
    void expectOnlyLogged(const Outcome& outcome, const char* message) {
        EXPECT_THAT(outcome, isOk(0));
        EXPECT_THAT(outcome.events, IsEmpty());
        EXPECT_THAT(caughtFailures(), ElementsAre(message));
    }

    /** Expects this of the four requests that need a computer system from the object manager. */
    void expectAllOnlyLogged(const char* message) {
        expectOnlyLogged(names(), message);
        agentEnvironment::forgetLog();
        expectOnlyLogged(instances(), message);
        agentEnvironment::forgetLog();
        expectOnlyLogged(associatorNames(keyedPath(kind().element, ofAlpha)), message);
        agentEnvironment::forgetLog();
        expectOnlyLogged(associators(keyedPath(kind().element, ofAlpha)), message);
    }
};

INSTANTIATE_TEST_SUITE_P(Kinds, AssociationFailureTest, testing::Values(leases, warranties), associationName);

TEST_P(AssociationFailureTest, TheLackOfAComputerSystemEndsTheRequest) {
    setComputers({});
    expectAllOnlyLogged(noComputer);
}

TEST_P(AssociationFailureTest, AnUnservedComputerClassEndsTheRequest) {
    broker.failEnumeration("VELKO_ComputerSystem", CMPI_RC_ERR_INVALID_CLASS);
    expectAllOnlyLogged(noComputer);
}

TEST_P(AssociationFailureTest, AFailingEnumerationEndsTheRequest) {
    broker.failEvery("CMPIBrokerFT.enumerateInstances", CMPI_RC_ERR_FAILED);
    expectAllOnlyLogged(noComputer);
}

TEST_P(AssociationFailureTest, ANullEnumerationWithoutAnErrorEndsTheRequest) {
    broker.answerNothingEver("CMPIBrokerFT.enumerateInstances");
    expectAllOnlyLogged(noComputer);
    EXPECT_EQ(broker.count("CMPIEnumerationFT.hasNext"), 0);
}

TEST_P(AssociationFailureTest, AFailureOfHasNextForTheFirstElementEndsTheRequest) {
    broker.failEvery("CMPIEnumerationFT.hasNext", CMPI_RC_ERR_FAILED);
    expectAllOnlyLogged(noComputer);
    EXPECT_EQ(broker.count("CMPIEnumerationFT.getNext"), 0);
}

TEST_P(AssociationFailureTest, AFailureToReadTheFirstElementEndsTheRequest) {
    broker.failEvery("CMPIEnumerationFT.getNext", CMPI_RC_ERR_FAILED);
    expectAllOnlyLogged(noComputer);
}

TEST_P(AssociationFailureTest, AComputerClassPathThatCannotBeCreatedEndsTheRequest) {
    broker.failCall("CMPIBrokerEncFT.newObjectPath", 1, CMPI_RC_ERR_FAILED);
    expectOnlyLogged(names(), noComputer);
    EXPECT_EQ(upCalls(), 0);
}

TEST_P(AssociationFailureTest, ALaterRequestIsNotAffected) {
    broker.failCall("CMPIBrokerFT.enumerateInstances", 1, CMPI_RC_ERR_FAILED);
    expectOnlyLogged(names(), noComputer);
    EXPECT_THAT(stringsOf(names().paths()), ElementsAre(pair("alpha", "A"), pair("alpha", "B")));
}

TEST_P(AssociationFailureTest, AnAssociationPathThatCannotBeCreatedIsSkipped) {
    broker.failCall("CMPIBrokerEncFT.newObjectPath", 2, CMPI_RC_ERR_FAILED);
    const Outcome outcome = names();
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(stringsOf(outcome.paths()), ElementsAre(pair("alpha", "B")));
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AssociationFailureTest, ANullAssociationPathWithoutAnErrorIsSkipped) {
    broker.answerNothing("CMPIBrokerEncFT.newObjectPath", 2);
    EXPECT_THAT(stringsOf(names().paths()), ElementsAre(pair("alpha", "B")));
}

TEST_P(AssociationFailureTest, AnElementPathThatCannotBeCreatedIsOmittedFromTheKeys) {
    broker.failCall("CMPIBrokerEncFT.newObjectPath", 3, CMPI_RC_ERR_FAILED);
    const std::string withoutDependent = testsupport::toText(association(computerPath("alpha"), {}));
    EXPECT_THAT(stringsOf(names().paths()), ElementsAre(withoutDependent, pair("alpha", "B")));
}

TEST_P(AssociationFailureTest, AComputerPathThatCannotBeReadIsOmittedFromTheKeys) {
    broker.failCall("CMPIInstanceFT.getObjectPath", 1, CMPI_RC_ERR_FAILED);
    const std::string withoutAntecedent = testsupport::toText(association({}, keyedPath(kind().element, "A")));
    const Outcome outcome = names();
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(stringsOf(outcome.paths()), ElementsAre(withoutAntecedent, pair("alpha", "B")));
}

TEST_P(AssociationFailureTest, ANullComputerPathIsOmittedFromTheKeys) {
    broker.answerNothing("CMPIInstanceFT.getObjectPath", 1);
    const std::string withoutAntecedent = testsupport::toText(association({}, keyedPath(kind().element, "A")));
    EXPECT_THAT(stringsOf(names().paths()), ElementsAre(withoutAntecedent, pair("alpha", "B")));
}

TEST_P(AssociationFailureTest, AKeyThatCannotBeAddedIsOmitted) {
    broker.failCall("CMPIObjectPathFT.addKey", 1, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(stringsOf(names().paths()),
                ElementsAre(testsupport::toText(association({}, keyedPath(kind().element, "A"))), pair("alpha", "B")));
    broker.failCall("CMPIObjectPathFT.addKey", 2, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(stringsOf(names().paths()), ElementsAre(pairWithoutElement("alpha"), pair("alpha", "B")));
    broker.failCall("CMPIObjectPathFT.addKey", 3, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(stringsOf(names().paths()),
                ElementsAre(testsupport::toText(association(computerPath("alpha"), {})), pair("alpha", "B")));
}

TEST_P(AssociationFailureTest, AnInstanceThatCannotBeCreatedIsSkipped) {
    broker.failCall("CMPIBrokerEncFT.newInstance", 1, CMPI_RC_ERR_FAILED);
    const Outcome outcome = instances();
    EXPECT_THAT(outcome, isOk(1));
    ASSERT_EQ(outcome.instances().size(), 1U);
    EXPECT_EQ(testsupport::toText(outcome.instances()[0].path), pair("alpha", "B"));
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AssociationFailureTest, AnInstanceWhosePathCannotBeCreatedIsSkipped) {
    broker.failCall("CMPIBrokerEncFT.newObjectPath", 2, CMPI_RC_ERR_FAILED);
    const Outcome outcome = instances();
    EXPECT_THAT(outcome, isOk(1));
    ASSERT_EQ(outcome.instances().size(), 1U);
    EXPECT_EQ(testsupport::toText(outcome.instances()[0].path), pair("alpha", "B"));
}

TEST_P(AssociationFailureTest, AKeyThatCannotBeReadIsOmittedFromTheProperties) {
    broker.failCall("CMPIObjectPathFT.getKey", 1, CMPI_RC_ERR_FAILED);
    const auto found = instances().instances();
    ASSERT_EQ(found.size(), 2U);
    EXPECT_THAT(testsupport::namesOf(found[0].properties), ElementsAre("Dependent"));
    EXPECT_THAT(testsupport::namesOf(found[1].properties), ElementsAre("Antecedent", "Dependent"));
}

TEST_P(AssociationFailureTest, APropertyThatCannotBeSetIsOmitted) {
    broker.failCall("CMPIInstanceFT.setProperty", 2, CMPI_RC_ERR_FAILED);
    const auto found = instances().instances();
    ASSERT_EQ(found.size(), 2U);
    EXPECT_THAT(testsupport::namesOf(found[0].properties), ElementsAre("Antecedent"));
    EXPECT_THAT(testsupport::namesOf(found[1].properties), ElementsAre("Antecedent", "Dependent"));
}

TEST_P(AssociationFailureTest, ObjectsAfterAFailureOfTheResultAreReturned) {
    broker.failCall("CMPIResultFT.returnObjectPath", 1, CMPI_RC_ERR_FAILED);
    const Outcome listed = names();
    EXPECT_THAT(listed, isOk(1));
    EXPECT_THAT(stringsOf(listed.paths()), ElementsAre(pair("alpha", "B")));
    broker.failCall("CMPIResultFT.returnInstance", 1, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(instances().instances().size(), 1U);
    broker.failCall("CMPIResultFT.returnDone", 1, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(names(), isOk(0)) << "the failure of returnDone is not reported and the call not repeated";
}

TEST_P(AssociationFailureTest, ANamespaceThatCannotBeReadIsEmpty) {
    broker.failCall("CMPIObjectPathFT.getNameSpace", 1, CMPI_RC_ERR_FAILED);
    const auto paths = names().paths();
    ASSERT_EQ(paths.size(), 2U);
    EXPECT_EQ(paths[0].nameSpace, "");
}

TEST_P(AssociationFailureTest, AClassNameThatCannotBeReadIsInvalid) {
    broker.failCall("CMPIObjectPathFT.getClassName", 1, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(names(), isRefused(CMPI_RC_ERR_INVALID_CLASS));
}

TEST_P(AssociationFailureTest, AComputerThatCannotBeReadIsOmittedFromTheKeys) {
    setComputers({"alpha", "beta", "gamma"});
    broker.failCall("CMPIEnumerationFT.getNext", 2, CMPI_RC_ERR_FAILED);
    const Outcome outcome = names();
    EXPECT_THAT(outcome, isOk(1));
    const std::string lost = testsupport::toText(association({}, classPath(kind().element)));
    EXPECT_THAT(stringsOf(outcome.paths()),
                ElementsAre(pair("alpha", "A"), pair("alpha", "B"), lost, pairWithoutElement("beta")));
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AssociationFailureTest, AFailureOfHasNextEndsTheEnumerationOfComputers) {
    broker.failCall("CMPIEnumerationFT.hasNext", 2, CMPI_RC_ERR_FAILED);
    const Outcome outcome = associatorNames(keyedPath(kind().element, ofAlpha));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(outcome.paths(), IsEmpty());
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AssociationFailureTest, AnAssociatedObjectWithoutAPathIsSkipped) {
    setComputers({"alpha", "beta", "gamma"});
    broker.failCall("CMPIInstanceFT.getObjectPath", 1, CMPI_RC_ERR_FAILED);
    const Outcome outcome = associatorNames(keyedPath(kind().element, ofAlpha));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(stringsOf(outcome.paths()), ElementsAre(computer("beta")));
}

TEST_P(AssociationFailureTest, AnAssociatedObjectThatCannotBeReadIsSkipped) {
    setComputers({"alpha", "beta", "gamma"});
    broker.failCall("CMPIEnumerationFT.getNext", 2, CMPI_RC_ERR_FAILED);
    const Outcome outcome = associators(keyedPath(kind().element, ofAlpha));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(stringsOf(outcome.instances()),
                ElementsAre(stringsOf({computerSystem("alpha")})[0], stringsOf({computerSystem("beta")})[0]));
}

TEST_P(AssociationFailureTest, AnElementThatCannotBeCreatedIsSkipped) {
    writeRecordFile({ofAlpha});
    broker.failEvery("CMPIBrokerEncFT.newInstance", CMPI_RC_ERR_FAILED);
    const Outcome outcome = associators(computerPath("alpha"));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(outcome.instances(), IsEmpty());
}

TEST_P(AssociationFailureTest, TheStateOfEnumerationElementsIsIgnored) {
    for (const int state : {CMPI_goodValue, CMPI_nullValue, CMPI_keyValue, CMPI_notFound, CMPI_badValue}) {
        broker.answerState("CMPIEnumerationFT.getNext", static_cast<CMPIValueState>(state));
        EXPECT_THAT(stringsOf(names().paths()), ElementsAre(pair("alpha", "A"), pair("alpha", "B")));
    }
}

/** An object manager whose enumerations return the given numbers from hasNext. */
class HasNextDouble {
public:
    HasNextDouble(testsupport::RecordingBroker& recording, CMPIBoolean itsAnswer, const std::string& computerName)
        : handle(*recording.handle()),
          brokerTable(*handle.bft),
          enumeration{this, &enumerationTable},
          answer(itsAnswer),
          computer(recording.instance(computerSystem(computerName))) {
        brokerTable.enumerateInstances = &enumerateInstances;
        handle.bft = &brokerTable;
        enumerationTable.hasNext = &hasNext;
        enumerationTable.getNext = &getNext;
        current = this;
    }
    ~HasNextDouble() { current = nullptr; }
    HasNextDouble(const HasNextDouble&) = delete;
    HasNextDouble& operator=(const HasNextDouble&) = delete;

    const CMPIBroker* broker() const { return &handle; }

    /** Sets the result of hasNext from the second call on. */
    void setLaterResult(CMPIBoolean itsAnswer) { later = itsAnswer; }

private:
    static CMPIEnumeration* enumerateInstances(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*,
                                               const char**, CMPIStatus* rc) {
        *rc = {CMPI_RC_OK, nullptr};
        current->calls = 0;
        return &current->enumeration;
    }

    static CMPIBoolean hasNext(const CMPIEnumeration* self, CMPIStatus* rc) {
        auto& hasNextDouble = *static_cast<HasNextDouble*>(self->hdl);
        *rc = {CMPI_RC_OK, nullptr};
        constexpr int maximumCalls = 10;  // stops a provider that accepts any result as true
        if (++hasNextDouble.calls > maximumCalls) {
            return 0;
        }
        return hasNextDouble.calls == 1 ? hasNextDouble.answer : hasNextDouble.later;
    }

    static CMPIData getNext(const CMPIEnumeration* self, CMPIStatus* rc) {
        auto& hasNextDouble = *static_cast<HasNextDouble*>(self->hdl);
        *rc = {CMPI_RC_OK, nullptr};
        CMPIData data{};
        data.type = CMPI_instance;
        data.value.inst = hasNextDouble.computer;
        return data;
    }

    inline static HasNextDouble* current = nullptr;
    CMPIBroker handle;
    CMPIBrokerFT brokerTable;
    CMPIEnumerationFT enumerationTable{};
    CMPIEnumeration enumeration;
    CMPIBoolean answer;
    CMPIBoolean later = 0;
    int calls = 0;
    CMPIInstance* computer;
};

TEST_P(AssociationFailureTest, AFirstHasNextOtherThanOneMeansNoComputer) {
    for (const CMPIBoolean answer : otherThanTrue) {
        SCOPED_TRACE(int{answer});
        HasNextDouble hasNextDouble(broker, answer, "alpha");
        CMPIStatus status{CMPI_RC_OK, nullptr};
        provider().createAssociationMI(hasNextDouble.broker(), &status);
        expectOnlyLogged(associatorNames(keyedPath(kind().element, ofAlpha)), noComputer);
        agentEnvironment::forgetLog();
    }
}

TEST_P(AssociationFailureTest, OnlyAHasNextOfOneMeansAFurtherComputer) {
    HasNextDouble hasNextDouble(broker, 1, "alpha");
    CMPIStatus status{CMPI_RC_OK, nullptr};
    provider().createAssociationMI(hasNextDouble.broker(), &status);
    provider().createInstanceMI(hasNextDouble.broker(), &status);
    for (const CMPIBoolean answer : otherThanTrue) {
        SCOPED_TRACE(int{answer});
        hasNextDouble.setLaterResult(answer);
        EXPECT_THAT(associatorNames(keyedPath(kind().element, ofAlpha)).paths(), IsEmpty());
        EXPECT_THAT(stringsOf(names().paths()), ElementsAre(pair("alpha", "A"), pair("alpha", "B")));
    }
}

}  // namespace
}  // namespace contract
