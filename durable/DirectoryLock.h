#pragma once

#include <sys/types.h>

#include <string>

namespace durable {

/**
 * The lock by which one process owns a data directory: an advisory record lock on the file "owner" there. The file's
 * content, the process id and the program, is only for messages.
 *
 * A record lock belongs to the process: it ends with the process, a forked child does not have it, and the system knows
 * its owner. The process also loses it if it closes any descriptor of the file, so no other code may open the file.
 */
class DirectoryLock {
public:
    enum class State {
        held,      ///< since an earlier call
        acquired,  ///< by this call
        heldByOther,
        denied,       ///< this process must not write the file, it has another name too, or the system failed
        unavailable,  ///< the directory is missing, or its file system has no locks
    };

    struct Result {
        State state;
        std::string reason{};  ///< the process that holds it, or why it is denied or unavailable
    };

    constexpr DirectoryLock() = default;
    ~DirectoryLock() { release(); }
    DirectoryLock(const DirectoryLock&) = delete;
    DirectoryLock& operator=(const DirectoryLock&) = delete;

    /**
     * Acquires the lock, unless this process holds it, and returns at once. Creates the file if it may. Throws
     * std::system_error if the system lacks resources.
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
