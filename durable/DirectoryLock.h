#pragma once

#include <sys/types.h>

#include <mutex>
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
        held,
        heldByOther,
        unavailable  ///< the file cannot be created, or its file system has no locks
    };

    struct Result {
        State state;
        std::string reason{};  ///< the process that holds it, or why it is unavailable
    };

    constexpr DirectoryLock() = default;
    ~DirectoryLock() {
        closeFile();  // without the mutex, which another thread may have held when this process was forked
    }
    DirectoryLock(const DirectoryLock&) = delete;
    DirectoryLock& operator=(const DirectoryLock&) = delete;

    /** Acquires the lock, unless this process holds it, and returns at once. Creates the file. */
    Result acquire(const std::string& directory);

    void release();

private:
    bool isHeldIn(const std::string& path) const;
    void closeFile();
    void writeOwner() const;
    std::string ownerOf(const std::string& path) const;

    std::mutex mutex{};
    int descriptor = -1;
    pid_t process = 0;  ///< the process that acquired it; a forked child has the descriptor but not the lock
};

}  // namespace durable
