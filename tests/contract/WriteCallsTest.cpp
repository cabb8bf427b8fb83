#include <fcntl.h>
#include <gmock/gmock.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <sys/uio.h>
#include <unistd.h>

#include <sstream>

#include "RecordFixture.h"
#include "support/TemporaryDirectory.h"

// Checks the number of system calls that a rewrite makes per line of the record file. Records calls to all C library
// functions that write to or use an open file.

namespace {

/** Records the calls for a file during the lifetime of this object. Only one instance may exist at a time. */
class Watch {
public:
    explicit Watch(const std::filesystem::path& itsFile) : file(std::filesystem::canonical(itsFile).string()) {
        only = this;
    }
    ~Watch() { only = nullptr; }
    Watch(const Watch&) = delete;
    Watch& operator=(const Watch&) = delete;

    /** Returns the watch of the descriptor's file; null if there is none. */
    static Watch* over(int descriptor) {
        if (only == nullptr) {
            return nullptr;
        }
        std::error_code error;
        const auto name = std::filesystem::read_symlink("/proc/self/fd/" + std::to_string(descriptor), error);
        return !error && name == only->file ? only : nullptr;
    }

    std::vector<std::string> written{};  ///< data of each write call
    std::size_t others = 0;              ///< number of other calls

private:
    static inline Watch* only = nullptr;
    std::string file;
};

}  // namespace

// These functions replace those of the C library for all libraries of this process.
#pragma GCC visibility push(default)
extern "C" {

ssize_t write(int descriptor, const void* bytes, size_t size) {
    if (Watch* watch = Watch::over(descriptor)) {
        watch->written.emplace_back(static_cast<const char*>(bytes), size);
    }
    return syscall(SYS_write, descriptor, bytes, size);
}

ssize_t writev(int descriptor, const struct iovec* parts, int count) {
    if (Watch* watch = Watch::over(descriptor)) {
        std::string text;
        for (int part = 0; part < count; ++part) {
            text.append(static_cast<const char*>(parts[part].iov_base), parts[part].iov_len);
        }
        watch->written.push_back(text);
    }
    return syscall(SYS_writev, descriptor, parts, count);
}

/**
 * Defines a replacement of a C library function for open files, which counts calls and makes the system call with this
 * number. The replacement has a different name in this source, so that it need not match the C library's declaration.
 */
#define COUNTED(name, number)                                                                             \
    long counted_##name(int descriptor, long first, long second, long third, long fourth) __asm__(#name); \
    long counted_##name(int descriptor, long first, long second, long third, long fourth) {               \
        if (Watch* watch = Watch::over(descriptor)) {                                                     \
            ++watch->others;                                                                              \
        }                                                                                                 \
        return syscall(number, descriptor, first, second, third, fourth);                                 \
    }

// Keep consistent with CMakeLists.txt.
COUNTED(close, SYS_close)
COUNTED(dup, SYS_dup)
COUNTED(fallocate, SYS_fallocate)
COUNTED(fallocate64, SYS_fallocate)
COUNTED(fchmod, SYS_fchmod)
COUNTED(fchown, SYS_fchown)
COUNTED(fcntl, SYS_fcntl)
COUNTED(fcntl64, SYS_fcntl)
COUNTED(fdatasync, SYS_fdatasync)
COUNTED(flock, SYS_flock)
COUNTED(fstat, SYS_fstat)
COUNTED(fstat64, SYS_fstat)
COUNTED(fsync, SYS_fsync)
COUNTED(ftruncate, SYS_ftruncate)
COUNTED(ftruncate64, SYS_ftruncate)
COUNTED(ioctl, SYS_ioctl)
COUNTED(lseek, SYS_lseek)
COUNTED(lseek64, SYS_lseek)
COUNTED(pwrite, SYS_pwrite64)
COUNTED(pwrite64, SYS_pwrite64)
COUNTED(pwritev, SYS_pwritev)
COUNTED(read, SYS_read)
COUNTED(readv, SYS_readv)
COUNTED(sync_file_range, SYS_sync_file_range)

}  // extern "C"
#pragma GCC visibility pop

namespace contract {
namespace {

using testsupport::named;
using testsupport::text;

class WriteCallsTest : public RecordTest {
protected:
    /** Creates a number of records and changes one. @return the number of calls other than write */
    std::size_t othersOfChange(int records) {
        std::vector<std::string> identifiers;
        for (int number = 0; number < records; ++number) {
            identifiers.push_back("record " + std::to_string(records) + "." + std::to_string(number));
        }
        createAll(identifiers);
        const Watch watch(dataFile(kind().dataFile));
        modify(identifiers.back(), {named(kind().textProperty, text("Another Party Ltd"))});
        EXPECT_EQ(watch.written, linesOfFile());
        return watch.others;
    }

    std::vector<std::string> linesOfFile() const {
        std::istringstream content(data().value_or(""));
        std::vector<std::string> lines;
        for (std::string line; std::getline(content, line);) {
            lines.push_back(line + "\n");
        }
        return lines;
    }
};

INSTANTIATE_RECORD_TEST(WriteCallsTest);

TEST_P(WriteCallsTest, ARewriteMakesOneWriteCallPerLine) {
    const std::size_t ofFew = othersOfChange(2);
    EXPECT_EQ(linesOfFile().size(), 1 + 2 * kind().linesOfRecord);
    EXPECT_EQ(othersOfChange(20), ofFew);
    EXPECT_EQ(linesOfFile().size(), 1 + 22 * kind().linesOfRecord);
}

TEST(WriteCallsWatchTest, RecordsCallsOtherThanWrite) {
    const testsupport::TemporaryDirectory directory;
    const std::filesystem::path path = directory.path() / "file";
    const int file = open(path.c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600);
    ASSERT_GE(file, 0);
    const int other = open(path.c_str(), O_RDONLY | O_CLOEXEC);
    struct stat status {};
    char byte = 0;
    const Watch watch(path);
    EXPECT_EQ(write(file, "text", 4), 4);
    EXPECT_EQ(lseek(file, 1, SEEK_SET), 1);
    EXPECT_EQ(read(file, &byte, 1), 1);
    EXPECT_EQ(fstat(file, &status), 0);
    EXPECT_EQ(ftruncate(file, 2), 0);
    EXPECT_EQ(pwrite(file, "T", 1, 0), 1);
    EXPECT_GE(fcntl(file, F_GETFL), 0);
    EXPECT_EQ(fdatasync(file), 0);
    EXPECT_EQ(status.st_size, 4);
    EXPECT_EQ(byte, 'e');
    EXPECT_EQ(close(other), 0);
    EXPECT_THAT(watch.written, testing::ElementsAre("text"));
    EXPECT_EQ(watch.others, 8U);
    EXPECT_EQ(close(file), 0);
}

}  // namespace
}  // namespace contract
