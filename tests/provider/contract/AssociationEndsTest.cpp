#include "AssociationFixture.h"

#include <optional>
#include <utility>

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
    void expectSwallowed(const Outcome& outcome, const char* message) {
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

TEST_P(AssociationEndsTest, AComputerIsAssociatedWithTheRecordWhoseIdentifierIsItsPath) {
    haveRecords({"A", ofAlpha, ofBeta, "B"});
    for (const auto& [name, identifier] : {std::pair("alpha", ofAlpha), std::pair("beta", ofBeta)}) {
        const Outcome outcome = associatorNames(computerPath(name));
        EXPECT_THAT(outcome, isOk(1));
        EXPECT_THAT(textsOf(outcome.paths()), ElementsAre(element(identifier)));
    }
    EXPECT_EQ(upCalls(), 0) << "computer systems are not asked for";
}

TEST_P(AssociationEndsTest, AComputerWithoutARecordHasNoAssociators) {
    haveRecords({"A", ofAlpha});
    const Outcome outcome = associatorNames(computerPath("gamma"));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(outcome.paths(), IsEmpty());
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AssociationEndsTest, AnUnknownComputerHasNoAssociators) {
    haveRecords({"A", ofAlpha});
    for (const char* name : {"delta", "ALPHA", "alpha ", ""}) {
        const Outcome outcome = associatorNames(computerPath(name));
        EXPECT_THAT(outcome, isOk(1)) << name;
        EXPECT_THAT(outcome.paths(), IsEmpty()) << name;
    }
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AssociationEndsTest, AssociatorsAreTheSameAsTheInstancesOfTheElementClass) {
    haveRecords({"A", ofAlpha});
    const Outcome outcome = associators(computerPath("alpha"));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_EQ(textsOf(outcome.instances()),
              textsOf(provider().getInstance(keyedPath(kind().element, ofAlpha)).instances()));
    EXPECT_EQ(outcome.instances().size(), 1U);
}

TEST_P(AssociationEndsTest, AComputerPathWithoutKeysIsAssociatedWithEveryRecord) {
    haveRecords({"A", ofAlpha, "B"});
    const Outcome outcome = associatorNames(computerWithKeys({}));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(textsOf(outcome.paths()), ElementsAre(element("A"), element(ofAlpha), element("B")));
    EXPECT_EQ(associators(computerWithKeys({})).instances().size(), 3U);
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AssociationEndsTest, TheNameMayFollowOtherKeys) {
    haveRecords({ofBeta});
    const ObjectPath source =
        computerWithKeys({named("CreationClassName", text("VELKO_ComputerSystem")), named("Name", text("beta"))});
    EXPECT_THAT(textsOf(associatorNames(source).paths()), ElementsAre(element(ofBeta)));
}

TEST_P(AssociationEndsTest, KeysWithoutANameFail) {
    haveRecords({ofAlpha});
    expectSwallowed(associatorNames(computerWithKeys({named("CreationClassName", text("alpha"))})),
                    "Could not find 'Name' Key in Moniker");
}

TEST_P(AssociationEndsTest, TheNameOfTheKeyIsCaseSensitive) {
    haveRecords({ofAlpha});
    expectSwallowed(associators(computerWithKeys({named("name", text("alpha"))})),
                    "Could not find 'Name' Key in Moniker");
}

TEST_P(AssociationEndsTest, ANullNameFails) {
    haveRecords({ofAlpha});
    expectSwallowed(associatorNames(computerWithKeys({named("Name", testsupport::nullOf(CMPI_string))})),
                    "Could not find 'Name' Key in Moniker");
}

TEST_P(AssociationEndsTest, ElementPathsAreInTheSourcesNamespace) {
    haveRecords({ofAlpha});
    const Outcome outcome =
        associatorNames(objectPath("root/other", "VELKO_ComputerSystem", {named("Name", text("alpha"))}));
    ASSERT_EQ(outcome.paths().size(), 1U);
    EXPECT_EQ(outcome.paths()[0].nameSpace, "root/other");
}

// Associators of records.

TEST_P(AssociationEndsTest, TheLastComputerSystemIsOmitted) {
    const ObjectPath source = keyedPath(kind().element, ofAlpha);
    knowComputers({"alpha"});
    EXPECT_THAT(textsOf(associatorNames(source).paths()), IsEmpty());
    EXPECT_THAT(associatorNames(source), isOk(1));
    knowComputers({"alpha", "beta"});
    EXPECT_THAT(textsOf(associatorNames(source).paths()), ElementsAre(computer("alpha")));
    knowComputers({"alpha", "beta", "gamma"});
    const Outcome three = associatorNames(source);
    EXPECT_THAT(three, isOk(1));
    EXPECT_THAT(textsOf(three.paths()), ElementsAre(computer("alpha"), computer("beta")));
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AssociationEndsTest, ComputerSystemsAreReturnedUnchanged) {
    knowComputers({"alpha", "beta", "gamma"});
    const Outcome outcome = associators(keyedPath(kind().element, ofAlpha));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_EQ(textsOf(outcome.instances()), textsOf({computerSystem("alpha"), computerSystem("beta")}));
}

TEST_P(AssociationEndsTest, TheIdentifierDoesNotRestrictTheComputers) {
    knowComputers({"alpha", "beta", "gamma"});
    EXPECT_THAT(textsOf(associatorNames(keyedPath(kind().element, ofGamma)).paths()),
                ElementsAre(computer("alpha"), computer("beta")));
    const auto calls = broker.calls("CMPIBrokerFT.enumerateInstances");
    ASSERT_EQ(calls.size(), 1U);
    EXPECT_THAT(calls[0].arguments, ElementsAre(computer("gamma"), "null"));
}

TEST_P(AssociationEndsTest, TheRecordNeedNotExist) {
    knowComputers({"alpha", "beta"});
    EXPECT_THAT(textsOf(associatorNames(keyedPath(kind().element, ofBeta)).paths()), ElementsAre(computer("alpha")));
}

TEST_P(AssociationEndsTest, AnElementPathWithoutKeysIsAccepted) {
    knowComputers({"alpha", "beta"});
    const Outcome outcome = associatorNames(classPath(kind().element));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(textsOf(outcome.paths()), ElementsAre(computer("alpha")));
    EXPECT_THAT(broker.calls("CMPIBrokerFT.enumerateInstances").at(0).arguments,
                ElementsAre("root/cimv2:VELKO_ComputerSystem", "null"));
}

TEST_P(AssociationEndsTest, AnElementWithKeysButNoIdentifierFails) {
    knowComputers({"alpha", "beta"});
    expectSwallowed(associatorNames(objectPath(nameSpace, kind().element, {named("instanceid", text(ofAlpha))})),
                    "Could not find 'InstanceID' Key in Moniker");
    EXPECT_EQ(upCalls(), 0);
}

TEST_P(AssociationEndsTest, AnElementWhoseOnlyKeyIsNullFails) {
    haveRecords({ofAlpha});
    knowComputers({"alpha", "beta"});
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
    haveRecords({"A"});
    knowComputers({"alpha", "beta"});
    expectSwallowed(associators(keyedPath(kind().element, "A")), "Name Property on computer not available.");
    EXPECT_EQ(upCalls(), 0);
}

TEST_P(AssociationEndsTest, BothDirectionsAreInverse) {
    haveRecords({ofAlpha, ofBeta, ofGamma});
    knowComputers({"alpha", "beta"});
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
    haveRecords({ofAlpha});
    knowComputers({"alpha", "beta"});
    for (const ObjectPath& source : {keyedPath(kind().otherElement, ofAlpha), classPath(kind().otherElement)}) {
        const Outcome outcome = associatorNames(source);
        EXPECT_THAT(outcome, isOk(1));
        EXPECT_EQ(outcome.events.size(), 1U);
    }
    EXPECT_EQ(upCalls(), 0);
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AssociationEndsTest, SourcesOfOtherClassesHaveNoAssociators) {
    haveRecords({ofAlpha});
    knowComputers({"alpha", "beta"});
    for (const char* className :
         {"VELKO_OstrelAgent", "VELKO_AssetIDDetails", kind().associationOfOthers, "CIM_ComputerSystem", ""}) {
        const Outcome outcome = associators(objectPath(nameSpace, className, {named("Name", text("alpha"))}));
        EXPECT_THAT(outcome, isOk(1)) << className;
        EXPECT_EQ(outcome.events.size(), 1U) << className;
    }
    EXPECT_EQ(upCalls(), 0);
}

TEST_P(AssociationEndsTest, AnAssociationAsSourceHasNoAssociators) {
    haveRecords({"A", "B"});
    knowComputers({"alpha"});
    for (const Outcome& outcome :
         {associatorNames(classPath(kind().association)), associators(classPath(kind().association))}) {
        EXPECT_THAT(outcome, isOk(1));
        EXPECT_EQ(outcome.events.size(), 1U);
    }
}

TEST_P(AssociationEndsTest, ThePropertyListIsNotAppliedAtEitherEnd) {
    haveRecords({ofAlpha});
    knowComputers({"alpha", "beta"});
    const std::vector<std::string> one{"ElementName"};
    for (const ObjectPath& source : {computerPath("alpha"), keyedPath(kind().element, ofAlpha)}) {
        EXPECT_EQ(textsOf(associators(source, one).instances()), textsOf(associators(source).instances()));
    }
    EXPECT_EQ(broker.calls("CMPIBrokerFT.enumerateInstances").at(0).arguments.at(1), "null");
}

TEST_P(AssociationEndsTest, ResultClassAndRolesAreIgnored) {
    haveRecords({ofAlpha});
    knowComputers({"alpha", "beta"});
    cimhost::AssociationFilter filter = through();
    filter.resultClass = "VELKO_OstrelAgent";
    filter.role = "Dependent";
    filter.resultRole = "Nonsense";
    EXPECT_THAT(textsOf(provider().associatorNames(computerPath("alpha"), filter).paths()),
                ElementsAre(element(ofAlpha)));
    EXPECT_EQ(provider().associators(keyedPath(kind().element, ofAlpha), filter).instances().size(), 1U);
}

TEST_P(AssociationEndsTest, OnlyTheTwoAssociationClassesAreServed) {
    haveRecords({ofAlpha});
    knowComputers({"alpha", "beta"});
    for (const std::optional<std::string>& className : std::vector<std::optional<std::string>>{
             std::nullopt, "", "VELKO_Lease", "VELKO_Warranty", "VELKO_OstrelAgent", "VELKO_AssetIDDetails",
             "VELKO_ComputerSystem", "CIM_ElementSettingData"}) {
        const cimhost::AssociationFilter filter{className, {}, {}, {}};
        EXPECT_THAT(provider().associators(computerPath("alpha"), filter), isRefused(CMPI_RC_ERR_INVALID_CLASS));
        EXPECT_THAT(provider().associatorNames(computerPath("alpha"), filter), isRefused(CMPI_RC_ERR_INVALID_CLASS));
    }
}

TEST_P(AssociationEndsTest, ReferencesAreNotSupported) {
    haveRecords({ofAlpha});
    knowComputers({"alpha", "beta"});
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
    EXPECT_THAT(textsOf(associatorNames(computerPath("alpha")).paths()), ElementsAre(element(ofAlpha)));
    EXPECT_THAT(textsOf(associatorNames(computerPath("beta")).paths()), ElementsAre(element(ofBeta)));
    knowComputers({"alpha", "beta"});
    EXPECT_THAT(textsOf(associatorNames(keyedPath(kind().element, ofBeta)).paths()), ElementsAre(computer("alpha")));
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

    AgentNodes nodes;
};

INSTANTIATE_TEST_SUITE_P(Kinds, AssociationNamelessTest, testing::Values(leases, warranties), associationName);

TEST_P(AssociationNamelessTest, AComputerBeforeAnUnnamedOneIsFound) {
    haveRecords({ofAlpha});
    EXPECT_THAT(textsOf(associatorNames(computerPath("alpha")).paths()), ElementsAre(element(ofAlpha)));
}

TEST_P(AssociationNamelessTest, TheSearchForAComputerAfterAnUnnamedOneFails) {
    haveRecords({ofGamma});
    for (const char* name : {"gamma", "delta"}) {
        agentEnvironment::forgetLog();
        const Outcome outcome = associatorNames(computerPath(name));
        EXPECT_THAT(outcome, isOk(0));
        EXPECT_THAT(outcome.events, IsEmpty());
        EXPECT_THAT(caughtFailures(), ElementsAre("Name Property on Computer Node not available."));
    }
}

TEST_P(AssociationNamelessTest, ARecordOfAnUnnamedComputerFails) {
    knowComputers({"alpha", "beta"});
    const Outcome outcome = associatorNames(keyedPath(kind().element, "/system/nameless"));
    EXPECT_THAT(outcome, isOk(0));
    EXPECT_THAT(outcome.events, IsEmpty());
    EXPECT_THAT(caughtFailures(), ElementsAre("Name Property on computer not available."));
}

TEST_P(AssociationNamelessTest, ARecordOfAComputerAfterAnUnnamedOneHasAssociators) {
    knowComputers({"alpha", "gamma"});
    EXPECT_THAT(textsOf(associatorNames(keyedPath(kind().element, ofGamma)).paths()), ElementsAre(computer("alpha")));
}

TEST_P(AssociationNamelessTest, AComputerPathWithoutKeysIsAssociatedWithEveryRecord) {
    haveRecords({"A", "B"});
    EXPECT_THAT(textsOf(associatorNames(classPath("VELKO_ComputerSystem")).paths()),
                ElementsAre(element("A"), element("B")));
}

}  // namespace
}  // namespace contract
