#include <cctype>

#include "AssociationFixture.h"

// Enumeration of an association class: pairs of a computer system and a record.

namespace contract {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class AssociationListTest : public AssociationTest {};

INSTANTIATE_TEST_SUITE_P(Kinds, AssociationListTest, testing::Values(leases, warranties), associationName);

TEST_P(AssociationListTest, OneComputerIsPairedWithEachRecord) {
    writeRecordFile({"A", "B", "C"});
    setComputers({"alpha"});
    const Outcome outcome = names();
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(stringsOf(outcome.paths()), ElementsAre(pair("alpha", "A"), pair("alpha", "B"), pair("alpha", "C")));
    EXPECT_EQ(outcome.events.size(), 4U) << "three paths and done";
}

TEST_P(AssociationListTest, PathsHaveBothEndsAsKeys) {
    writeRecordFile({"A"});
    setComputers({"alpha"});
    const ObjectPath path = names().paths().at(0);
    EXPECT_EQ(path.className, kind().association);
    EXPECT_EQ(path.nameSpace, nameSpace);
    EXPECT_THAT(testsupport::namesOf(path.keys), ElementsAre("Antecedent", "Dependent"));
    EXPECT_EQ(path.keys.at(0).value.type, CMPI_ref);
    EXPECT_EQ(path.keys.at(1).value.type, CMPI_ref);
}

TEST_P(AssociationListTest, InstancesHaveOnlyTheKeyProperties) {
    writeRecordFile({"A", "B"});
    setComputers({"alpha"});
    const auto paths = names().paths();
    const Outcome outcome = instances();
    EXPECT_THAT(outcome, isOk(1));
    const auto found = outcome.instances();
    ASSERT_EQ(found.size(), 2U);
    for (std::size_t index = 0; index < found.size(); ++index) {
        EXPECT_EQ(testsupport::toText(found[index].path), testsupport::toText(paths.at(index)));
        EXPECT_EQ(shown(found[index].properties), shown(paths.at(index).keys));
    }
}

TEST_P(AssociationListTest, NoRecordAndOneComputerYieldNoPair) {
    setComputers({"alpha"});
    const Outcome outcome = names();
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(outcome.paths(), IsEmpty());
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AssociationListTest, NoRecordAndTwoComputersYieldOnePairWithoutAnElementKey) {
    setComputers({"alpha", "beta"});
    EXPECT_THAT(stringsOf(names().paths()), ElementsAre(pairWithoutElement("alpha")));
    const Outcome outcome = instances();
    EXPECT_THAT(outcome, isOk(1));
    ASSERT_EQ(outcome.instances().size(), 1U);
    const auto dependent = testsupport::referenceOf(outcome.instances()[0].properties, "Dependent");
    ASSERT_TRUE(dependent.has_value());
    EXPECT_EQ(testsupport::toText(*dependent), keylessElement());
}

TEST_P(AssociationListTest, OfTwoComputersTheFirstIsPairedWithAllRecords) {
    writeRecordFile({"A", "B"});
    setComputers({"alpha", "beta"});
    EXPECT_THAT(stringsOf(names().paths()), ElementsAre(pair("alpha", "A"), pair("alpha", "B")));
}

TEST_P(AssociationListTest, AComputerBetweenTheFirstAndTheLastIsPairedWithNoRecord) {
    writeRecordFile({"A", "B"});
    setComputers({"alpha", "beta", "gamma"});
    EXPECT_THAT(stringsOf(names().paths()),
                ElementsAre(pair("alpha", "A"), pair("alpha", "B"), pairWithoutElement("beta")));
}

TEST_P(AssociationListTest, NoRecordAndThreeComputersYieldTwoPairsWithoutAnElementKey) {
    setComputers({"alpha", "beta", "gamma"});
    EXPECT_THAT(stringsOf(names().paths()), ElementsAre(pairWithoutElement("alpha"), pairWithoutElement("beta")));
}

TEST_P(AssociationListTest, ComputersNeedNotBeKnownToTheAgent) {
    writeRecordFile({"A"});
    setComputers({"unheard of"});
    EXPECT_THAT(stringsOf(names().paths()), ElementsAre(pair("unheard of", "A")));
}

TEST_P(AssociationListTest, DeletedRecordsAreInNoPair) {
    writeRecordFile({"A", "B", "C"});
    setComputers({"alpha"});
    ASSERT_THAT(provider().deleteInstance(keyedPath(kind().element, "B")), isOk(0));
    EXPECT_THAT(stringsOf(names().paths()), ElementsAre(pair("alpha", "A"), pair("alpha", "C")));
}

TEST_P(AssociationListTest, RecordsOfTheOtherClassAreInNoPair) {
    const AssociationKind& other = std::string(kind().element) == leases.element ? warranties : leases;
    writeData(other.dataFile, recordFile(other, {"X"}));
    writeRecordFile({"A"});
    setComputers({"alpha"});
    EXPECT_THAT(stringsOf(names().paths()), ElementsAre(pair("alpha", "A")));
}

TEST_P(AssociationListTest, ComputersAreEnumeratedInTheRequestsNamespace) {
    writeRecordFile({"A"});
    setComputers({"alpha"});
    const Outcome outcome =
        provider().enumerateInstanceNames(testsupport::objectPath("root/other", kind().association));
    const auto calls = broker.calls("CMPIBrokerFT.enumerateInstances");
    ASSERT_EQ(calls.size(), 1U);
    EXPECT_THAT(calls[0].arguments, ElementsAre("root/other:VELKO_ComputerSystem", "null"));
    ASSERT_EQ(outcome.paths().size(), 1U);
    EXPECT_EQ(outcome.paths()[0].nameSpace, "root/other");
    const auto dependent = testsupport::referenceOf(outcome.paths()[0].keys, "Dependent");
    ASSERT_TRUE(dependent.has_value());
    EXPECT_EQ(dependent->nameSpace, "root/other");
}

TEST_P(AssociationListTest, KeysOfTheRequestsPathAreIgnored) {
    writeRecordFile({"A", "B"});
    setComputers({"alpha"});
    const ObjectPath keyed = association(computerPath("alpha"), keyedPath(kind().element, "B"));
    EXPECT_THAT(stringsOf(provider().enumerateInstanceNames(keyed).paths()),
                ElementsAre(pair("alpha", "A"), pair("alpha", "B")));
}

TEST_P(AssociationListTest, ThePropertyListIsNotApplied) {
    writeRecordFile({"A"});
    setComputers({"alpha"});
    const auto all = stringsOf(instances().instances());
    const Outcome narrowed =
        provider().enumerateInstances(classPath(kind().association), std::vector<std::string>{"Dependent"});
    EXPECT_EQ(stringsOf(narrowed.instances()), all);
}

TEST_P(AssociationListTest, TheClassNameIsCaseInsensitive) {
    writeRecordFile({"A"});
    setComputers({"alpha"});
    std::string lowered = kind().association;
    for (char& character : lowered) {
        character = static_cast<char>(std::tolower(static_cast<unsigned char>(character)));
    }
    EXPECT_THAT(stringsOf(provider().enumerateInstanceNames(classPath(lowered)).paths()),
                ElementsAre(pair("alpha", "A")));
}

TEST_P(AssociationListTest, EnumerationChangesNothing) {
    writeRecordFile({"A"});
    setComputers({"alpha"});
    const auto before = readData(kind().dataFile);
    names();
    instances();
    EXPECT_EQ(readData(kind().dataFile), before);
}

TEST_P(AssociationListTest, GetInstanceIsNotSupported) {
    writeRecordFile({"A"});
    setComputers({"alpha"});
    const ObjectPath existing = names().paths().at(0);
    EXPECT_THAT(provider().getInstance(existing), isRefused(CMPI_RC_ERR_NOT_SUPPORTED));
    EXPECT_EQ(upCalls(), 1) << "only the call of the enumeration";
}

TEST_P(AssociationListTest, AssociationsCannotBeCreatedModifiedOrDeleted) {
    writeRecordFile({"A"});
    setComputers({"alpha"});
    const ObjectPath path = names().paths().at(0);
    const Instance instance = clientInstance(path, path.keys);
    EXPECT_THAT(provider().createInstance(path, instance), isRefused(CMPI_RC_ERR_INVALID_CLASS));
    EXPECT_THAT(provider().modifyInstance(path, instance), isRefused(CMPI_RC_ERR_INVALID_CLASS));
    EXPECT_THAT(provider().deleteInstance(path), isRefused(CMPI_RC_ERR_INVALID_CLASS));
    EXPECT_THAT(stringsOf(names().paths()), ElementsAre(pair("alpha", "A")));
}

}  // namespace
}  // namespace contract
