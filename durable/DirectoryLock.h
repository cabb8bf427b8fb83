#pragma once

#include <sys/types.h>

#include <string>

namespace durable {

/**
 * The lock by which one process owns a data directory: an advisory record lock on the file "owner" there. The file
 * contains the process id and the program name, only for messages.
 *
 * A record lock belongs to the process: it ends with the process, a forked child does not have it, and the system knows
 * its owner. A process also loses the lock when it closes any descriptor of the file, so other code must not open it.
 */
class DirectoryLock {
public:
    enum class State {
        held,      ///< since an earlier call
        acquired,  ///< by this call
        heldByOther,
        denied,       ///< this process cannot write the file, the file has another name, or a system call failed
        unavailable,  ///< the directory is missing, or its file system has no locks
    };

    struct Result {
        State state;
        std::string reason{};  ///< the process that holds the lock, or why it is denied or unavailable
    };

    constexpr DirectoryLock() = default;
    ~DirectoryLock() { release(); }
    DirectoryLock(const DirectoryLock&) = delete;
    DirectoryLock& operator=(const DirectoryLock&) = delete;

    /**
     * Tries to acquire the lock, unless this process holds it. Does not wait. Creates the file if permitted. Throws
     * std::system_error if the file cannot be opened because of missing resources or an input/output error.
     */
    Result acquire(const std::string& directory);

    void release();

private:
    bool isHeldIn(const std::string& path) const;
    void writeOwner() const;
    std::string ownerOf(const std::string& path) const;

    int descriptor = -1;
    pid_t process = 0;  ///< the process that acquired it; a forked child has the descriptor but not the lock
};

}  // namespace durable
