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
 * changes. Other processes only read. If locks are unavailable, every process is an owner, and the log reports that.
 */
class DataDirectory {
public:
    /**
     * @param itsPath returns the directory's path, which ends with a separator
     * @param itsLog writes an error to the log
     */
    constexpr DataDirectory(std::string (*itsPath)(), void (*itsLog)(const std::string&))
        : path(itsPath), log(itsLog) {}

    /**
     * Call it before the provider is loaded. Acquires the lock if possible. The owner recovers the record files. Throws
     * std::system_error if a file cannot be checked or restored. Unless it returns true, an outdated provider stays so.
     * @return whether the files can be read now; false if they are incomplete, or another process may be writing them
     */
    bool open();

    /** The number of records that each file declares: 0 without a file or number, none if the file cannot be read. */
    std::array<std::optional<std::size_t>, recordFileCount> recordCounts() const;

    /** Whether a record file and its saved copies were removed since open(), so that its records are only in memory. */
    bool hasLostFiles() const;

    /** Marks the saved copies as no longer in use, and releases the lock. Call it after the provider is unloaded. */
    void close();

    /** The result of acquire(). */
    struct Ownership {
        bool isOwner;
        bool isOtherProcess;  ///< whether another process is the owner, so that a later call may succeed
        std::string reason;   ///< a message if this process is not the owner
    };

    /** Tries to become the owner, for a change. Does not wait. */
    Ownership acquire();

    /** Whether another process has written the files since open() returned true. It may still be writing. */
    bool hasChanged() const { return !isOwner() && stamp() != openStamp; }

    /** Whether the provider has to be loaded again, because another process has or may have changed the files. */
    bool isOutdated() const { return hasOtherOwner || hasChanged(); }

private:
    /** The inodes, sizes and modification times of the record files. */
    using Stamp = std::array<std::array<long long, 3>, recordFileCount>;

    bool isOwner() const { return owner == currentProcess(); }
    bool exists() const;
    DirectoryLock::Result acquireLock();
    void recover() const;
    void finish() const;
    bool needRecovery() const;
    Stamp stamp() const;
    void remember(const Stamp& stamp);

    /** Whether there is a record file or a saved copy. @param stamp the current stamp() */
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
