#include "RecordFixture.h"
#include "support/Values.h"

// Reading and deleting records.

namespace contract {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::named;
using testsupport::text;
using testsupport::uint32;

class RecordRequestTest : public RecordTest {
protected:
    /** Returns the path with these keys. */
    ObjectPath pathWithKeys(std::vector<NamedValue> keys) const {
        return testsupport::objectPath(nameSpace, kind().className, std::move(keys));
    }
};

TEST_P(RecordRequestTest, AMissingDataFileMeansNoRecordsAndReadingDoesNotCreateTheFile) {
    EXPECT_THAT(provider().enumerateInstances(allPath()), isOk(1));
    EXPECT_THAT(identifiers(), IsEmpty());
    EXPECT_THAT(recordOf("1"), IsEmpty());
    EXPECT_EQ(data(), std::nullopt);
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(RecordRequestTest, EnumerationReturnsRecordsInTheOrderOfCreation) {
    createAll({"C", "A", "B"});
    EXPECT_THAT(identifiers(), ElementsAre("C", "A", "B"));
    const Outcome outcome = provider().enumerateInstances(allPath());
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(identifiersOf(outcome.instances()), ElementsAre("C", "A", "B"));
    EXPECT_TRUE(std::holds_alternative<cimhost::Done>(outcome.events.back())) << "returnDone is called last";
}

TEST_P(RecordRequestTest, PathsHaveTheClassTheRequestsNamespaceAndOneKey) {
    createAll({"A"});
    const ObjectPath asked = testsupport::objectPath("root/velko/deep", kind().className);
    const std::vector<ObjectPath> paths = provider().enumerateInstanceNames(asked).paths();
    ASSERT_EQ(paths.size(), 1U);
    EXPECT_EQ(testsupport::toText(paths.front()),
              "root/velko/deep:" + std::string(kind().className) + ".InstanceID=\"A\"");
    const std::vector<Instance> instances = provider().enumerateInstances(asked).instances();
    ASSERT_EQ(instances.size(), 1U);
    EXPECT_EQ(testsupport::toText(instances.front().path), testsupport::toText(paths.front()));
}

TEST_P(RecordRequestTest, GetReturnsTheRecordWithAllPropertiesThatHaveAValue) {
    createAll({"A", "B"});
    EXPECT_EQ(recordOf("B"), kind().shownRecord("B"));
}

TEST_P(RecordRequestTest, GetOfAnUnknownKeyReturnsNothingAndCallsReturnDone) {
    createAll({"A"});
    const Outcome outcome = get("missing");
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_EQ(outcome.events.size(), 1U);
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(RecordRequestTest, IdentifiersAreComparedByteByByte) {
    createAll({"Alpha"});
    for (const char* other : {"alpha", "Alph", "Alpha ", " Alpha", "Alphaa", ""}) {
        EXPECT_THAT(recordOf(other), IsEmpty()) << "'" << other << "'";
    }
    EXPECT_EQ(recordOf("Alpha"), kind().shownRecord("Alpha"));
}

TEST_P(RecordRequestTest, EnumerationOfAPathWithAKeyReturnsOnlyThatRecord) {
    createAll({"A", "B", "C"});
    EXPECT_THAT(identifiersOf(provider().enumerateInstanceNames(path("B")).paths()), ElementsAre("B"));
    EXPECT_THAT(identifiersOf(provider().enumerateInstances(path("C")).instances()), ElementsAre("C"));
}

TEST_P(RecordRequestTest, PropertyListsAreNotApplied) {
    createAll({"A"});
    for (const cimhost::PropertyList& list :
         {cimhost::PropertyList({kind().textProperty}), cimhost::PropertyList({"NoSuchProperty"}),
          cimhost::PropertyList(std::vector<std::string>{})}) {
        const std::vector<Instance> got = provider().getInstance(path("A"), list).instances();
        ASSERT_EQ(got.size(), 1U);
        EXPECT_EQ(shown(got.front().properties), kind().shownRecord("A"));
        const std::vector<Instance> all = provider().enumerateInstances(allPath(), list).instances();
        ASSERT_EQ(all.size(), 1U);
        EXPECT_EQ(shown(all.front().properties), kind().shownRecord("A"));
    }
    EXPECT_EQ(broker.count("CMPIInstanceFT.setPropertyFilter"), 0);
}

TEST_P(RecordRequestTest, GetWithoutAKeyReturnsAllRecords) {
    createAll({"A", "B"});
    const Outcome outcome = provider().getInstance(allPath());
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(identifiersOf(outcome.instances()), ElementsAre("A", "B"));
}

TEST_P(RecordRequestTest, GetByAnotherKeyReturnsAllRecords) {
    createAll({"A", "B"});
    const Outcome outcome = provider().getInstance(pathWithKeys({named("Name", text("A"))}));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(identifiersOf(outcome.instances()), ElementsAre("A", "B"));
}

TEST_P(RecordRequestTest, GetByAKeyOfAnotherTypeReturnsAllRecords) {
    createAll({"1", "2"});
    for (const cimhost::Value& key :
         {uint32(1), testsupport::boolean(true), testsupport::sint64(2), testsupport::reference(path("1")),
          testsupport::dateTime("20240506070809.000000+000")}) {
        const Outcome outcome = provider().getInstance(pathWithKeys({named("InstanceID", key)}));
        EXPECT_THAT(outcome, isOk(1));
        EXPECT_THAT(identifiersOf(outcome.instances()), ElementsAre("1", "2"));
    }
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(RecordRequestTest, FurtherKeysAreIgnored) {
    createAll({"A", "B"});
    const ObjectPath two = pathWithKeys({named("Extra", uint32(7)), named("InstanceID", text("B"))});
    EXPECT_THAT(identifiersOf(provider().getInstance(two).instances()), ElementsAre("B"));
    EXPECT_THAT(provider().deleteInstance(two), isOk(0));
    EXPECT_THAT(identifiers(), ElementsAre("A"));
}

TEST_P(RecordRequestTest, TheNameOfTheKeyIsCaseInsensitive) {
    createAll({"A", "B"});
    const ObjectPath folded = pathWithKeys({named("instanceid", text("B"))});
    EXPECT_THAT(identifiersOf(provider().getInstance(folded).instances()), ElementsAre("B"));
}

TEST_P(RecordRequestTest, DeletionReturnsNothingAndDoesNotCallReturnDone) {
    createAll({"A", "B", "C"});
    const Outcome outcome = remove("B");
    EXPECT_THAT(outcome, isOk(0));
    EXPECT_THAT(outcome.events, IsEmpty());
    EXPECT_THAT(identifiers(), ElementsAre("A", "C"));
    EXPECT_EQ(data(), dataOfNew({"A", "C"}));
}

TEST_P(RecordRequestTest, DeletionOfTheLastRecordLeavesAFileWithNoRecords) {
    createAll({"A"});
    EXPECT_THAT(remove("A"), isOk(0));
    EXPECT_EQ(data(), "0\n");
    EXPECT_THAT(identifiers(), IsEmpty());
    EXPECT_THAT(provider().enumerateInstances(allPath()), isOk(1));
    EXPECT_THAT(recordOf("A"), IsEmpty());
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(RecordRequestTest, DeletionOfAnUnknownRecordIsOnlyLogged) {
    createAll({"A"});
    EXPECT_THAT(remove("B"), isOk(0));
    EXPECT_THAT(caughtFailures(), ElementsAre(kind().notAvailable));
    EXPECT_THAT(identifiers(), ElementsAre("A"));
    EXPECT_EQ(data(), dataOfNew({"A"}));
}

TEST_P(RecordRequestTest, DeletionWithoutAKeyIsOnlyLogged) {
    createAll({"A", "B"});
    EXPECT_THAT(provider().deleteInstance(allPath()), isOk(0));
    EXPECT_THAT(caughtFailures(), ElementsAre(kind().identify));
    EXPECT_THAT(identifiers(), ElementsAre("A", "B"));
}

TEST_P(RecordRequestTest, DeletionByAKeyOfAnotherTypeIsOnlyLogged) {
    createAll({"1"});
    EXPECT_THAT(provider().deleteInstance(pathWithKeys({named("InstanceID", uint32(1))})), isOk(0));
    EXPECT_THAT(caughtFailures(), ElementsAre(kind().identify));
    EXPECT_THAT(identifiers(), ElementsAre("1"));
}

TEST_P(RecordRequestTest, DeletionFromAnEmptyTableIsOnlyLogged) {
    EXPECT_THAT(provider().deleteInstance(allPath()), isOk(0));
    EXPECT_THAT(remove("A"), isOk(0));
    EXPECT_EQ(caughtFailures().size(), 2U);
    EXPECT_EQ(data(), std::nullopt);
}

TEST_P(RecordRequestTest, ADeletedRecordCanBeCreatedAgainAtTheEnd) {
    createAll({"A", "B"});
    EXPECT_THAT(modify("A", {named(kind().textProperty, text("before"))}), isOk(0));
    EXPECT_THAT(remove("A"), isOk(0));
    createAll({"A"});
    EXPECT_THAT(identifiers(), ElementsAre("B", "A"));
    EXPECT_EQ(recordOf("A"), kind().shownRecord("A")) << "the deleted record is removed completely";
    EXPECT_EQ(data(), dataOfNew({"B", "A"}));
}

TEST_P(RecordRequestTest, ReadingDoesNotRewriteTheFile) {
    writeData(kind().dataFile, dataOfNew({"A"}));
    EXPECT_THAT(identifiers(), ElementsAre("A"));
    writeData(kind().dataFile, "written by another program");
    EXPECT_EQ(recordOf("A"), kind().shownRecord("A"));
    provider().enumerateInstances(allPath());
    EXPECT_THAT(modify("A", {}), isOk(0));
    EXPECT_THAT(remove("missing"), isOk(0));
    EXPECT_EQ(data(), "written by another program");
}

TEST_P(RecordRequestTest, AChangeOverwritesExternalChangesToTheFile) {
    createAll({"A"});
    writeData(kind().dataFile, dataOfNew({"X", "Y", "Z"}));
    EXPECT_THAT(identifiers(), ElementsAre("A"));
    createAll({"B"});
    EXPECT_EQ(data(), dataOfNew({"A", "B"}));
}

INSTANTIATE_RECORD_TEST(RecordRequestTest);

TEST_F(ProviderTest, LeasesAndWarrantiesShareNoData) {
    const auto create = [&](const RecordClass& kind) {
        return provider().createInstance(keyedPath(kind.className, "same"),
                                         clientInstance(keyedPath(kind.className, "same"), {}));
    };
    EXPECT_EQ(create(lease).instances().size(), 1U);
    EXPECT_EQ(readData(warranty.dataFile), std::nullopt);
    EXPECT_EQ(create(warranty).instances().size(), 1U) << "a lease and a warranty can have the same identifier";
    EXPECT_THAT(provider().deleteInstance(keyedPath(lease.className, "same")), isOk(0));
    EXPECT_THAT(identifiersOf(provider().enumerateInstanceNames(classPath(warranty.className)).paths()),
                ElementsAre("same"));
    EXPECT_EQ(readData(lease.dataFile), "0\n");
}

}  // namespace
}  // namespace contract
