#include "framework/OpenFile.h"

#include "KO/Exceptions.h"
#include "KO/File.h"
#include "KO/Strings.h"
#include "configuration/FileContent.h"

#include <fcntl.h>
#include <sys/stat.h>

#include <cerrno>

namespace KO {

namespace {

constexpr mode_t modeOfNewFiles = 0640;
constexpr int everyOpening = O_CLOEXEC | O_NOCTTY | O_NONBLOCK;

/** @return errno value; 0 for an ordinary file */
int checkOrdinary(int file) {
    struct stat status {};
    if (::fstat(file, &status) != 0) {
        return errno;
    }
    if (S_ISDIR(status.st_mode)) {
        return EISDIR;
    }
    return S_ISREG(status.st_mode) ? 0 : EINVAL;
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
    if (const int error = checkOrdinary(file.get())) {
        throwFileError(failure, name, error);
    }
    return file;
}

void throwFileError(const char* failure, const std::string& path, int error) {
    throw FrameworkException((failure + path + ": " + Agent::errorText(error)).c_str());
}

}  // namespace KO
