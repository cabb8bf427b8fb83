#include "DirectoryLock.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <system_error>

#include "CurrentProcess.h"
#include "Files.h"

namespace durable {

namespace {

/** A lock on all bytes of a file. */
struct flock lockOfFile() {
    struct flock lock {};
    lock.l_type = F_WRLCK;
    lock.l_whence = SEEK_SET;
    return lock;
}

/** Tries to lock the file. Returns 0 or the error. */
int tryLock(int descriptor) {
    struct flock lock = lockOfFile();
    int error = 0;
    do {
        error = fcntl(descriptor, F_SETLK, &lock) == 0 ? 0 : errno;
    } while (error == EINTR);
    return error;
}

/** The state after a failed attempt. File systems without locks return the errors of an unsupported operation. */
DirectoryLock::State stateAfter(int error) {
    if (error == EACCES || error == EAGAIN) {
        return DirectoryLock::State::heldByOther;
    }
    const bool isUnknown = error == EINVAL || error == ENOSYS || error == EOPNOTSUPP;
    return isUnknown ? DirectoryLock::State::unavailable : DirectoryLock::State::denied;
}

/**
 * Whether the file must not be written, because it is not a regular file or has another name. Otherwise, a user who may
 * write to the directory could make "owner" a hard link to a file elsewhere, which a process of root would change.
 */
bool isForeign(int descriptor) {
    struct stat file {};
    return fstat(descriptor, &file) == 0 && (!S_ISREG(file.st_mode) || file.st_nlink > 1);
}

/**
 * Permits all users who may write to the directory to lock the file, also if root has created it. Another user's file
 * keeps its mode.
 */
void shareWithUsersOf(const std::string& directory, int descriptor) {
    struct stat found {};
    const bool isShared = stat(directory.c_str(), &found) == 0 && fchmod(descriptor, found.st_mode & 0666U) == 0 &&
                          fchown(descriptor, found.st_uid, found.st_gid) == 0;
    static_cast<void>(isShared);
}

}  // namespace

DirectoryLock::Result DirectoryLock::acquire(const std::string& directory) {
    const std::string path = directory + "owner";
    if (isHeldIn(path)) {
        return {State::held};
    }
    release();  // of a file that was inherited from the parent process, or removed from the directory
    descriptor = open(path.c_str(), O_RDWR | O_CREAT | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK, 0644);
    const bool isOpen = descriptor >= 0;
    if (isOpen && isForeign(descriptor)) {
        release();
        return {State::denied, path + ": " + "It is not a regular file, or has another name too. Remove it"};
    }
    const int error = isOpen ? tryLock(descriptor) : errno;
    if (error == 0) {
        process = currentProcess();
        shareWithUsersOf(directory, descriptor);
        writeOwner();
        return {State::acquired};
    }
    if (!isOpen && (error == EMFILE || error == ENFILE || error == ENOMEM || error == EIO)) {
        throw std::system_error(error, std::generic_category(), path);
    }
    const State state = isOpen ? stateAfter(error) : error == ENOENT ? State::unavailable : State::denied;
    Result result{state,
                  state == State::heldByOther ? ownerOf(path) : path + ": " + std::generic_category().message(error)};
    release();
    return result;
}

/** Whether this process holds the lock of the file that now has this path. */
bool DirectoryLock::isHeldIn(const std::string& path) const {
    struct stat held {};
    struct stat found {};
    return descriptor >= 0 && process == currentProcess() && fstat(descriptor, &held) == 0 &&
           stat(path.c_str(), &found) == 0 && held.st_dev == found.st_dev && held.st_ino == found.st_ino;
}

void DirectoryLock::release() {
    process = 0;
    if (descriptor >= 0) {
        close(descriptor);
        descriptor = -1;
    }
}

void DirectoryLock::writeOwner() const {
    const std::string owner = std::to_string(process) + " " + program_invocation_short_name + "\n";
    const bool isWritten = ftruncate(descriptor, 0) == 0 &&
                           write(descriptor, owner.data(), owner.size()) == static_cast<ssize_t>(owner.size());
    static_cast<void>(isWritten);  // the lock does not depend on the content
}

/** Takes the process id from the system or, for an owner in another container, from the file. The file has the name. */
std::string DirectoryLock::ownerOf(const std::string& path) const {
    struct flock lock = lockOfFile();
    const bool isKnown = fcntl(descriptor, F_GETLK, &lock) == 0 && lock.l_type != F_UNLCK && lock.l_pid > 0;
    std::string owner = readFile(path).value_or(std::string());
    owner.resize(std::min(owner.find('\n'), owner.size()));
    const std::string id = isKnown ? std::to_string(lock.l_pid) : owner.substr(0, owner.find(' '));
    const bool isNamed = owner.compare(0, id.size() + 1, id + " ") == 0;
    return "process " + id + (isNamed ? " (" + owner.substr(id.size() + 1) + ")" : "");
}

}  // namespace durable
