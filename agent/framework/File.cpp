#include "KO/File.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <filesystem>

#include "KO/Exceptions.h"
#include "KO/Strings.h"
#include "framework/FileAccess.h"

namespace KO {

namespace {

constexpr mode_t modeOfNewFiles = 0640;
constexpr int everyOpening = O_CLOEXEC | O_NOCTTY | O_NONBLOCK;

/** @return errno value; 0 for a regular file */
int checkRegular(int file) {
    struct stat status {};
    if (::fstat(file, &status) != 0) {
        return errno;
    }
    if (S_ISDIR(status.st_mode)) {
        return EISDIR;
    }
    return S_ISREG(status.st_mode) ? 0 : EINVAL;
}

[[noreturn]] void fail(const std::string& path) {
    throwFileError("Cannot write ", path, errno);
}

/** Returns a name template in the target's directory. The name identifies files that remain after a crash. */
std::string temporaryNameFor(const std::string& target) {
    const std::size_t name = target.rfind('/') + 1;
    return target.substr(0, name) + "." + target.substr(name) + ".new-XXXXXX";
}

/** A temporary file in the directory of the file to replace. The destructor removes it unless it was renamed. */
class TemporaryFile {
public:
    explicit TemporaryFile(const std::string& target)
        : path(temporaryNameFor(target)), file(::mkostemp(path.data(), O_CLOEXEC)) {
        if (file.get() < 0) {
            path.clear();
            fail(target);
        }
    }
    ~TemporaryFile() {
        if (!path.empty()) {
            ::unlink(path.c_str());
        }
    }
    TemporaryFile(const TemporaryFile&) = delete;
    TemporaryFile& operator=(const TemporaryFile&) = delete;

    /** Copies mode and owner of the file to replace. If that file does not exist, only the owner has access. */
    void adoptAttributes(const std::string& target) {
        struct stat status {};
        if (::stat(target.c_str(), &status) != 0) {
            if (errno != ENOENT) {
                fail(target);
            }
            return;
        }
        if (::fchmod(file.get(), adoptOwners(status) ? status.st_mode & 07777 : withoutGroup(status.st_mode)) != 0) {
            fail(target);
        }
    }

    void write(const std::string& content) {
        std::size_t written = 0;
        while (written < content.size()) {
            const ssize_t count = ::write(file.get(), content.data() + written, content.size() - written);
            if (count < 0 && errno != EINTR) {
                fail(path);
            }
            written += count > 0 ? static_cast<std::size_t>(count) : 0;
        }
        if (::fsync(file.get()) != 0) {
            fail(path);
        }
    }

    void replace(const std::string& target) {
        if (::rename(path.c_str(), target.c_str()) != 0) {
            fail(target);
        }
        path.clear();
    }

private:
    /**
     * Only root may change the owner; other users may change the group to one of their groups.
     * @return whether the file has the group of the replaced file
     */
    bool adoptOwners(const struct stat& status) {
        constexpr uid_t unchanged = static_cast<uid_t>(-1);
        return ::fchown(file.get(), status.st_uid, status.st_gid) == 0 ||
               ::fchown(file.get(), unchanged, status.st_gid) == 0;
    }

    /** Drops group permissions and limits "other" to the old group's, since its members are now "other". */
    static mode_t withoutGroup(mode_t mode) { return (mode & 0700U) | (mode & (mode >> 3U) & 07U); }

    std::string path;
    Agent::FileDescriptor file;
};

/**
 * Follows symbolic links. Returns the path itself if no file exists there. Fails if the path cannot be resolved for
 * another reason, such as a loop of links.
 */
std::string followLinks(const std::string& path) {
    std::error_code error;
    const std::filesystem::path target = std::filesystem::canonical(path, error);
    if (error && error != std::errc::no_such_file_or_directory) {
        throwFileError("Cannot write ", path, error.value());
    }
    return error ? path : target.string();
}

/** Forces the renaming to the disk. Ignores failures, because the file is already replaced. */
void syncDirectoryOf(const std::string& path) {
    const std::string directory = path.find('/') == std::string::npos ? "." : path.substr(0, path.rfind('/') + 1);
    const Agent::FileDescriptor file(::open(directory.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    if (file.get() >= 0) {
        ::fsync(file.get());
    }
}

}  // namespace

Agent::FileDescriptor openFile(const std::wstring& path, unsigned long mode) {
    constexpr const char* failure = "Cannot open ";
    const std::string name = make_string(path);
    if (name.find('\0') != std::string::npos || (mode != FILE_MODE_READ && mode != FILE_MODE_WRITE)) {
        throwFileError(failure, name, EINVAL);
    }
    const int flags = everyOpening | (mode == FILE_MODE_READ ? O_RDONLY : O_RDWR | O_CREAT);
    Agent::FileDescriptor file(::open(name.c_str(), flags, modeOfNewFiles));
    if (file.get() < 0) {
        throwFileError(failure, name, errno);
    }
    if (const int error = checkRegular(file.get())) {
        throwFileError(failure, name, error);
    }
    return file;
}

void throwFileError(const char* failure, const std::string& path, int error) {
    throw FrameworkException((failure + path + ": " + Agent::errorText(error)).c_str());
}

void replaceFile(const std::string& path, const std::string& content) {
    const std::string target = followLinks(path);
    TemporaryFile file(target);
    file.adoptAttributes(target);
    file.write(content);
    file.replace(target);
    syncDirectoryOf(target);
}

struct File::Path::Implementation {
    std::wstring text;
};

File::Path::Path(const std::wstring& path) : implementation(std::make_unique<Implementation>()) {
    implementation->text = path;
}
File::Path::Path(const Path& other) : implementation(std::make_unique<Implementation>(*other.implementation)) {}
File::Path::~Path() = default;

File::Path& File::Path::operator=(const Path& other) {
    implementation->text = other.implementation->text;
    return *this;
}

std::wstring File::Path::text() const {
    return implementation->text;
}

struct File::Implementation {
    std::wstring path;
    Agent::FileDescriptor file;
};

File::File(const std::wstring& path) : implementation(std::make_unique<Implementation>()) {
    implementation->path = path;
}
File::~File() = default;

void File::open(unsigned long mode) {
    implementation->file = openFile(implementation->path, mode);
}
void File::close() {
    implementation->file = Agent::FileDescriptor();
}

bool File::exists(const std::wstring& path) {
    const std::string name = make_string(path);
    struct stat status {};
    return name.find('\0') == std::string::npos && ::stat(name.c_str(), &status) == 0;
}

}  // namespace KO
