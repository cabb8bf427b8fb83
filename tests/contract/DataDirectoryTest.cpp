#include "RecordFixture.h"

// Requests while the data file or its directory is not accessible.

namespace contract {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;
using testsupport::named;
using testsupport::text;

class DataDirectoryTest : public RecordTest {
protected:
    /** Expects that the store and the entry point logged the failed rewrite at error level on both channels. */
    void expectRewriteFailure() {
        EXPECT_THAT(loggedFailures(), ElementsAre(kind().cannotOpen, kind().cannotOpen));
        EXPECT_THAT(loggedFailures("trace"), ElementsAre(kind().cannotOpen, kind().cannotOpen));
        EXPECT_THAT(caughtFailures(), ElementsAre(kind().cannotOpen));
        agentEnvironment::forgetLog();
    }
};

TEST_P(DataDirectoryTest, CreationWithoutADirectoryReturnsTheInstanceAndKeepsItInMemory) {
    std::filesystem::remove_all(agentEnvironment::dataDirectory());
    const Outcome outcome = create("A");
    EXPECT_THAT(outcome, isOk(1)) << "returnDone is called before the file is written";
    EXPECT_THAT(identifiersOf(outcome.instances()), ElementsAre("A"));
    expectRewriteFailure();
    EXPECT_THAT(identifiers(), ElementsAre("A"));
    EXPECT_FALSE(std::filesystem::exists(agentEnvironment::dataDirectory())) << "the provider creates no directory";
}

TEST_P(DataDirectoryTest, ChangesToAFileThatCannotBeOpenedStayInMemory) {
    createAll({"A", "B"});
    blockData(kind().dataFile);
    EXPECT_THAT(modify("A", {named(kind().textProperty, text("changed"))}), isOk(0));
    expectRewriteFailure();
    EXPECT_THAT(remove("B"), isOk(0));
    expectRewriteFailure();
    EXPECT_EQ(recordOf("A"), kind().shownRecord("A", {std::string(kind().textProperty) + "=\"changed\""}));
    EXPECT_THAT(identifiers(), ElementsAre("A"));
    EXPECT_THAT(loggedFailures(), IsEmpty()) << "reading needs no file";
}

TEST_P(DataDirectoryTest, TheNextSuccessfulChangeWritesAllRecords) {
    blockData(kind().dataFile);
    create("A");
    create("B");
    freeData(kind().dataFile);
    EXPECT_EQ(data(), std::nullopt);
    EXPECT_THAT(identifiers(), ElementsAre("A", "B"));
    EXPECT_EQ(data(), std::nullopt) << "reading writes nothing";
    createAll({"C"});
    EXPECT_EQ(data(), dataOfNew({"A", "B", "C"}));
}

TEST_P(DataDirectoryTest, AFailedRequestDoesNotWriteTheFile) {
    create("A");
    blockData(kind().dataFile);
    agentEnvironment::forgetLog();
    EXPECT_THAT(create("A"), isOk(0));
    EXPECT_THAT(caughtFailures(), ElementsAre(kind().exists));
    EXPECT_THAT(remove("missing"), isOk(0));
    EXPECT_THAT(loggedFailures(), testing::Not(testing::Contains(kind().cannotOpen)));
}

TEST_P(DataDirectoryTest, ADirectoryInPlaceOfTheFileLoadsAsAnEmptyTable) {
    blockData(kind().dataFile);
    EXPECT_THAT(identifiers(), IsEmpty());
    EXPECT_THAT(provider().enumerateInstances(allPath()), isOk(1));
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(DataDirectoryTest, AMissingDirectoryLoadsAsAnEmptyTable) {
    std::filesystem::remove_all(agentEnvironment::dataDirectory());
    EXPECT_THAT(identifiers(), IsEmpty());
    EXPECT_THAT(loggedFailures(), IsEmpty());
    std::filesystem::create_directories(agentEnvironment::dataDirectory());
    createAll({"A"});
    EXPECT_EQ(data(), dataOfNew({"A"}));
}

TEST_P(DataDirectoryTest, AFullDeviceDoesNotTerminateTheProcess) {
    create("A");
    freeData(kind().dataFile);
    std::filesystem::create_symlink("/dev/full", dataFile(kind().dataFile));
    EXPECT_THAT(create("B"), isOk(1));
    EXPECT_THAT(identifiers(), ElementsAre("A", "B"));
    freeData(kind().dataFile);
    createAll({"C"});
    EXPECT_EQ(data(), dataOfNew({"A", "B", "C"}));
}

TEST_P(DataDirectoryTest, TheOtherClassIsNotAffected) {
    blockData(kind().dataFile);
    const RecordClass& other = std::string(kind().name) == "Lease" ? warranty : lease;
    const ObjectPath otherPath = keyedPath(other.className, "A");
    EXPECT_THAT(provider().createInstance(otherPath, clientInstance(otherPath, {})).instances(), SizeIs(1));
    EXPECT_THAT(loggedFailures(), IsEmpty());
    EXPECT_EQ(readData(other.dataFile), "1\n" + other.newRecord("A"));
}

INSTANTIATE_RECORD_TEST(DataDirectoryTest);

}  // namespace
}  // namespace contract
