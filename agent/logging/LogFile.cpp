#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <filesystem>
#include <system_error>

#include "configuration/FileContent.h"
#include "logging/Sinks.h"

namespace RZLog {

namespace {

[[noreturn]] void fail(int error) {
    throw std::system_error(error, std::generic_category());
}

class LogFile : public Sink {
public:
    explicit LogFile(const LogSettings& settings)
        : path(settings.file), rotationSize(settings.rotationSize), rotationCount(settings.rotationCount) {
        open();
    }

    void write(const Record& record) override {
        const std::string line = fileLine(record, std::chrono::system_clock::now()) + '\n';
        if (size > 0 && size + line.size() > rotationSize) {
            rotate();
        }
        append(line);
    }

private:
    /** Opens the file. Does not wait for the reader of a pipe, refuses a symbolic link, and creates no directory. */
    void open() {
        constexpr int flags = O_WRONLY | O_APPEND | O_CREAT | O_NOFOLLOW | O_CLOEXEC | O_NONBLOCK | O_NOCTTY;
        constexpr mode_t modeOfNewFiles = 0640;  // records contain values that clients sent
        file = Agent::FileDescriptor(::open(path.c_str(), flags, modeOfNewFiles));
        struct stat status {};
        if (file.get() < 0 || ::fstat(file.get(), &status) != 0) {
            fail(errno);
        }
        if (!S_ISREG(status.st_mode)) {
            fail(EINVAL);
        }
        size = static_cast<std::size_t>(status.st_size);
    }

    void append(std::string_view line) {
        while (!line.empty()) {
            const ssize_t count = ::write(file.get(), line.data(), line.size());
            if (count < 0 && errno != EINTR) {
                fail(errno);
            }
            const auto written = static_cast<std::size_t>(count < 0 ? 0 : count);
            size += written;
            line.remove_prefix(written);
        }
    }

    /** Renames the files and opens a new one. Empties a full file that it cannot rename, to limit the disk usage. */
    void rotate() {
        for (std::size_t number = rotationCount; number > 0; --number) {
            const bool isRenamed = std::rename(nameOf(number - 1).c_str(), nameOf(number).c_str()) == 0;
            if (!isRenamed && number == 1 && errno != ENOENT && ::ftruncate(file.get(), 0) != 0) {
                fail(errno);
            }
        }
        open();
    }

    /** Returns the name of a rotated file, which has its number before the extension. 0 is the log file itself. */
    std::string nameOf(std::size_t number) const {
        if (number == 0) {
            return path;
        }
        const std::string extension = std::filesystem::path(path).extension();
        return path.substr(0, path.size() - extension.size()) + '.' + std::to_string(number) + extension;
    }

    std::string path;
    std::size_t rotationSize;
    std::size_t rotationCount;
    Agent::FileDescriptor file{};
    std::size_t size = 0;
};

}  // namespace

std::unique_ptr<Sink> openLogFile(const LogSettings& settings) {
    return std::make_unique<LogFile>(settings);
}

}  // namespace RZLog
