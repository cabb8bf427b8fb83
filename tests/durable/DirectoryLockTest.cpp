#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <filesystem>
#include <functional>
#include <system_error>

#include "LockErrors.h"
#include "durable/DirectoryLock.h"
#include "support/Files.h"
#include "support/TemporaryDirectory.h"

namespace durable {
namespace {

using testing::HasSubstr;
using State = DirectoryLock::State;

/** Runs work in a child process and returns its result, from 0 to 127. */
int inChild(const std::function<int()>& work) {
    const pid_t child = fork();
    if (child == 0) {
        _exit(work());
    }
    int status = 0;
    waitpid(child, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

class DirectoryLockTest : public testing::Test {
protected:
    /** The result of another process that tries to acquire the lock. */
    State stateInChild() {
        return static_cast<State>(inChild([&] {
            DirectoryLock lock;
            return static_cast<int>(lock.acquire(path).state);
        }));
    }

    /** Returns the result in a child process; as an unprivileged user if the test runs as root. */
    State stateOfAnotherUser() {
        return static_cast<State>(inChild([&] {
            constexpr uid_t unprivileged = 65534;
            DirectoryLock lock;
            return geteuid() == 0 && setresuid(unprivileged, unprivileged, unprivileged) != 0
                       ? 127
                       : static_cast<int>(lock.acquire(path).state);
        }));
    }

    const testsupport::TemporaryDirectory directory;
    const std::string path = directory.withSlash();
    DirectoryLock held;
};

TEST_F(DirectoryLockTest, IsHeldByOneProcess) {
    EXPECT_EQ(held.acquire(path).state, State::acquired);
    EXPECT_EQ(held.acquire(path).state, State::held) << "already";
    EXPECT_EQ(stateInChild(), State::heldByOther);
    held.release();
    EXPECT_EQ(stateInChild(), State::acquired);
}

TEST_F(DirectoryLockTest, NamesItsOwner) {
    held.acquire(path);
    const std::string owner = "process " + std::to_string(getpid()) + " (durable_test)";
    EXPECT_EQ(inChild([&] {
                  DirectoryLock lock;
                  return lock.acquire(path).reason == owner ? 0 : 1;
              }),
              0)
        << testsupport::readFile(directory.path() / "owner");
}

TEST_F(DirectoryLockTest, EndsWithItsProcess) {
    int ready[2];
    ASSERT_EQ(pipe(ready), 0);
    const pid_t owner = fork();
    if (owner == 0) {
        held.acquire(path);
        const bool isWritten = write(ready[1], "x", 1) == 1;
        pause();
        _exit(isWritten ? 0 : 1);
    }
    char byte = 0;
    ASSERT_EQ(read(ready[0], &byte, 1), 1);
    EXPECT_EQ(stateInChild(), State::heldByOther);
    kill(owner, SIGKILL);
    waitpid(owner, nullptr, 0);
    EXPECT_EQ(held.acquire(path).state, State::acquired);
    close(ready[0]);
    close(ready[1]);
}

TEST_F(DirectoryLockTest, AForkedChildNeitherHoldsNorKeepsTheLock) {
    held.acquire(path);
    EXPECT_EQ(inChild([&] { return static_cast<int>(held.acquire(path).state); }),
              static_cast<int>(State::heldByOther));
    int end[2];
    ASSERT_EQ(pipe(end), 0);
    const pid_t child = fork();
    if (child == 0) {
        close(end[1]);
        char byte = 0;
        _exit(static_cast<int>(read(end[0], &byte, 1)));  // until the parent closes the pipe
    }
    held.release();
    EXPECT_EQ(stateInChild(), State::acquired) << "while the child has inherited the file";
    close(end[0]);
    close(end[1]);
    waitpid(child, nullptr, 0);
}

TEST_F(DirectoryLockTest, ACopiedFileLocksNothing) {
    testsupport::writeFile(directory.path() / "owner", "1 init\n");
    EXPECT_EQ(held.acquire(path).state, State::acquired);
}

TEST_F(DirectoryLockTest, IsAcquiredAgainIfItsFileIsRemoved) {
    held.acquire(path);
    std::filesystem::remove(directory.path() / "owner");
    EXPECT_EQ(held.acquire(path).state, State::acquired);
    EXPECT_EQ(stateInChild(), State::heldByOther);
}

TEST_F(DirectoryLockTest, IsDeniedToAProcessThatCannotWriteItsFile) {
    held.acquire(path);
    held.release();
    std::filesystem::permissions(directory.path(), std::filesystem::perms(0755));
    EXPECT_EQ(stateOfAnotherUser(), geteuid() == 0 ? State::denied : State::acquired);
}

TEST_F(DirectoryLockTest, IsDeniedAndWritesNothingIfTheFileHasAnotherName) {
    const std::filesystem::path other = directory.path() / "other";
    testsupport::writeFile(other, "content");
    std::filesystem::permissions(other, std::filesystem::perms(0640));
    std::filesystem::create_hard_link(other, directory.path() / "owner");
    const DirectoryLock::Result result = held.acquire(path);
    EXPECT_EQ(result.state, State::denied);
    EXPECT_EQ(result.reason, path + "owner: It is not a regular file, or has another name too. Remove it");
    EXPECT_EQ(testsupport::readFile(other), "content");
    EXPECT_EQ(std::filesystem::status(other).permissions(), std::filesystem::perms(0640));
    std::filesystem::remove(directory.path() / "owner");
    EXPECT_EQ(held.acquire(path).state, State::acquired);
}

TEST_F(DirectoryLockTest, IsDeniedIfTheFileIsNotRegular) {
    ASSERT_EQ(mkfifo((path + "owner").c_str(), 0600), 0);
    EXPECT_EQ(held.acquire(path).state, State::denied);
    std::filesystem::remove(path + "owner");
    std::filesystem::create_symlink("other", path + "owner");
    EXPECT_EQ(held.acquire(path).state, State::denied);
    EXPECT_FALSE(std::filesystem::exists(path + "other")) << "the link was not followed";
}

TEST_F(DirectoryLockTest, IsOpenToUsersWhoMayWriteToTheDirectory) {
    std::filesystem::permissions(directory.path(), std::filesystem::perms(0777));
    held.acquire(path);
    held.release();
    EXPECT_EQ(stateOfAnotherUser(), State::acquired);
}

TEST_F(DirectoryLockTest, OfRootIsOpenToTheOwnerOfTheDirectory) {
    constexpr uid_t unprivileged = 65534;
    ASSERT_EQ(chown(path.c_str(), geteuid() == 0 ? unprivileged : geteuid(), static_cast<gid_t>(-1)), 0);
    held.acquire(path);
    held.release();
    EXPECT_EQ(stateOfAnotherUser(), State::acquired);
}

TEST_F(DirectoryLockTest, IsUnavailableIfTheFileSystemHasNoLocks) {
    for (const int error : {EINVAL, ENOSYS, EOPNOTSUPP}) {
        const LockErrors errors{error, 1};
        const DirectoryLock::Result result = held.acquire(path);
        EXPECT_EQ(result.state, State::unavailable) << error;
        EXPECT_EQ(result.reason, path + "owner: " + std::generic_category().message(error));
    }
}

TEST_F(DirectoryLockTest, IsDeniedIfTheSystemFails) {
    for (const int error : {ENOLCK, EIO}) {
        const LockErrors errors{error, 1};
        const DirectoryLock::Result result = held.acquire(path);
        EXPECT_EQ(result.state, State::denied) << error;
        EXPECT_EQ(result.reason, path + "owner: " + std::generic_category().message(error));
    }
    EXPECT_EQ(held.acquire(path).state, State::acquired);
}

TEST_F(DirectoryLockTest, IsTriedAgainAfterAnInterruption) {
    const LockErrors errors{EINTR, 2};
    EXPECT_EQ(held.acquire(path).state, State::acquired);
    EXPECT_EQ(LockErrors::count, 0);
}

TEST_F(DirectoryLockTest, ReportsWhyItIsUnavailable) {
    const DirectoryLock::Result result = held.acquire("/nonexistent/directory/");
    EXPECT_EQ(result.state, State::unavailable);
    EXPECT_THAT(result.reason, HasSubstr("No such file or directory"));
}

}  // namespace
}  // namespace durable
