#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <ctime>
#include <vector>

#include "LockErrors.h"
#include "durable/DataDirectory.h"
#include "support/Files.h"
#include "support/TemporaryDirectory.h"

namespace durable {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

constexpr const char* oneWarranty = "1\nW1\n*\n*\n12\n";

class DataDirectoryTest : public testing::Test {
protected:
    DataDirectoryTest() {
        path = folder.withSlash();
        messages.clear();
        testsupport::writeFile(file(), oneWarranty);
        setAge(60);
    }

    ~DataDirectoryTest() override {
        if (other != 0) {
            close(end[1]);
            waitpid(other, nullptr, 0);
        }
    }

    std::filesystem::path file() const { return folder.path() / "Warranty.dat"; }

    /** Sets the time of the file's last change. */
    void setAge(double seconds) const {
        timespec now{};
        clock_gettime(CLOCK_REALTIME, &now);
        const auto age = static_cast<long long>(seconds * 1e9);
        const long long time = now.tv_sec * 1000000000LL + now.tv_nsec - age;
        const timespec times[2]{{0, UTIME_OMIT}, {time / 1000000000, time % 1000000000}};
        ASSERT_EQ(utimensat(AT_FDCWD, file().c_str(), times, 0), 0);
    }

    /** Lets another process own the directory until the end of the test. */
    void lockByOther() {
        int ready[2];
        ASSERT_EQ(pipe(ready), 0);
        ASSERT_EQ(pipe(end), 0);
        other = fork();
        if (other == 0) {
            close(end[1]);
            DirectoryLock lock;
            lock.acquire(path);
            char byte = 0;
            const bool hasEnded = write(ready[1], "x", 1) == 1 && read(end[0], &byte, 1) == 0;
            _exit(hasEnded ? 0 : 1);
        }
        char byte = 0;
        ASSERT_EQ(read(ready[0], &byte, 1), 1);
        close(ready[0]);
        close(ready[1]);
        close(end[0]);
    }

    const testsupport::TemporaryDirectory folder;
    static inline std::string path;
    static inline std::vector<std::string> messages;
    DataDirectory directory{[] { return path; }, [](const std::string& message) { messages.push_back(message); }};

private:
    int end[2]{};
    pid_t other = 0;
};

TEST_F(DataDirectoryTest, IsUsedAndReportedOnceIfTheFileSystemHasNoLocks) {
    const LockErrors errors{ENOSYS, 100};
    EXPECT_TRUE(directory.open());
    for (int time = 0; time < 3; ++time) {
        EXPECT_TRUE(directory.acquire().isOwner);
        EXPECT_FALSE(directory.isOutdated());
    }
    EXPECT_TRUE(directory.open());
    EXPECT_THAT(messages, ElementsAre(HasSubstr("The data directory cannot be locked")));
}

TEST_F(DataDirectoryTest, IsNotChangedIfTheLockFails) {
    const LockErrors errors{ENOLCK, 100};
    EXPECT_TRUE(directory.open()) << "for reading";
    const DataDirectory::Ownership ownership = directory.acquire();
    EXPECT_FALSE(ownership.isOwner);
    EXPECT_THAT(ownership.reason, HasSubstr("owner: No locks available."));
    EXPECT_THAT(messages, IsEmpty());
}

TEST_F(DataDirectoryTest, IsNotOpenedIfAnotherProcessHasJustChangedAFile) {
    EXPECT_TRUE(directory.open()) << "as its owner";
    directory.close();
    lockByOther();
    EXPECT_TRUE(directory.open());
    setAge(-0.5);
    EXPECT_FALSE(directory.open());
    EXPECT_TRUE(directory.isOutdated()) << "until it may be read";
    setAge(-3600);
    EXPECT_TRUE(directory.open()) << "the time is wrong";
}

TEST_F(DataDirectoryTest, IsNotOpenedIfAFileIsIncompleteAndAnotherProcessIsTheOwner) {
    const RecordFile warranties = recordFileIn(path, "Warranty.dat");
    warranties.prepare(oneWarranty);
    lockByOther();
    testsupport::writeFile(file(), "1\nW1\n");
    setAge(60);
    EXPECT_FALSE(directory.open());
    EXPECT_EQ(testsupport::readFile(file()), "1\nW1\n");
    EXPECT_THAT(messages, IsEmpty());
}

TEST_F(DataDirectoryTest, IsNotOpenedIfAFileIsIncompleteAndItsCopyCannotBeRead) {
    std::filesystem::create_directory(file().string() + ".saved1");  // cannot be read, not even by root
    lockByOther();
    EXPECT_TRUE(directory.open()) << "the file is complete";
    testsupport::writeFile(file(), "1\nW1\n");
    setAge(60);
    EXPECT_FALSE(directory.open());
}

TEST_F(DataDirectoryTest, HasChangedForAForkedChildOfItsOwner) {
    EXPECT_TRUE(directory.open());
    testsupport::writeFile(file(), "0\n");
    EXPECT_FALSE(directory.hasChanged()) << "by another process";
    const pid_t child = fork();
    if (child == 0) {
        _exit(directory.hasChanged() && directory.isOutdated() ? 0 : 1);
    }
    int status = -1;
    waitpid(child, &status, 0);
    EXPECT_EQ(status, 0);
}

TEST_F(DataDirectoryTest, HasLostFilesIfAFileAndItsCopiesAreRemoved) {
    EXPECT_TRUE(directory.open());
    EXPECT_FALSE(directory.hasLostFiles());
    recordFileIn(path, "Warranty.dat").prepare(oneWarranty);
    std::filesystem::remove(file());
    EXPECT_FALSE(directory.hasLostFiles()) << "there is a copy";
    std::filesystem::remove(file().string() + ".saved1");
    EXPECT_TRUE(directory.hasLostFiles());
    directory.close();
    EXPECT_FALSE(directory.hasLostFiles()) << "the provider is unloaded";
}

}  // namespace
}  // namespace durable
