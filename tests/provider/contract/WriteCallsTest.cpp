#include "RecordFixture.h"

#include <sys/syscall.h>
#include <sys/uio.h>
#include <unistd.h>

#include <sstream>

// What a rewrite asks of the system for each line of the record file.

namespace {

/** The calls for a file, as long as this lives. There is one at a time. */
class Watch {
public:
    explicit Watch(const std::filesystem::path& itsFile) : file(std::filesystem::canonical(itsFile).string()) {
        only = this;
    }
    ~Watch() { only = nullptr; }
    Watch(const Watch&) = delete;
    Watch& operator=(const Watch&) = delete;

    /** The watch over the file behind a descriptor; null for none. */
    static Watch* over(int descriptor) {
        if (only == nullptr) {
            return nullptr;
        }
        std::error_code error;
        const auto name = std::filesystem::read_symlink("/proc/self/fd/" + std::to_string(descriptor), error);
        return !error && name == only->file ? only : nullptr;
    }

    std::vector<std::string> written{};  ///< what each call wrote
    std::size_t others = 0;              ///< calls that do not write

private:
    static inline Watch* only = nullptr;
    std::string file;
};

}  // namespace

// They take the place of the system's own in all libraries of this process.
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

off64_t lseek64(int descriptor, off64_t offset, int whence) noexcept {
    if (Watch* watch = Watch::over(descriptor)) {
        ++watch->others;
    }
    return syscall(SYS_lseek, descriptor, offset, whence);
}

int fsync(int descriptor) {
    if (Watch* watch = Watch::over(descriptor)) {
        ++watch->others;
    }
    return static_cast<int>(syscall(SYS_fsync, descriptor));
}

}  // extern "C"
#pragma GCC visibility pop

namespace contract {
namespace {

using testsupport::named;
using testsupport::text;

class WriteCallsTest : public RecordTest {
protected:
    /** Makes so many records and changes one. @return the calls other than to write */
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

TEST_P(WriteCallsTest, ARewriteDoesOneWriteCallALineAndNothingElseALine) {
    const std::size_t ofFew = othersOfChange(2);
    EXPECT_EQ(linesOfFile().size(), 1 + 2 * kind().linesOfRecord);
    EXPECT_EQ(othersOfChange(20), ofFew);
    EXPECT_EQ(linesOfFile().size(), 1 + 22 * kind().linesOfRecord);
}

}  // namespace
}  // namespace contract
