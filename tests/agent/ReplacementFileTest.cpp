#include "framework/ReplacementFile.h"

#include "Exceptions.h"
#include "agent/TemporaryDirectory.h"
#include "support/Umask.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include <csignal>
#include <filesystem>

using agent_test::TemporaryDirectory;
using KO::replaceFile;

namespace {

unsigned int modeOf(const std::string& path) {
    struct stat status {};
    EXPECT_EQ(::stat(path.c_str(), &status), 0);
    return status.st_mode & 07777U;
}

std::size_t entriesOf(const TemporaryDirectory& directory) {
    const std::filesystem::directory_iterator entries(directory.path());
    return static_cast<std::size_t>(std::distance(begin(entries), end(entries)));
}

}  // namespace

TEST(ReplacementFile, TakesThePlaceOfTheOldOneWithItsMode) {
    const TemporaryDirectory directory;
    const std::string path = directory.write("file", "old");
    ASSERT_EQ(::chmod(path.c_str(), 0604), 0);
    replaceFile(path, "new");
    EXPECT_EQ(directory.read("file"), "new");
    EXPECT_EQ(modeOf(path), 0604U);
    EXPECT_EQ(entriesOf(directory), 1U) << "nothing is left behind";
}

TEST(ReplacementFile, KeepsTheOwner) {
    const TemporaryDirectory directory;
    const std::string path = directory.write("file", "old");
    const bool mayGiveAway = ::geteuid() == 0;  // nobody else can have a file of another owner here
    const uid_t owner = mayGiveAway ? 4711 : ::geteuid();
    const gid_t group = mayGiveAway ? 4712 : ::getegid();
    ASSERT_EQ(::chown(path.c_str(), owner, group), 0);
    ASSERT_EQ(::chmod(path.c_str(), 0660), 0);
    replaceFile(path, "new");
    struct stat status {};
    ASSERT_EQ(::stat(path.c_str(), &status), 0);
    EXPECT_EQ(status.st_uid, owner);
    EXPECT_EQ(status.st_gid, group);
    EXPECT_EQ(modeOf(path), 0660U);
}

TEST(ReplacementFile, IsItsOwnersAloneWhenItIsNew) {
    const testsupport::Umask none(0);
    const TemporaryDirectory directory;
    replaceFile(directory.file("file"), "new");
    EXPECT_EQ(directory.read("file"), "new");
    EXPECT_EQ(modeOf(directory.file("file")), 0600U);
}

TEST(ReplacementFile, LeavesAReaderOfTheOldContentUndisturbed) {
    const TemporaryDirectory directory;
    std::ifstream reader(directory.write("file", "old"));
    replaceFile(directory.file("file"), "new");
    std::string line;
    std::getline(reader, line);
    EXPECT_EQ(line, "old");
}

TEST(ReplacementFile, ReplacesWhatASymbolicLinkLeadsTo) {
    const TemporaryDirectory directory;
    directory.write("file", "old");
    std::filesystem::create_symlink("file", directory.file("link"));
    replaceFile(directory.file("link"), "new");
    EXPECT_TRUE(std::filesystem::is_symlink(directory.file("link")));
    EXPECT_EQ(directory.read("file"), "new");
}

TEST(ReplacementFile, SaysWhyItCannotBeMade) {
    const TemporaryDirectory directory;
    try {
        replaceFile(directory.file("none/file"), "new");
        FAIL() << "no exception";
    } catch (const KO::FrameworkException& failure) {
        EXPECT_EQ(failure.what(), "Cannot write " + directory.file("none/file") + ": No such file or directory");
    }
}

// What is left behind is deleted when the package is purged, and nothing else that lies there.
TEST(ReplacementFile, HasANameUntilItTakesItsPlaceThatNobodyGivesAnother) {
    const TemporaryDirectory directory;
    const auto replaceAndBeKilled = [&] {
        const struct rlimit nothing {};
        ::setrlimit(RLIMIT_FSIZE, &nothing);
        replaceFile(directory.file("asset.dat"), "new");
    };
    EXPECT_EXIT(replaceAndBeKilled(), testing::KilledBySignal(SIGXFSZ), "");
    ASSERT_EQ(entriesOf(directory), 1U);
    const std::string left = std::filesystem::directory_iterator(directory.path())->path().filename();
    EXPECT_THAT(left, testing::MatchesRegex("\\.asset\\.dat\\.new-......"));
}

TEST(ReplacementFile, LeavesTheOldOneWhenItFails) {
    const TemporaryDirectory directory;
    std::filesystem::create_directory(directory.file("target"));
    directory.write("target/inside", "old");
    EXPECT_THROW(replaceFile(directory.file("target"), "new"), KO::FrameworkException);
    EXPECT_EQ(directory.read("target/inside"), "old");
    EXPECT_EQ(entriesOf(directory), 1U) << "the temporary file is gone";
}
