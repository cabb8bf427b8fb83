#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>
#include <string>
#include <system_error>

#include "durable/RecordFile.h"
#include "support/Files.h"
#include "support/TemporaryDirectory.h"

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

/** The same file with one more record that has no values, as during its creation. */
std::string recordsAndNew(std::initializer_list<const char*> identifiers) {
    return std::to_string(identifiers.size() + 1) + records(identifiers).substr(1) +
           "new\n*\n00000000000000.000000-000\n0\n";
}

class RecordFileTest : public testing::Test {
protected:
    /** Prepares a change of the current content. */
    std::string prepare() const { return file.prepare(file.content().value_or(std::string())); }

    fs::path in(const char* name) const { return directory.path() / name; }

    const testsupport::TemporaryDirectory directory;
    const RecordFile file = recordFileIn(directory.withSlash(), "Warranty.dat");
    const fs::path path = in("Warranty.dat");
    const fs::path saved = in("Warranty.dat.saved1");  ///< the first copy
    const fs::path second = in("Warranty.dat.saved2");
    const fs::path damaged = in("Warranty.dat.damaged");
};

TEST_F(RecordFileTest, AUserWithAccessToTheFilesOverwritesTheCopiesOfAnotherUser) {
    writeFile(path, records({"W1"}));
    fs::permissions(path, fs::perms(0666));
    prepare();
    prepare();
    fs::permissions(directory.path(), fs::perms(0777));
    const pid_t child = fork();
    if (child == 0) {
        constexpr uid_t unprivileged = 65534;
        const bool isOther = geteuid() != 0 || setresuid(unprivileged, unprivileged, unprivileged) == 0;
        try {
            prepare();
            prepare();
        } catch (const std::exception&) {
            _exit(1);
        }
        _exit(isOther ? 0 : 2);
    }
    int status = -1;
    waitpid(child, &status, 0);
    EXPECT_EQ(status, 0);
    EXPECT_EQ(fs::status(saved).permissions(), fs::perms(0666));
}

TEST_F(RecordFileTest, AFileIsCompleteIfItHasAllLinesThatItsCountDeclares) {
    for (const std::string& content : {records({"W1", "W2"}), records({}), std::string("0"), "\n " + records({"W1"}),
                                       "+" + records({"W1"}), records({"W1"}) + "a later line\n"}) {
        EXPECT_TRUE(file.isComplete(content)) << content;
    }
}

TEST_F(RecordFileTest, AFileIsIncompleteIfItIsTruncatedOrHasNoCount) {
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
    EXPECT_EQ(RecordFile::declaredIn(content), 3U);
    EXPECT_EQ(file.presentIn(content), 3U);
    EXPECT_EQ(file.presentIn(content.substr(0, content.size() - 1)), 2U);
    EXPECT_EQ(file.presentIn("3\n"), 0U);
    EXPECT_EQ(RecordFile::declaredIn("none"), std::nullopt);
}

TEST_F(RecordFileTest, AnIncompleteFileIsRestoredFromTheSavedCopy) {
    writeFile(path, records({"W1"}));
    prepare();
    writeFile(path, "2\nW1\n");
    EXPECT_THAT(file.recover(), AllOf(HasSubstr("Warranty.dat was incomplete (records declared: 2, present: 0)"),
                                      HasSubstr("restored from the saved copy of 20")));
    EXPECT_EQ(readFile(path), records({"W1"}));
    EXPECT_EQ(readFile(damaged), "2\nW1\n");
    EXPECT_THAT(file.recover(), IsEmpty()) << "it is complete now";
}

TEST_F(RecordFileTest, ACompleteFileIsReplacedByTheSavedCopyOnRequest) {
    EXPECT_THAT(file.restoreSaved(), IsEmpty()) << "there is no copy";
    writeFile(path, records({"W1"}));
    prepare();
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
    EXPECT_EQ(file.savedCopy().content, records({"W1"}));
    EXPECT_THAT(file.recover(), IsEmpty());
    EXPECT_EQ(prepare(), records({"W2"}));
    EXPECT_EQ(file.savedCopy().content, records({"W2"}));
}

TEST_F(RecordFileTest, AMissingOrEmptyFileIsRestored) {
    for (const bool isEmpty : {false, true}) {
        writeFile(path, records({"W1"}));
        prepare();
        fs::remove(path);
        if (isEmpty) {
            writeFile(path, "");
        }
        EXPECT_THAT(file.recover(), HasSubstr(isEmpty ? "had no count of records" : "was missing"));
        EXPECT_EQ(readFile(path), records({"W1"}));
        EXPECT_FALSE(fs::exists(damaged));
    }
}

TEST_F(RecordFileTest, ACompleteFileIsPreferredToANewerSavedCopy) {
    writeFile(path, records({"W1"}));
    prepare();
    writeFile(path, records({"by_hand"}));
    fs::last_write_time(path, fs::file_time_type::clock::now() - std::chrono::hours(1));
    EXPECT_THAT(file.recover(), IsEmpty());
    EXPECT_EQ(readFile(path), records({"by_hand"}));
    prepare();
    EXPECT_EQ(file.savedCopy().content, records({"by_hand"}));
}

TEST_F(RecordFileTest, AnOldSavedCopyIsUsedAndItsTimeIsLogged) {
    writeFile(path, records({"W1"}));
    prepare();
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
    leases.prepare(content);
    fs::copy_file(in("Lease.dat.saved1"), saved);
    writeFile(path, "2\nW1\n");
    EXPECT_THAT(file.recover(), HasSubstr("no saved copy"));
    EXPECT_EQ(readFile(path), "2\nW1\n");
}

TEST_F(RecordFileTest, ATruncatedSavedCopyIsNotUsed) {
    writeFile(path, records({"W1", "W2"}));
    prepare();
    const std::string complete = readFile(saved);
    writeFile(path, "2\n");
    for (std::size_t length = 0; length < complete.size(); ++length) {
        writeFile(saved, complete.substr(0, length));
        EXPECT_THAT(file.recover(), HasSubstr("no saved copy")) << length;
    }
}

TEST_F(RecordFileTest, AnIncompleteFileWithoutSavedCopyStaysAndIsCopied) {
    writeFile(path, records({"W1", "W2"}).substr(0, 45));
    EXPECT_THAT(file.recover(), AllOf(HasSubstr("records declared: 2, present: 1"), HasSubstr(damaged.string())));
    EXPECT_EQ(readFile(path), records({"W1", "W2"}).substr(0, 45));
    EXPECT_EQ(readFile(damaged), readFile(path));
}

TEST_F(RecordFileTest, TheOlderCopyIsOverwrittenAndTheNewerOneIsUsed) {
    writeFile(path, records({"W1"}));
    prepare();
    std::string newest = records({"W1"});
    for (const char* identifier : {"W2", "W3", "W4"}) {
        const std::string before = newest;
        newest = records({identifier});
        writeFile(path, newest);
        file.commit(newest);
        EXPECT_EQ(file.savedCopy().content, newest);
        const fs::path used = file.savedCopy().path;
        const std::string complete = readFile(used);
        for (std::size_t length = 0; length < complete.size(); ++length) {
            writeFile(used, complete.substr(0, length));
            EXPECT_EQ(file.savedCopy().content, before) << length;
        }
        writeFile(used, std::string(complete).replace(3, 1, 1, '\0'));
        EXPECT_EQ(file.savedCopy().content, before) << "it has a hole";
        writeFile(used, complete);
    }
}

TEST_F(RecordFileTest, AnEmptyFileWithoutSavedCopyIsReportedAndHasNoRecords) {
    writeFile(path, "");
    EXPECT_EQ(file.recover(), "Warranty.dat had no count of records. There is no saved copy.");
    EXPECT_FALSE(fs::exists(damaged));
    EXPECT_EQ(prepare(), "0\n");
}

TEST_F(RecordFileTest, IsStoredIfTheFileOrACopyHasContent) {
    EXPECT_FALSE(file.isStored());
    writeFile(path, "");
    EXPECT_FALSE(file.isStored());
    writeFile(path, records({"W1"}));
    EXPECT_TRUE(file.isStored());
    prepare();
    fs::remove(path);
    EXPECT_TRUE(file.isStored());
}

TEST_F(RecordFileTest, TheTargetOfASymbolicLinkIsProtected) {
    const testsupport::TemporaryDirectory other;
    const fs::path target = other.path() / "records";
    writeFile(target, records({"W1"}));
    fs::create_symlink(target, path);
    const RecordFile linked = recordFileIn(directory.withSlash(), "Warranty.dat");
    linked.prepare(records({"W1"}));
    writeFile(path, "2\n");
    EXPECT_THAT(linked.recover(), HasSubstr("It was restored"));
    EXPECT_TRUE(fs::is_symlink(path));
    EXPECT_EQ(readFile(target), records({"W1"}));
}

TEST_F(RecordFileTest, CopiesAreUsedIfTheFileNameHasWordsOfTheirLastLine) {
    for (const char* name : {"records of 2026", "saved copy 1", "x of Warranty.dat, in use"}) {
        fs::remove(path);
        writeFile(in(name), records({"W1"}));
        fs::create_symlink(in(name), path);
        const RecordFile linked = recordFileIn(directory.withSlash(), "Warranty.dat");
        linked.prepare(records({"W1"}));
        EXPECT_EQ(linked.savedCopy().content, records({"W1"})) << name;
        EXPECT_TRUE(linked.savedCopy().isInUse) << name;
        linked.finish();
        EXPECT_EQ(linked.savedCopy().content, records({"W1"})) << name;
        EXPECT_FALSE(linked.savedCopy().isInUse) << name;
    }
}

TEST_F(RecordFileTest, WithoutFilesThereIsNothingToRecover) {
    EXPECT_THAT(file.recover(), IsEmpty());
    EXPECT_TRUE(fs::is_empty(directory.path()));
}

TEST_F(RecordFileTest, AnUnfinishedCreationIsRolledBack) {
    writeFile(path, records({"W1"}));
    prepare();
    writeFile(path, recordsAndNew({"W1"}));
    EXPECT_TRUE(file.needsRecovery());
    EXPECT_THAT(file.recover(), HasSubstr("held an unfinished change"));
    EXPECT_EQ(readFile(path), records({"W1"}));
    EXPECT_THAT(file.recover(), IsEmpty()) << "it is finished now";
}

TEST_F(RecordFileTest, AnUnfinishedCreationAfterAnEditIsRecognized) {
    for (const char* number : {"036", "36m"}) {
        const std::string edited = std::string("\n+01\r\nW1\r\nx\r\n2026\r\n") + number + "\r\na later line\r\n";
        writeFile(path, edited);
        prepare();
        writeFile(path, "2\nW1\n*\n00000000000000.000000-000\n36\nnew\n*\n00000000000000.000000-000\n0\n");
        EXPECT_THAT(file.recover(), HasSubstr("held an unfinished change"));
        EXPECT_EQ(readFile(path), edited);
    }
}

TEST_F(RecordFileTest, AnEditedCompleteFileIsKeptAlthoughItsCopiesAreInUse) {
    for (const std::string& edited : {records({"W1"}), records({"W1", "W2"}), records({"W1", "W2", "W3"}), records({}),
                                      std::string("0"), recordsAndNew({"W1", "W2"}), recordsAndNew({})}) {
        writeFile(path, records({"W1"}));
        prepare();
        writeFile(path, edited);
        EXPECT_THAT(file.recover(), IsEmpty()) << edited;
        EXPECT_EQ(readFile(path), edited);
    }
}

TEST_F(RecordFileTest, ANewRecordWithoutValuesIsKeptIfTheCopiesAreNotInUse) {
    writeFile(path, records({"W1"}));
    prepare();
    file.finish();
    writeFile(path, recordsAndNew({"W1"}));
    EXPECT_THAT(file.recover(), IsEmpty());
    EXPECT_EQ(readFile(path), recordsAndNew({"W1"}));
}

TEST_F(RecordFileTest, TheCopiesOfAnUnfinishedCreationStayInUse) {
    writeFile(path, records({"W1"}));
    prepare();
    writeFile(path, recordsAndNew({"W1"}));
    file.finish();
    EXPECT_TRUE(file.needsRecovery());
}

TEST_F(RecordFileTest, ARestoredFileIsKeptAlthoughTheOlderCopyIsInUse) {
    const std::string complete = recordsAndNew({"W1"});
    writeFile(path, complete + "saved copy 8 of Warranty.dat, in use\n");
    writeFile(saved, records({"W1"}) + "saved copy 7 of Warranty.dat, in use\n");
    for (int time = 0; time < 2; ++time) {
        EXPECT_THAT(file.recover(), IsEmpty());
        EXPECT_EQ(readFile(path), complete);
    }
}

TEST_F(RecordFileTest, ReplacedRecordsAreKeptAlthoughTheCopiesWereInUse) {
    writeFile(path, records({"W1"}));
    prepare();
    file.replace(recordsAndNew({"W1"}));
    EXPECT_THAT(file.recover(), IsEmpty());
    EXPECT_EQ(readFile(path), recordsAndNew({"W1"}));
}

TEST_F(RecordFileTest, ACommittedCreationIsSaved) {
    writeFile(path, records({"W1"}));
    prepare();
    writeFile(path, recordsAndNew({"W1"}));
    file.commit(recordsAndNew({"W1"}));
    EXPECT_THAT(file.recover(), IsEmpty());
    EXPECT_EQ(file.savedCopy().content, recordsAndNew({"W1"}));
}

TEST_F(RecordFileTest, AChangeIsRolledBackBeforeAndAfterItsCommit) {
    const std::string before = records({"W1"});
    const std::string after = records({"W1", "W2"});
    for (const bool isCommitted : {false, true}) {
        writeFile(path, before);
        prepare();
        writeFile(path, after);
        if (isCommitted) {
            file.commit(after);
        }
        file.restore(before);
        EXPECT_EQ(readFile(path), before);
        EXPECT_THAT(file.recover(), IsEmpty());
        EXPECT_FALSE(fs::exists(saved) || fs::exists(second)) << "one became the file, the other one is old";
    }
}

TEST_F(RecordFileTest, TheLastLineOfARestoredCopyDoesNotCountAndIsRemoved) {
    writeFile(path, records({"W1"}) + "saved copy 7 of Warranty.dat\n");
    EXPECT_EQ(file.content(), records({"W1"}));
    prepare();
    EXPECT_EQ(file.savedCopy().content, records({"W1"}));
    EXPECT_THAT(file.recover(), IsEmpty());
    EXPECT_EQ(readFile(path), records({"W1"}));
}

TEST_F(RecordFileTest, FilesThatRootCreatesBelongToTheOwnerOfTheDirectory) {
    constexpr uid_t unprivileged = 65534;
    const uid_t owner = geteuid() == 0 ? unprivileged : geteuid();
    ASSERT_EQ(chown(directory.path().c_str(), owner, static_cast<gid_t>(-1)), 0);
    prepare();
    file.commit(records({}));
    file.replace(records({"W1"}));
    for (const fs::path& each : {path, saved, second}) {
        struct stat status {};
        EXPECT_EQ(stat(each.c_str(), &status), 0) << each;
        EXPECT_EQ(status.st_uid, owner) << each;
    }
}

TEST_F(RecordFileTest, TheSavedCopyHasTheModeOfTheFile) {
    writeFile(path, records({"W1"}));
    fs::permissions(path, fs::perms::owner_read | fs::perms::owner_write);
    prepare();
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
