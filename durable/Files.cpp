#include "Files.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <system_error>

namespace durable {

namespace {

[[noreturn]] void fail(const std::string& path) {
    throw std::system_error(errno, std::generic_category(), path);
}

void require(bool isDone, const std::string& path) {
    if (!isDone) {
        fail(path);
    }
}

/** The directory of a file, with a separator at its end. */
std::string directoryOf(const std::string& path) {
    return path.substr(0, path.rfind('/') + 1);
}

/** A file that is open during the lifetime of this object. */
class Descriptor {
public:
    Descriptor(const std::string& itsPath, int flags, mode_t mode = 0)
        : path(itsPath), number(open(itsPath.c_str(), flags | O_CLOEXEC, mode)) {}
    ~Descriptor() {
        if (number >= 0) {
            close(number);
        }
    }
    Descriptor(const Descriptor&) = delete;
    Descriptor& operator=(const Descriptor&) = delete;

    bool isOpen() const { return number >= 0; }

    struct stat status() const {
        struct stat found {};
        require(fstat(number, &found) == 0, path);
        return found;
    }

    std::string readAll() const {
        std::string content(static_cast<std::size_t>(status().st_size) + 1, '\0');
        std::size_t size = 0;
        while (true) {
            const ssize_t count = read(number, content.data() + size, content.size() - size);
            require(count >= 0 || errno == EINTR, path);
            if (count == 0) {
                break;
            }
            size += count > 0 ? static_cast<std::size_t>(count) : 0;
            content.resize(size < content.size() ? content.size() : 2 * size);
        }
        content.resize(size);
        return content;
    }

    void writeAll(std::string_view content) const {
        while (!content.empty()) {
            const ssize_t count = write(number, content.data(), content.size());
            require(count >= 0 || errno == EINTR, path);
            content.remove_prefix(count > 0 ? static_cast<std::size_t>(count) : 0);
        }
    }

    /** Copies owner and group of the directory as far as permitted, so that its owner can use a file of root. */
    void belongToDirectory() const {
        struct stat found {};
        const bool isOwned =
            stat(directoryOf(path).c_str(), &found) == 0 && fchown(number, found.st_uid, found.st_gid) == 0;
        static_cast<void>(isOwned);
    }

    /**
     * Copies owner, group and mode of a model as far as permitted. If the group cannot be copied, only the new owner
     * has access. A file of another user keeps its mode. If there is no model, copies owner and group of the directory.
     */
    void beLike(const std::string& model) const {
        struct stat found {};
        if (stat(model.c_str(), &found) != 0) {
            belongToDirectory();
        } else {
            const bool hasGroup = fchown(number, static_cast<uid_t>(-1), found.st_gid) == 0;
            const bool hasOwner = fchown(number, found.st_uid, static_cast<gid_t>(-1)) == 0;
            const bool hasMode = fchmod(number, found.st_mode & (hasGroup ? 0777U : 0700U)) == 0;
            require(hasMode || (errno == EPERM && !hasOwner), path);
        }
    }

    /** Removes the content if possible. */
    void clear() const {
        const bool isEmpty = ftruncate(number, 0) == 0;
        static_cast<void>(isEmpty);
    }

    void sync() const {
        while (fsync(number) != 0) {
            require(errno == EINTR, path);
        }
    }

private:
    const std::string& path;
    const int number;
};

/** Creates or overwrites a file, and syncs it. @param flags additional flags for open() */
void writeFile(const std::string& path, int flags, std::string_view content, const std::string& model) {
    const Descriptor file(path, O_WRONLY | O_CREAT | O_TRUNC | O_NOFOLLOW | O_NONBLOCK | flags, 0600);
    require(file.isOpen(), path);
    try {
        file.beLike(model);
        file.writeAll(content);
        file.sync();
    } catch (...) {
        file.clear();  // the content may be complete without being on the disk
        throw;
    }
}

}  // namespace

std::optional<std::string> readFile(const std::string& path) {
    const Descriptor file(path, O_RDONLY | O_NONBLOCK);
    require(file.isOpen() || errno == ENOENT, path);
    return file.isOpen() ? std::optional<std::string>(file.readAll()) : std::nullopt;
}

void replaceFile(const std::string& path, std::string_view content, const std::string& model) {
    const std::string temporary = path + ".new";
    unlink(temporary.c_str());
    try {
        writeFile(temporary, O_EXCL, content, model);
        renameFile(temporary, path);
    } catch (...) {
        unlink(temporary.c_str());
        throw;
    }
}

void overwriteFile(const std::string& path, std::string_view content, const std::string& model) {
    writeFile(path, 0, content, model);
}

void createFile(const std::string& path, mode_t mode) {
    const Descriptor file(path, O_WRONLY | O_CREAT | O_EXCL, mode);
    if (file.isOpen()) {
        file.belongToDirectory();
    } else {
        require(errno == EEXIST, path);
    }
}

void renameFile(const std::string& from, const std::string& to) {
    require(rename(from.c_str(), to.c_str()) == 0, to);
}

std::string resolvedPath(const std::string& path) {
    const std::unique_ptr<char, decltype(&std::free)> resolved(realpath(path.c_str(), nullptr), &std::free);
    return resolved != nullptr ? resolved.get() : path;
}

void syncFile(const std::string& path) {
    const Descriptor file(path, O_RDONLY | O_NONBLOCK);
    require(file.isOpen(), path);
    file.sync();
}

void syncDirectoryOf(const std::string& path) {
    syncFile(directoryOf(path));
}

}  // namespace durable
