#pragma once

#include "DirectoryLock.h"
#include "RecordFile.h"

#include <array>
#include <string>

namespace durable {

/**
 * The agent's data directory. The process that holds its lock is the owner, which recovers the record files and makes
 * changes. Another process only reads. Where locks are unavailable, every process is an owner, and the log says so.
 */
class DataDirectory {
public:
    /**
     * @param itsPath returns the directory's name, which ends with a separator
     * @param itsLog writes an error to the log
     */
    constexpr DataDirectory(std::string (*itsPath)(), void (*itsLog)(const std::string&))
        : path(itsPath), log(itsLog) {}

    /**
     * Called before the provider is loaded. Acquires the lock if possible. The owner recovers the record files; another
     * process waits at most a second until they need no recovery. Throws std::system_error if a file cannot be checked
     * or restored.
     */
    void open();

    /** Whether the directory exists. */
    bool exists() const;

    /** Releases the lock. Called when the provider is unloaded. */
    void close() { lock.release(); }

    /** The result of acquire(). */
    struct Ownership {
        bool isOwner;
        bool isOtherProcess;  ///< whether another process is the owner, and may end
        std::string reason;   ///< a message if this process is not the owner
    };

    /** Tries to become the owner, for a change. Returns at once. */
    Ownership acquire();

    /** Whether another process has written the files since open(). It may not have finished. */
    bool hasChanged() const { return !isOwner && stamp() != openStamp; }

    /** Whether the provider has to be loaded again, because another process has changed the files or may have. */
    bool isOutdated() const { return hasOtherOwner || (hasChanged() && !needRecovery()); }

private:
    /** The inodes, sizes and times of the record files. */
    using Stamp = std::array<std::array<long long, 4>, recordFileCount>;

    DirectoryLock::Result acquireLock();
    void recover() const;
    bool needRecovery() const;
    Stamp stamp() const;

    std::string (*path)();
    void (*log)(const std::string&);
    DirectoryLock lock{};
    bool isOwner = false;
    bool isReported = false;
    bool hasOtherOwner = false;  ///< whether another process may have been the owner since open()
    Stamp openStamp{};
};

}  // namespace durable
