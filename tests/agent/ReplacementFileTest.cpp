#include <gmock/gmock.h>
#include <grp.h>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <utility>
#include <vector>

#include "KO/Exceptions.h"
#include "framework/FileAccess.h"
#include "support/TemporaryDirectory.h"
#include "support/Umask.h"

using KO::replaceFile;
using testsupport::TemporaryDirectory;

namespace {

unsigned int modeOf(const std::string& path) {
    struct stat status {};
    EXPECT_EQ(::stat(path.c_str(), &status), 0);
    return status.st_mode & 07777U;
}

std::size_t entriesOf(const TemporaryDirectory& directory) {
    const std::filesystem::directory_iterator entries(directory.withSlash());
    return static_cast<std::size_t>(std::distance(begin(entries), end(entries)));
}

}  // namespace

TEST(ReplacementFile, ReplacesTheOldFileAndKeepsItsMode) {
    const TemporaryDirectory directory;
    const std::string path = directory.write("file", "old");
    ASSERT_EQ(::chmod(path.c_str(), 0604), 0);
    replaceFile(path, "new");
    EXPECT_EQ(directory.read("file"), "new");
    EXPECT_EQ(modeOf(path), 0604U);
    EXPECT_EQ(entriesOf(directory), 1U) << "no other file remains";
}

TEST(ReplacementFile, KeepsTheOwner) {
    const TemporaryDirectory directory;
    const std::string path = directory.write("file", "old");
    const bool canChangeOwner = ::geteuid() == 0;  // only root can create a file of another owner
    const uid_t owner = canChangeOwner ? 4711 : ::geteuid();
    const gid_t group = canChangeOwner ? 4712 : ::getegid();
    ASSERT_EQ(::chown(path.c_str(), owner, group), 0);
    ASSERT_EQ(::chmod(path.c_str(), 0660), 0);
    replaceFile(path, "new");
    struct stat status {};
    ASSERT_EQ(::stat(path.c_str(), &status), 0);
    EXPECT_EQ(status.st_uid, owner);
    EXPECT_EQ(status.st_gid, group);
    EXPECT_EQ(modeOf(path), 0660U);
}

/** Returns the attributes of a file after an unprivileged user with write access to its directory has replaced it. */
struct stat statusAfterReplacement(const TemporaryDirectory& directory, const std::vector<gid_t>& groupsOfReplacer) {
    constexpr uid_t otherUser = 65534;
    EXPECT_EQ(::chown(directory.withSlash().c_str(), otherUser, otherUser), 0);
    const auto replaceAsOtherUser = [&] {
        if (::setgroups(groupsOfReplacer.size(), groupsOfReplacer.data()) != 0 || ::setgid(otherUser) != 0 ||
            ::setuid(otherUser) != 0) {
            std::_Exit(2);
        }
        replaceFile(directory.file("file"), "new");
        std::_Exit(0);
    };
    EXPECT_EXIT(replaceAsOtherUser(), testing::ExitedWithCode(0), "");
    EXPECT_EQ(directory.read("file"), "new");
    struct stat status {};
    EXPECT_EQ(::stat(directory.file("file").c_str(), &status), 0);
    return status;
}

class ReplacementByAnother : public testing::TestWithParam<std::pair<mode_t, mode_t>> {
protected:
    void SetUp() override {
        if (::geteuid() != 0) {
            GTEST_SKIP() << "only root can create a file of another owner";
        }
        const std::string path = directory.write("file", "old");
        ASSERT_EQ(::chown(path.c_str(), 4711, group), 0);
        ASSERT_EQ(::chmod(path.c_str(), GetParam().first), 0);
    }

    static constexpr gid_t group = 4712;
    const TemporaryDirectory directory;
};

TEST_P(ReplacementByAnother, GrantsTheRightsOfTheGroupToNoOther) {
    const struct stat status = statusAfterReplacement(directory, {});
    EXPECT_NE(status.st_gid, group);
    EXPECT_EQ(status.st_mode & 07777U, GetParam().second);
}

TEST_P(ReplacementByAnother, KeepsAGroupOfTheProcessWithItsRights) {
    const struct stat status = statusAfterReplacement(directory, {group});
    EXPECT_EQ(status.st_gid, group);
    EXPECT_EQ(status.st_mode & 07777U, GetParam().first);
}

INSTANTIATE_TEST_SUITE_P(Modes, ReplacementByAnother,
                         testing::Values(std::pair<mode_t, mode_t>{0640, 0600}, std::pair<mode_t, mode_t>{0664, 0604},
                                         std::pair<mode_t, mode_t>{0606, 0600}, std::pair<mode_t, mode_t>{0600, 0600}));

TEST(ReplacementFile, HasMode0600IfItIsNew) {
    const testsupport::Umask none(0);
    const TemporaryDirectory directory;
    replaceFile(directory.file("file"), "new");
    EXPECT_EQ(directory.read("file"), "new");
    EXPECT_EQ(modeOf(directory.file("file")), 0600U);
}

TEST(ReplacementFile, DoesNotDisturbAReaderOfTheOldContent) {
    const TemporaryDirectory directory;
    std::ifstream reader(directory.write("file", "old"));
    replaceFile(directory.file("file"), "new");
    std::string line;
    std::getline(reader, line);
    EXPECT_EQ(line, "old");
}

TEST(ReplacementFile, ReplacesTheTargetOfASymbolicLink) {
    const TemporaryDirectory directory;
    directory.write("file", "old");
    std::filesystem::create_symlink("file", directory.file("link"));
    replaceFile(directory.file("link"), "new");
    EXPECT_TRUE(std::filesystem::is_symlink(directory.file("link")));
    EXPECT_EQ(directory.read("file"), "new");
}

TEST(ReplacementFile, ReportsWhyItCannotBeCreated) {
    const TemporaryDirectory directory;
    try {
        replaceFile(directory.file("none/file"), "new");
        FAIL() << "no exception";
    } catch (const KO::FrameworkException& failure) {
        EXPECT_EQ(failure.what(), "Cannot write " + directory.file("none/file") + ": No such file or directory");
    }
}

// Purging the package deletes files with this name, and no others.
TEST(ReplacementFile, HasADistinctTemporaryName) {
    const TemporaryDirectory directory;
    const auto replaceAndBeKilled = [&] {
        const struct rlimit nothing {};
        ::setrlimit(RLIMIT_FSIZE, &nothing);
        replaceFile(directory.file("asset.dat"), "new");
    };
    EXPECT_EXIT(replaceAndBeKilled(), testing::KilledBySignal(SIGXFSZ), "");
    ASSERT_EQ(entriesOf(directory), 1U);
    const std::string left = std::filesystem::directory_iterator(directory.withSlash())->path().filename();
    EXPECT_THAT(left, testing::MatchesRegex("\\.asset\\.dat\\.new-......"));
}

TEST(ReplacementFile, KeepsTheOldFileIfItFails) {
    const TemporaryDirectory directory;
    std::filesystem::create_directory(directory.file("target"));
    directory.write("target/inside", "old");
    EXPECT_THROW(replaceFile(directory.file("target"), "new"), KO::FrameworkException);
    EXPECT_EQ(directory.read("target/inside"), "old");
    EXPECT_EQ(entriesOf(directory), 1U) << "the temporary file is removed";
}
