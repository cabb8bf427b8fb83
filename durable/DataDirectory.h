#pragma once

#include <sys/types.h>

#include <array>
#include <cstddef>
#include <optional>
#include <string>

#include "CurrentProcess.h"
#include "DirectoryLock.h"
#include "RecordFile.h"

namespace durable {

/**
 * The agent's data directory. The process that holds its lock is the owner, which recovers the record files and makes
 * changes. Another process only reads. If locks are unavailable, every process is an owner, and the log reports that.
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
     * Called before the provider is loaded. Acquires the lock if possible. The owner recovers the record files. Throws
     * std::system_error if a file cannot be checked or restored. Unless it returns true, the provider stays outdated.
     * @return whether the files may be read now; false if they are incomplete, or another process may be writing them
     */
    bool open();

    /** The number of records of each record file: 0 if there is no file or no number, none if it cannot be read. */
    std::array<std::optional<std::size_t>, recordFileCount> recordCounts() const;

    /** Whether a record file and its saved copies were removed since open(), so that its records are only in memory. */
    bool hasLostFiles() const;

    /** Ends the use of the saved copies, and releases the lock. Called when the provider is unloaded for the last time.
     */
    void close();

    /** The result of acquire(). */
    struct Ownership {
        bool isOwner;
        bool isOtherProcess;  ///< whether another process is the owner, and may end
        std::string reason;   ///< a message if this process is not the owner
    };

    /** Tries to become the owner, for a change. Returns at once. */
    Ownership acquire();

    /** Whether another process has written the files since open() returned true. It may not have finished. */
    bool hasChanged() const { return !isOwner() && stamp() != openStamp; }

    /** Whether the provider has to be loaded again, because another process has changed the files or may have. */
    bool isOutdated() const { return hasOtherOwner || hasChanged(); }

private:
    /** The inodes, sizes and times of the record files. */
    using Stamp = std::array<std::array<long long, 3>, recordFileCount>;

    bool isOwner() const { return owner == currentProcess(); }
    bool exists() const;
    DirectoryLock::Result acquireLock();
    void recover() const;
    void finish() const;
    bool needRecovery() const;
    Stamp stamp() const;
    void remember(const Stamp& stamp);

    /** Whether there is a record file or a saved copy. @param stamp of the directory as it is now */
    bool hasStored(const Stamp& stamp) const;

    std::string (*path)();
    void (*log)(const std::string&);
    DirectoryLock lock{};
    pid_t owner = 0;  ///< this process, if it is the owner; a forked child is not
    bool isReported = false;
    bool hasOtherOwner = false;  ///< whether another process may have been the owner since open()
    Stamp openStamp{};
    std::array<bool, recordFileCount> wereStored{};
};

}  // namespace durable
