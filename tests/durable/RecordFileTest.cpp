#include "durable/RecordFile.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sys/stat.h>

#include <filesystem>
#include <string>
#include <system_error>

#include "support/Files.h"

namespace durable {
namespace {

namespace fs = std::filesystem;
using testing::AllOf;
using testing::HasSubstr;
using testing::IsEmpty;
using testsupport::readFile;
using testsupport::writeFile;

/** A warranty file with these identifiers. */
std::string records(std::initializer_list<const char*> identifiers) {
    std::string content = std::to_string(identifiers.size()) + "\n";
    for (const char* identifier : identifiers) {
        content += std::string(identifier) + "\nWarrantor\n20260101000000.000000+000\n12\n";
    }
    return content;
}

const std::string savedLine = "saved copy of Warranty.dat\n";

class RecordFileTest : public testing::Test {
protected:
    fs::path in(const char* name) const { return directory.path() / name; }

    const testsupport::TempDirectory directory;
    const RecordFile file = recordFileIn(directory.withSlash(), "Warranty.dat");
    const fs::path path = in("Warranty.dat");
    const fs::path saved = in("Warranty.dat.saved");
    const fs::path damaged = in("Warranty.dat.damaged");
    const fs::path unfinished = in("Warranty.dat.unfinished");
};

TEST_F(RecordFileTest, AFileIsCompleteIfItHasThePromisedLines) {
    for (const std::string& content : {records({"W1", "W2"}), records({}), std::string("0"), "\n " + records({"W1"}),
                                       "+" + records({"W1"}), records({"W1"}) + "a later line\n"}) {
        EXPECT_TRUE(file.isComplete(content)) << content;
    }
}

TEST_F(RecordFileTest, AFileIsIncompleteIfItIsCutOrHasNoCount) {
    const std::string content = records({"W1", "W2"});
    for (std::size_t length = 0; length < content.size(); ++length) {
        EXPECT_FALSE(file.isComplete(content.substr(0, length))) << length;
    }
    EXPECT_FALSE(file.isComplete("many\n" + content));
    EXPECT_FALSE(file.isComplete("-1\n"));
    EXPECT_FALSE(file.isComplete("4294967296\n"));
    std::string hole = content;
    hole[5] = '\0';
    EXPECT_FALSE(file.isComplete(hole)) << "as a file system leaves it after a power failure";
}

TEST_F(RecordFileTest, CountsTheRecordsOfAnIncompleteFile) {
    const std::string content = records({"W1", "W2", "W3"});
    EXPECT_EQ(RecordFile::promisedIn(content), 3U);
    EXPECT_EQ(file.presentIn(content), 3U);
    EXPECT_EQ(file.presentIn(content.substr(0, content.size() - 1)), 2U);
    EXPECT_EQ(file.presentIn("3\n"), 0U);
    EXPECT_EQ(RecordFile::promisedIn("none"), std::nullopt);
}

TEST_F(RecordFileTest, AnIncompleteFileIsRestoredFromTheSavedCopy) {
    writeFile(path, records({"W1"}));
    file.prepare();
    writeFile(path, "2\nW1\n");
    EXPECT_THAT(file.recover(), AllOf(HasSubstr("Warranty.dat was incomplete (records promised: 2, present: 0)"),
                                      HasSubstr("restored from the saved copy of 20")));
    EXPECT_EQ(readFile(path), records({"W1"}));
    EXPECT_EQ(readFile(damaged), "2\nW1\n");
    EXPECT_THAT(file.recover(), IsEmpty()) << "it is complete now";
}

TEST_F(RecordFileTest, ACompleteFileIsReplacedByTheSavedCopyOnRequest) {
    EXPECT_THAT(file.restoreSaved(), IsEmpty()) << "there is no copy";
    writeFile(path, records({"W1"}));
    file.prepare();
    writeFile(path, records({"W2"}));
    EXPECT_THAT(file.defect(), IsEmpty());
    EXPECT_THAT(file.restoreSaved(), HasSubstr("restored from the saved copy of 20"));
    EXPECT_EQ(readFile(path), records({"W1"}));
    EXPECT_EQ(readFile(damaged), records({"W2"}));
}

TEST_F(RecordFileTest, ReplacedRecordsAreInTheSavedCopyUntilTheNextChange) {
    writeFile(path, records({"W1"}));
    file.replace(records({"W2"}));
    EXPECT_EQ(readFile(path), records({"W2"}));
    EXPECT_EQ(readFile(saved), records({"W1"}) + savedLine);
    EXPECT_THAT(file.recover(), IsEmpty());
    EXPECT_EQ(file.prepare(), records({"W2"}));
    EXPECT_EQ(readFile(saved), records({"W2"}) + savedLine);
}

TEST_F(RecordFileTest, AMissingOrEmptyFileIsRestored) {
    for (const bool isEmpty : {false, true}) {
        writeFile(path, records({"W1"}));
        file.prepare();
        fs::remove(path);
        if (isEmpty) {
            writeFile(path, "");
        }
        EXPECT_THAT(file.recover(), HasSubstr(isEmpty ? "had no count of records" : "was missing"));
        EXPECT_EQ(readFile(path), records({"W1"}));
        EXPECT_FALSE(fs::exists(damaged));
    }
}

TEST_F(RecordFileTest, ACompleteFileWinsOverANewerSavedCopy) {
    writeFile(path, records({"W1"}));
    file.prepare();
    writeFile(path, records({"by_hand"}));
    fs::last_write_time(path, fs::file_time_type::clock::now() - std::chrono::hours(1));
    EXPECT_THAT(file.recover(), IsEmpty());
    EXPECT_EQ(readFile(path), records({"by_hand"}));
    file.prepare();
    EXPECT_EQ(readFile(saved), records({"by_hand"}) + savedLine);
}

TEST_F(RecordFileTest, AnOldSavedCopyIsUsedAndItsTimeIsLogged) {
    writeFile(path, records({"W1"}));
    file.prepare();
    fs::last_write_time(saved, fs::file_time_type::clock::now() - std::chrono::hours(24 * 365 * 3));
    writeFile(path, "");
    const std::string message = file.recover();
    EXPECT_THAT(message, testing::ContainsRegex("the saved copy of 20[0-9][0-9]-.*Z"));
    EXPECT_EQ(readFile(path), records({"W1"}));
}

TEST_F(RecordFileTest, ASavedCopyOfAnotherClassIsNotUsed) {
    const RecordFile leases = recordFileIn(directory.withSlash(), "Lease.dat");
    std::string content = "1\n";
    for (int line = 0; line < 13; ++line) {
        content += "1\n";
    }
    writeFile(in("Lease.dat"), content);
    leases.prepare();
    fs::copy_file(in("Lease.dat.saved"), saved);
    writeFile(path, "2\nW1\n");
    EXPECT_THAT(file.recover(), HasSubstr("no saved copy"));
    EXPECT_EQ(readFile(path), "2\nW1\n");
}

TEST_F(RecordFileTest, ASavedCopyThatIsCutIsNotUsed) {
    writeFile(path, records({"W1", "W2"}));
    file.prepare();
    const std::string complete = readFile(saved);
    writeFile(path, "2\n");
    for (std::size_t length = 0; length < complete.size(); ++length) {
        writeFile(saved, complete.substr(0, length));
        EXPECT_THAT(file.recover(), HasSubstr("no saved copy")) << length;
    }
}

TEST_F(RecordFileTest, WithoutSavedCopyTheIncompleteFileStaysAndIsKept) {
    writeFile(path, records({"W1", "W2"}).substr(0, 45));
    EXPECT_THAT(file.recover(), AllOf(HasSubstr("records promised: 2, present: 1"), HasSubstr(damaged.string())));
    EXPECT_EQ(readFile(path), records({"W1", "W2"}).substr(0, 45));
    EXPECT_EQ(readFile(damaged), readFile(path));
}

TEST_F(RecordFileTest, WithoutAnyFileThereIsNothingToRecover) {
    EXPECT_THAT(file.recover(), IsEmpty());
    EXPECT_TRUE(fs::is_empty(directory.path()));
}

TEST_F(RecordFileTest, AnUnfinishedChangeIsNotTakenForAnAnsweredOne) {
    writeFile(path, records({"W1"}));
    file.prepare();
    file.markUnfinished();
    writeFile(path, records({"W1", "W2"}));
    EXPECT_THAT(file.recover(), HasSubstr("held an unfinished change"));
    EXPECT_EQ(readFile(path), records({"W1"}));
    EXPECT_FALSE(fs::exists(unfinished));
}

TEST_F(RecordFileTest, ACommittedChangeIsSavedAndFinished) {
    writeFile(path, records({"W1"}));
    file.prepare();
    file.markUnfinished();
    writeFile(path, records({"W1", "W2"}));
    file.commit(records({"W1", "W2"}));
    EXPECT_THAT(file.recover(), IsEmpty());
    EXPECT_EQ(readFile(saved), records({"W1", "W2"}) + savedLine);
    EXPECT_FALSE(fs::exists(unfinished));
}

TEST_F(RecordFileTest, AChangeIsRolledBackWhateverTheSavedCopyIs) {
    const std::string before = records({"W1"});
    const std::string after = records({"W1", "W2"});
    for (const bool isCommitted : {false, true}) {
        writeFile(path, before);
        file.prepare();
        writeFile(path, after);
        if (isCommitted) {
            file.commit(after);
        }
        file.restore(before);
        EXPECT_EQ(readFile(path), before);
        EXPECT_FALSE(fs::exists(saved)) << "it became the file";
    }
}

TEST_F(RecordFileTest, TheSavedCopyHasTheModeOfTheFile) {
    writeFile(path, records({"W1"}));
    fs::permissions(path, fs::perms::owner_read | fs::perms::owner_write);
    file.prepare();
    EXPECT_EQ(fs::status(saved).permissions(), fs::perms::owner_read | fs::perms::owner_write);
}

TEST_F(RecordFileTest, AFileThatCannotBeReadIsAnErrorWithItsName) {
    fs::create_directory(path);
    try {
        file.recover();
        FAIL() << "a directory was read";
    } catch (const std::system_error& error) {
        EXPECT_THAT(error.what(), HasSubstr(path.string()));
    }
}

}  // namespace
}  // namespace durable
