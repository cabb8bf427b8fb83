#include "AssociationFixture.h"

#include <cmpift.h>

// An object manager that fails, call by call, while an association is answered.

namespace contract {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr const char* noComputer = "Could not obtain an instance of Computer System";

/** None of them is the one that says yes. */
constexpr CMPIBoolean oddAnswers[] = {0, 2, 255};

/** Two computer systems are known, "alpha" and "beta", and the records "A" and "B". */
class AssociationFailureTest : public AssociationTest {
protected:
    AssociationFailureTest() {
        haveRecords({"A", "B"});
        knowComputers({"alpha", "beta"});
    }

    /** That a request ended without results, without an end, and with one failure in the log. */
    void expectSwallowed(const Outcome& outcome, const char* message) {
        EXPECT_THAT(outcome, isOk(0));
        EXPECT_THAT(outcome.events, IsEmpty());
        EXPECT_THAT(caughtFailures(), ElementsAre(message));
    }

    /** The three requests that need a computer system from the object manager. */
    void expectAllSwallowed(const char* message) {
        expectSwallowed(names(), message);
        agentEnvironment::forgetLog();
        expectSwallowed(instances(), message);
        agentEnvironment::forgetLog();
        expectSwallowed(associatorNames(keyedPath(side().element, ofAlpha)), message);
        agentEnvironment::forgetLog();
        expectSwallowed(associators(keyedPath(side().element, ofAlpha)), message);
    }
};

INSTANTIATE_TEST_SUITE_P(Sides, AssociationFailureTest, testing::Values(leases, warranties), sideName);

TEST_P(AssociationFailureTest, NoComputerSystemEndsTheRequest) {
    knowComputers({});
    expectAllSwallowed(noComputer);
}

TEST_P(AssociationFailureTest, AClassOfComputersThatNobodyServesEndsTheRequest) {
    broker.failEnumeration("VELKO_ComputerSystem", CMPI_RC_ERR_INVALID_CLASS);
    expectAllSwallowed(noComputer);
}

TEST_P(AssociationFailureTest, AFailingEnumerationEndsTheRequest) {
    broker.failEvery("CMPIBrokerFT.enumerateInstances", CMPI_RC_ERR_FAILED);
    expectAllSwallowed(noComputer);
}

TEST_P(AssociationFailureTest, ANullEnumerationWithoutAnErrorEndsTheRequest) {
    broker.answerNothingEver("CMPIBrokerFT.enumerateInstances");
    expectAllSwallowed(noComputer);
    EXPECT_EQ(broker.count("CMPIEnumerationFT.hasNext"), 0);
}

TEST_P(AssociationFailureTest, AFailingQuestionForTheFirstElementEndsTheRequest) {
    broker.failEvery("CMPIEnumerationFT.hasNext", CMPI_RC_ERR_FAILED);
    expectAllSwallowed(noComputer);
    EXPECT_EQ(broker.count("CMPIEnumerationFT.getNext"), 0);
}

TEST_P(AssociationFailureTest, AFirstElementThatCannotBeHadEndsTheRequest) {
    broker.failEvery("CMPIEnumerationFT.getNext", CMPI_RC_ERR_FAILED);
    expectAllSwallowed(noComputer);
}

TEST_P(AssociationFailureTest, APathOfTheComputerClassThatCannotBeMadeEndsTheRequest) {
    broker.failCall("CMPIBrokerEncFT.newObjectPath", 1, CMPI_RC_ERR_FAILED);
    expectSwallowed(names(), noComputer);
    EXPECT_EQ(upCalls(), 0);
}

TEST_P(AssociationFailureTest, ALaterRequestIsNotAffected) {
    broker.failCall("CMPIBrokerFT.enumerateInstances", 1, CMPI_RC_ERR_FAILED);
    expectSwallowed(names(), noComputer);
    EXPECT_THAT(textsOf(names().paths()), ElementsAre(pair("alpha", "A"), pair("alpha", "B")));
}

TEST_P(AssociationFailureTest, AnAssociationPathThatCannotBeMadeIsPassedOver) {
    broker.failCall("CMPIBrokerEncFT.newObjectPath", 2, CMPI_RC_ERR_FAILED);
    const Outcome outcome = names();
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(textsOf(outcome.paths()), ElementsAre(pair("alpha", "B")));
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AssociationFailureTest, ANullAssociationPathWithoutAnErrorIsPassedOver) {
    broker.answerNothing("CMPIBrokerEncFT.newObjectPath", 2);
    EXPECT_THAT(textsOf(names().paths()), ElementsAre(pair("alpha", "B")));
}

TEST_P(AssociationFailureTest, AnElementPathThatCannotBeMadeLeavesThatKeyOut) {
    broker.failCall("CMPIBrokerEncFT.newObjectPath", 3, CMPI_RC_ERR_FAILED);
    const std::string withoutDependent = testsupport::toText(association(computerPath("alpha"), {}));
    EXPECT_THAT(textsOf(names().paths()), ElementsAre(withoutDependent, pair("alpha", "B")));
}

TEST_P(AssociationFailureTest, AComputerThatDoesNotTellItsPathLeavesThatKeyOut) {
    broker.failCall("CMPIInstanceFT.getObjectPath", 1, CMPI_RC_ERR_FAILED);
    const std::string withoutAntecedent = testsupport::toText(association({}, keyedPath(side().element, "A")));
    const Outcome outcome = names();
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(textsOf(outcome.paths()), ElementsAre(withoutAntecedent, pair("alpha", "B")));
}

TEST_P(AssociationFailureTest, AComputerWithNullAsItsPathLeavesThatKeyOut) {
    broker.answerNothing("CMPIInstanceFT.getObjectPath", 1);
    const std::string withoutAntecedent = testsupport::toText(association({}, keyedPath(side().element, "A")));
    EXPECT_THAT(textsOf(names().paths()), ElementsAre(withoutAntecedent, pair("alpha", "B")));
}

TEST_P(AssociationFailureTest, AKeyThatCannotBeAddedIsLeftOut) {
    broker.failCall("CMPIObjectPathFT.addKey", 1, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(textsOf(names().paths()),
                ElementsAre(testsupport::toText(association({}, keyedPath(side().element, "A"))), pair("alpha", "B")));
    broker.failCall("CMPIObjectPathFT.addKey", 2, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(textsOf(names().paths()), ElementsAre(pairWithoutElement("alpha"), pair("alpha", "B")));
    broker.failCall("CMPIObjectPathFT.addKey", 3, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(textsOf(names().paths()),
                ElementsAre(testsupport::toText(association(computerPath("alpha"), {})), pair("alpha", "B")));
}

TEST_P(AssociationFailureTest, AnInstanceThatCannotBeMadeIsPassedOver) {
    broker.failCall("CMPIBrokerEncFT.newInstance", 1, CMPI_RC_ERR_FAILED);
    const Outcome outcome = instances();
    EXPECT_THAT(outcome, isOk(1));
    ASSERT_EQ(outcome.instances().size(), 1U);
    EXPECT_EQ(testsupport::toText(outcome.instances()[0].path), pair("alpha", "B"));
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AssociationFailureTest, AnInstanceWhosePathCannotBeMadeIsPassedOver) {
    broker.failCall("CMPIBrokerEncFT.newObjectPath", 2, CMPI_RC_ERR_FAILED);
    const Outcome outcome = instances();
    EXPECT_THAT(outcome, isOk(1));
    ASSERT_EQ(outcome.instances().size(), 1U);
    EXPECT_EQ(testsupport::toText(outcome.instances()[0].path), pair("alpha", "B"));
}

TEST_P(AssociationFailureTest, AKeyThatCannotBeReadBecomesNoProperty) {
    broker.failCall("CMPIObjectPathFT.getKey", 1, CMPI_RC_ERR_FAILED);
    const auto found = instances().instances();
    ASSERT_EQ(found.size(), 2U);
    EXPECT_THAT(testsupport::namesOf(found[0].properties), ElementsAre("Dependent"));
    EXPECT_THAT(testsupport::namesOf(found[1].properties), ElementsAre("Antecedent", "Dependent"));
}

TEST_P(AssociationFailureTest, APropertyThatCannotBeSetIsLeftOut) {
    broker.failCall("CMPIInstanceFT.setProperty", 2, CMPI_RC_ERR_FAILED);
    const auto found = instances().instances();
    ASSERT_EQ(found.size(), 2U);
    EXPECT_THAT(testsupport::namesOf(found[0].properties), ElementsAre("Antecedent"));
    EXPECT_THAT(testsupport::namesOf(found[1].properties), ElementsAre("Antecedent", "Dependent"));
}

TEST_P(AssociationFailureTest, AResultThatRefusesAnObjectGetsTheNext) {
    broker.failCall("CMPIResultFT.returnObjectPath", 1, CMPI_RC_ERR_FAILED);
    const Outcome listed = names();
    EXPECT_THAT(listed, isOk(1));
    EXPECT_THAT(textsOf(listed.paths()), ElementsAre(pair("alpha", "B")));
    broker.failCall("CMPIResultFT.returnInstance", 1, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(instances().instances().size(), 1U);
    broker.failCall("CMPIResultFT.returnDone", 1, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(names(), isOk(0)) << "the refused end is not reported, nor said again";
}

TEST_P(AssociationFailureTest, ANamespaceThatCannotBeHadIsEmpty) {
    broker.failCall("CMPIObjectPathFT.getNameSpace", 1, CMPI_RC_ERR_FAILED);
    const auto paths = names().paths();
    ASSERT_EQ(paths.size(), 2U);
    EXPECT_EQ(paths[0].nameSpace, "");
}

TEST_P(AssociationFailureTest, AClassNameThatCannotBeHadIsNoClass) {
    broker.failCall("CMPIObjectPathFT.getClassName", 1, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(names(), isRefused(CMPI_RC_ERR_INVALID_CLASS));
}

TEST_P(AssociationFailureTest, ACurrentComputerThatIsLostOnTheWayLeavesItsKeyOut) {
    knowComputers({"alpha", "beta", "gamma"});
    broker.failCall("CMPIEnumerationFT.getNext", 2, CMPI_RC_ERR_FAILED);
    const Outcome outcome = names();
    EXPECT_THAT(outcome, isOk(1));
    const std::string lost = testsupport::toText(association({}, classPath(side().element)));
    EXPECT_THAT(textsOf(outcome.paths()),
                ElementsAre(pair("alpha", "A"), pair("alpha", "B"), lost, pairWithoutElement("beta")));
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AssociationFailureTest, AFailingQuestionForAFurtherComputerCountsAsNo) {
    broker.failCall("CMPIEnumerationFT.hasNext", 2, CMPI_RC_ERR_FAILED);
    const Outcome outcome = associatorNames(keyedPath(side().element, ofAlpha));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(outcome.paths(), IsEmpty());
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AssociationFailureTest, AFarEndWithoutPathIsPassedOver) {
    knowComputers({"alpha", "beta", "gamma"});
    broker.failCall("CMPIInstanceFT.getObjectPath", 1, CMPI_RC_ERR_FAILED);
    const Outcome outcome = associatorNames(keyedPath(side().element, ofAlpha));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(textsOf(outcome.paths()), ElementsAre(computer("beta")));
}

TEST_P(AssociationFailureTest, AFarEndThatIsLostOnTheWayIsPassedOver) {
    knowComputers({"alpha", "beta", "gamma"});
    broker.failCall("CMPIEnumerationFT.getNext", 2, CMPI_RC_ERR_FAILED);
    const Outcome outcome = associators(keyedPath(side().element, ofAlpha));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(textsOf(outcome.instances()),
                ElementsAre(textsOf({computerSystem("alpha")})[0], textsOf({computerSystem("beta")})[0]));
}

TEST_P(AssociationFailureTest, AnElementThatCannotBeMadeIsPassedOver) {
    haveRecords({ofAlpha});
    broker.failEvery("CMPIBrokerEncFT.newInstance", CMPI_RC_ERR_FAILED);
    const Outcome outcome = associators(computerPath("alpha"));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(outcome.instances(), IsEmpty());
}

TEST_P(AssociationFailureTest, ComputersCountWhateverTheStateOfTheElementsThatTheManagerReturns) {
    for (const int state : {CMPI_goodValue, CMPI_nullValue, CMPI_keyValue, CMPI_notFound, CMPI_badValue}) {
        broker.answerState("CMPIEnumerationFT.getNext", static_cast<CMPIValueState>(state));
        EXPECT_THAT(textsOf(names().paths()), ElementsAre(pair("alpha", "A"), pair("alpha", "B")));
    }
}

/** An object manager whose enumerations answer any number to the question whether there is more. */
class OddEnumeration {
public:
    OddEnumeration(testsupport::RecordingBroker& recording, CMPIBoolean itsAnswer, const std::string& computerName)
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
    ~OddEnumeration() { current = nullptr; }
    OddEnumeration(const OddEnumeration&) = delete;
    OddEnumeration& operator=(const OddEnumeration&) = delete;

    const CMPIBroker* broker() const { return &handle; }

    /** The answer from the second question on. */
    void sayLater(CMPIBoolean itsAnswer) { later = itsAnswer; }

private:
    static CMPIEnumeration* enumerateInstances(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*,
                                               const char**, CMPIStatus* rc) {
        *rc = {CMPI_RC_OK, nullptr};
        current->questions = 0;
        return &current->enumeration;
    }

    static CMPIBoolean hasNext(const CMPIEnumeration* self, CMPIStatus* rc) {
        auto& odd = *static_cast<OddEnumeration*>(self->hdl);
        *rc = {CMPI_RC_OK, nullptr};
        constexpr int mostQuestions = 10;  // lets a provider that takes any answer for yes come to an end
        if (++odd.questions > mostQuestions) {
            return 0;
        }
        return odd.questions == 1 ? odd.answer : odd.later;
    }

    static CMPIData getNext(const CMPIEnumeration* self, CMPIStatus* rc) {
        auto& odd = *static_cast<OddEnumeration*>(self->hdl);
        *rc = {CMPI_RC_OK, nullptr};
        CMPIData data{};
        data.type = CMPI_instance;
        data.value.inst = odd.computer;
        return data;
    }

    inline static OddEnumeration* current = nullptr;
    CMPIBroker handle;
    CMPIBrokerFT brokerTable;
    CMPIEnumerationFT enumerationTable{};
    CMPIEnumeration enumeration;
    CMPIBoolean answer;
    CMPIBoolean later = 0;
    int questions = 0;
    CMPIInstance* computer;
};

TEST_P(AssociationFailureTest, AnAnswerOtherThanOneToTheFirstQuestionIsNoComputer) {
    for (const CMPIBoolean answer : oddAnswers) {
        SCOPED_TRACE(int{answer});
        OddEnumeration odd(broker, answer, "alpha");
        CMPIStatus status{CMPI_RC_OK, nullptr};
        provider().createAssociationMI(odd.broker(), &status);
        expectSwallowed(associatorNames(keyedPath(side().element, ofAlpha)), noComputer);
        agentEnvironment::forgetLog();
    }
}

TEST_P(AssociationFailureTest, OnlyTheAnswerOneIsAFurtherComputer) {
    OddEnumeration odd(broker, 1, "alpha");
    CMPIStatus status{CMPI_RC_OK, nullptr};
    provider().createAssociationMI(odd.broker(), &status);
    provider().createInstanceMI(odd.broker(), &status);
    for (const CMPIBoolean answer : oddAnswers) {
        SCOPED_TRACE(int{answer});
        odd.sayLater(answer);
        EXPECT_THAT(associatorNames(keyedPath(side().element, ofAlpha)).paths(), IsEmpty());
        EXPECT_THAT(textsOf(names().paths()), ElementsAre(pair("alpha", "A"), pair("alpha", "B")));
    }
}

}  // namespace
}  // namespace contract
