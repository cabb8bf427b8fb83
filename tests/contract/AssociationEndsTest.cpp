#include <optional>
#include <utility>

#include "AssociationFixture.h"

// Associators and AssociatorNames.

namespace contract {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::named;
using testsupport::objectPath;
using testsupport::text;

class AssociationEndsTest : public AssociationTest {
protected:
    /** Expects that a request logged this failure and returned nothing. */
    void expectOnlyLogged(const Outcome& outcome, const char* message) {
        EXPECT_THAT(outcome, isOk(0));
        EXPECT_THAT(outcome.events, IsEmpty());
        EXPECT_THAT(caughtFailures(), ElementsAre(message));
    }

    static ObjectPath computerWithKeys(std::vector<NamedValue> keys) {
        return objectPath(nameSpace, "VELKO_ComputerSystem", std::move(keys));
    }
};

INSTANTIATE_TEST_SUITE_P(Kinds, AssociationEndsTest, testing::Values(leases, warranties), associationName);

// Associators of computers.

TEST_P(AssociationEndsTest, AComputerIsAssociatedWithTheRecordWhoseIdentifierIsTheComputersPath) {
    writeRecordFile({"A", ofAlpha, ofBeta, "B"});
    for (const auto& [name, identifier] : {std::pair("alpha", ofAlpha), std::pair("beta", ofBeta)}) {
        const Outcome outcome = associatorNames(computerPath(name));
        EXPECT_THAT(outcome, isOk(1));
        EXPECT_THAT(stringsOf(outcome.paths()), ElementsAre(element(identifier)));
    }
    EXPECT_EQ(upCalls(), 0) << "computer systems are not enumerated";
}

TEST_P(AssociationEndsTest, AComputerWithoutARecordHasNoAssociators) {
    writeRecordFile({"A", ofAlpha});
    const Outcome outcome = associatorNames(computerPath("gamma"));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(outcome.paths(), IsEmpty());
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AssociationEndsTest, AnUnknownComputerHasNoAssociators) {
    writeRecordFile({"A", ofAlpha});
    for (const char* name : {"delta", "ALPHA", "alpha ", ""}) {
        const Outcome outcome = associatorNames(computerPath(name));
        EXPECT_THAT(outcome, isOk(1)) << name;
        EXPECT_THAT(outcome.paths(), IsEmpty()) << name;
    }
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AssociationEndsTest, AssociatorsEqualTheInstancesOfTheElementClass) {
    writeRecordFile({"A", ofAlpha});
    const Outcome outcome = associators(computerPath("alpha"));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_EQ(stringsOf(outcome.instances()),
              stringsOf(provider().getInstance(keyedPath(kind().element, ofAlpha)).instances()));
    EXPECT_EQ(outcome.instances().size(), 1U);
}

TEST_P(AssociationEndsTest, AComputerPathWithoutKeysIsAssociatedWithEveryRecord) {
    writeRecordFile({"A", ofAlpha, "B"});
    const Outcome outcome = associatorNames(computerWithKeys({}));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(stringsOf(outcome.paths()), ElementsAre(element("A"), element(ofAlpha), element("B")));
    EXPECT_EQ(associators(computerWithKeys({})).instances().size(), 3U);
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AssociationEndsTest, TheNameCanFollowOtherKeys) {
    writeRecordFile({ofBeta});
    const ObjectPath source =
        computerWithKeys({named("CreationClassName", text("VELKO_ComputerSystem")), named("Name", text("beta"))});
    EXPECT_THAT(stringsOf(associatorNames(source).paths()), ElementsAre(element(ofBeta)));
}

TEST_P(AssociationEndsTest, KeysWithoutANameFail) {
    writeRecordFile({ofAlpha});
    expectOnlyLogged(associatorNames(computerWithKeys({named("CreationClassName", text("alpha"))})),
                     "Could not find 'Name' Key in Moniker");
}

TEST_P(AssociationEndsTest, TheNameOfTheKeyIsCaseSensitive) {
    writeRecordFile({ofAlpha});
    expectOnlyLogged(associators(computerWithKeys({named("name", text("alpha"))})),
                     "Could not find 'Name' Key in Moniker");
}

TEST_P(AssociationEndsTest, ANullNameFails) {
    writeRecordFile({ofAlpha});
    expectOnlyLogged(associatorNames(computerWithKeys({named("Name", testsupport::nullOf(CMPI_string))})),
                     "Could not find 'Name' Key in Moniker");
}

TEST_P(AssociationEndsTest, ElementPathsAreInTheSourcesNamespace) {
    writeRecordFile({ofAlpha});
    const Outcome outcome =
        associatorNames(objectPath("root/other", "VELKO_ComputerSystem", {named("Name", text("alpha"))}));
    ASSERT_EQ(outcome.paths().size(), 1U);
    EXPECT_EQ(outcome.paths()[0].nameSpace, "root/other");
}

// Associators of records.

TEST_P(AssociationEndsTest, TheLastComputerSystemIsOmitted) {
    const ObjectPath source = keyedPath(kind().element, ofAlpha);
    setComputers({"alpha"});
    EXPECT_THAT(stringsOf(associatorNames(source).paths()), IsEmpty());
    EXPECT_THAT(associatorNames(source), isOk(1));
    setComputers({"alpha", "beta"});
    EXPECT_THAT(stringsOf(associatorNames(source).paths()), ElementsAre(computer("alpha")));
    setComputers({"alpha", "beta", "gamma"});
    const Outcome three = associatorNames(source);
    EXPECT_THAT(three, isOk(1));
    EXPECT_THAT(stringsOf(three.paths()), ElementsAre(computer("alpha"), computer("beta")));
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AssociationEndsTest, ComputerSystemsAreReturnedUnchanged) {
    setComputers({"alpha", "beta", "gamma"});
    const Outcome outcome = associators(keyedPath(kind().element, ofAlpha));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_EQ(stringsOf(outcome.instances()), stringsOf({computerSystem("alpha"), computerSystem("beta")}));
}

TEST_P(AssociationEndsTest, TheIdentifierDoesNotRestrictTheComputers) {
    setComputers({"alpha", "beta", "gamma"});
    EXPECT_THAT(stringsOf(associatorNames(keyedPath(kind().element, ofGamma)).paths()),
                ElementsAre(computer("alpha"), computer("beta")));
    const auto calls = broker.calls("CMPIBrokerFT.enumerateInstances");
    ASSERT_EQ(calls.size(), 1U);
    EXPECT_THAT(calls[0].arguments, ElementsAre(computer("gamma"), "null"));
}

TEST_P(AssociationEndsTest, TheRecordNeedNotExist) {
    setComputers({"alpha", "beta"});
    EXPECT_THAT(stringsOf(associatorNames(keyedPath(kind().element, ofBeta)).paths()), ElementsAre(computer("alpha")));
}

TEST_P(AssociationEndsTest, AnElementPathWithoutKeysIsAccepted) {
    setComputers({"alpha", "beta"});
    const Outcome outcome = associatorNames(classPath(kind().element));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(stringsOf(outcome.paths()), ElementsAre(computer("alpha")));
    EXPECT_THAT(broker.calls("CMPIBrokerFT.enumerateInstances").at(0).arguments,
                ElementsAre("root/cimv2:VELKO_ComputerSystem", "null"));
}

TEST_P(AssociationEndsTest, AnElementWithKeysButNoIdentifierFails) {
    setComputers({"alpha", "beta"});
    expectOnlyLogged(associatorNames(objectPath(nameSpace, kind().element, {named("instanceid", text(ofAlpha))})),
                     "Could not find 'InstanceID' Key in Moniker");
    EXPECT_EQ(upCalls(), 0);
}

TEST_P(AssociationEndsTest, AnElementWhoseOnlyKeyIsNullFails) {
    writeRecordFile({ofAlpha});
    setComputers({"alpha", "beta"});
    const ObjectPath source =
        objectPath(nameSpace, kind().element, {named("InstanceID", testsupport::nullOf(CMPI_string))});
    for (const Outcome& outcome : {associatorNames(source), associators(source)}) {
        EXPECT_THAT(outcome, isOk(0));
        EXPECT_THAT(outcome.events, IsEmpty());
    }
    EXPECT_THAT(caughtFailures(), ElementsAre("Could not find 'InstanceID' Key in Moniker",
                                              "Could not find 'InstanceID' Key in Moniker"));
    EXPECT_EQ(upCalls(), 0);
}

TEST_P(AssociationEndsTest, AnIdentifierThatIsNotANodePathFails) {
    writeRecordFile({"A"});
    setComputers({"alpha", "beta"});
    expectOnlyLogged(associators(keyedPath(kind().element, "A")), "Name Property on computer not available.");
    EXPECT_EQ(upCalls(), 0);
}

TEST_P(AssociationEndsTest, TheRecordOfAComputerLeadsBackToTheComputer) {
    writeRecordFile({ofAlpha, ofBeta, ofGamma});
    setComputers({"alpha", "beta"});
    for (const char* name : {"alpha", "beta", "gamma"}) {
        broker.forget();
        const auto elements = associatorNames(computerPath(name)).paths();
        ASSERT_EQ(elements.size(), 1U) << name;
        associatorNames(elements[0]);
        EXPECT_EQ(broker.calls("CMPIBrokerFT.enumerateInstances").at(0).arguments.at(0), computer(name));
    }
}

// Associators of other classes, and the arguments of a request.

TEST_P(AssociationEndsTest, AnElementOfTheOtherClassHasNoAssociators) {
    writeRecordFile({ofAlpha});
    setComputers({"alpha", "beta"});
    for (const ObjectPath& source : {keyedPath(kind().otherElement, ofAlpha), classPath(kind().otherElement)}) {
        const Outcome outcome = associatorNames(source);
        EXPECT_THAT(outcome, isOk(1));
        EXPECT_EQ(outcome.events.size(), 1U);
    }
    EXPECT_EQ(upCalls(), 0);
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AssociationEndsTest, SourcesOfOtherClassesHaveNoAssociators) {
    writeRecordFile({ofAlpha});
    setComputers({"alpha", "beta"});
    for (const char* className :
         {"VELKO_OstrelAgent", "VELKO_AssetIDDetails", kind().associationOfOthers, "CIM_ComputerSystem", ""}) {
        const Outcome outcome = associators(objectPath(nameSpace, className, {named("Name", text("alpha"))}));
        EXPECT_THAT(outcome, isOk(1)) << className;
        EXPECT_EQ(outcome.events.size(), 1U) << className;
    }
    EXPECT_EQ(upCalls(), 0);
}

TEST_P(AssociationEndsTest, AnAssociationAsSourceHasNoAssociators) {
    writeRecordFile({"A", "B"});
    setComputers({"alpha"});
    for (const Outcome& outcome :
         {associatorNames(classPath(kind().association)), associators(classPath(kind().association))}) {
        EXPECT_THAT(outcome, isOk(1));
        EXPECT_EQ(outcome.events.size(), 1U);
    }
}

TEST_P(AssociationEndsTest, ThePropertyListIsNotAppliedAtEitherEnd) {
    writeRecordFile({ofAlpha});
    setComputers({"alpha", "beta"});
    const std::vector<std::string> one{"ElementName"};
    for (const ObjectPath& source : {computerPath("alpha"), keyedPath(kind().element, ofAlpha)}) {
        EXPECT_EQ(stringsOf(associators(source, one).instances()), stringsOf(associators(source).instances()));
    }
    EXPECT_EQ(broker.calls("CMPIBrokerFT.enumerateInstances").at(0).arguments.at(1), "null");
}

TEST_P(AssociationEndsTest, ResultClassAndRolesAreIgnored) {
    writeRecordFile({ofAlpha});
    setComputers({"alpha", "beta"});
    cimhost::AssociationFilter filter = through();
    filter.resultClass = "VELKO_OstrelAgent";
    filter.role = "Dependent";
    filter.resultRole = "Nonsense";
    EXPECT_THAT(stringsOf(provider().associatorNames(computerPath("alpha"), filter).paths()),
                ElementsAre(element(ofAlpha)));
    EXPECT_EQ(provider().associators(keyedPath(kind().element, ofAlpha), filter).instances().size(), 1U);
}

TEST_P(AssociationEndsTest, OnlyTheTwoAssociationClassesAreServed) {
    writeRecordFile({ofAlpha});
    setComputers({"alpha", "beta"});
    for (const std::optional<std::string>& className : std::vector<std::optional<std::string>>{
             std::nullopt, "", "VELKO_Lease", "VELKO_Warranty", "VELKO_OstrelAgent", "VELKO_AssetIDDetails",
             "VELKO_ComputerSystem", "CIM_ElementSettingData"}) {
        const cimhost::AssociationFilter filter{className, {}, {}, {}};
        EXPECT_THAT(provider().associators(computerPath("alpha"), filter), isRefused(CMPI_RC_ERR_INVALID_CLASS));
        EXPECT_THAT(provider().associatorNames(computerPath("alpha"), filter), isRefused(CMPI_RC_ERR_INVALID_CLASS));
    }
}

TEST_P(AssociationEndsTest, ReferencesAreNotSupported) {
    writeRecordFile({ofAlpha});
    setComputers({"alpha", "beta"});
    const cimhost::AssociationFilter filter{{}, kind().association, {}, {}};
    for (const ObjectPath& source : {computerPath("alpha"), keyedPath(kind().element, ofAlpha)}) {
        EXPECT_THAT(provider().references(source, filter), isRefused(CMPI_RC_ERR_NOT_SUPPORTED));
        EXPECT_THAT(provider().referenceNames(source, filter), isRefused(CMPI_RC_ERR_NOT_SUPPORTED));
    }
    EXPECT_EQ(upCalls(), 0);
}

TEST_P(AssociationEndsTest, AComputersRecordIsFoundAfterARestart) {
    for (const char* identifier : {ofAlpha, ofBeta}) {
        const ObjectPath path = keyedPath(kind().element, identifier);
        ASSERT_THAT(provider().createInstance(path, clientInstance(path, {})), isOk(1));
    }
    unload();
    EXPECT_THAT(stringsOf(associatorNames(computerPath("alpha")).paths()), ElementsAre(element(ofAlpha)));
    EXPECT_THAT(stringsOf(associatorNames(computerPath("beta")).paths()), ElementsAre(element(ofBeta)));
    setComputers({"alpha", "beta"});
    EXPECT_THAT(stringsOf(associatorNames(keyedPath(kind().element, ofBeta)).paths()), ElementsAre(computer("alpha")));
}

/** An agent whose second computer has no name, and whose third is named "gamma". */
class AssociationNamelessTest : public AssociationTest {
protected:
    AssociationNamelessTest() : nodes(withoutSecondName) {}

    static constexpr const char* withoutSecondName = R"(
[[instrumentation.node]]
type = 40
path = "/system/computer"
properties = { "108" = "alpha" }

[[instrumentation.node]]
type = 40
path = "/system/nameless"
properties = { "36" = "Example Maker" }

[[instrumentation.node]]
type = 40
path = "/system/third"
properties = { "108" = "gamma" }
)";

    agentEnvironment::AgentNodes nodes;
};

INSTANTIATE_TEST_SUITE_P(Kinds, AssociationNamelessTest, testing::Values(leases, warranties), associationName);

TEST_P(AssociationNamelessTest, AComputerBeforeAnUnnamedOneIsFound) {
    writeRecordFile({ofAlpha});
    EXPECT_THAT(stringsOf(associatorNames(computerPath("alpha")).paths()), ElementsAre(element(ofAlpha)));
}

TEST_P(AssociationNamelessTest, TheSearchForAComputerAfterAnUnnamedOneFails) {
    writeRecordFile({ofGamma});
    for (const char* name : {"gamma", "delta"}) {
        agentEnvironment::forgetLog();
        const Outcome outcome = associatorNames(computerPath(name));
        EXPECT_THAT(outcome, isOk(0));
        EXPECT_THAT(outcome.events, IsEmpty());
        EXPECT_THAT(caughtFailures(), ElementsAre("Name Property on Computer Node not available."));
    }
}

TEST_P(AssociationNamelessTest, ARecordOfAnUnnamedComputerFails) {
    setComputers({"alpha", "beta"});
    const Outcome outcome = associatorNames(keyedPath(kind().element, "/system/nameless"));
    EXPECT_THAT(outcome, isOk(0));
    EXPECT_THAT(outcome.events, IsEmpty());
    EXPECT_THAT(caughtFailures(), ElementsAre("Name Property on computer not available."));
}

TEST_P(AssociationNamelessTest, ARecordOfAComputerAfterAnUnnamedOneHasAssociators) {
    setComputers({"alpha", "gamma"});
    EXPECT_THAT(stringsOf(associatorNames(keyedPath(kind().element, ofGamma)).paths()), ElementsAre(computer("alpha")));
}

TEST_P(AssociationNamelessTest, AComputerPathWithoutKeysIsAssociatedWithEveryRecord) {
    writeRecordFile({"A", "B"});
    EXPECT_THAT(stringsOf(associatorNames(classPath("VELKO_ComputerSystem")).paths()),
                ElementsAre(element("A"), element("B")));
}

}  // namespace
}  // namespace contract
