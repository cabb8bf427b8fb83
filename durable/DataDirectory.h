#pragma once

#include "DirectoryLock.h"
#include "RecordFile.h"

#include <array>
#include <atomic>
#include <string>

namespace durable {

/**
 * The agent's data directory. The process that holds its lock is the owner, which recovers the record files and makes
 * changes. Another process reads. Where locks are unavailable, every process acts as the owner, and the log says so.
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
     * Called before the provider is loaded. The owner recovers the record files. Another process waits at most a second
     * until they are complete. Throws std::system_error if a file cannot be checked or restored.
     */
    void open();

    /** Releases the lock. Called when the provider is unloaded. */
    void close() { lock.release(); }

    /**
     * Ensures that this process is the owner. Waits some seconds for another owner to end, then throws
     * std::runtime_error, which names it.
     */
    void requireOwned();

    /** Whether another process has written the files since open(). It may not have finished. */
    bool hasChanged() const;

    /** Whether the provider has to be loaded again: another process has changed the files, or has been the owner. */
    bool isOutdated() const;

private:
    /** The inodes, sizes and times of the record files. */
    using Stamp = std::array<std::array<long long, 4>, recordFileCount>;

    bool acquire(std::string& owner);
    void recover() const;
    bool areComplete() const;
    Stamp stamp() const;

    std::string (*path)();
    void (*log)(const std::string&);
    DirectoryLock lock{};
    std::atomic<bool> isOwned{false};
    std::atomic<bool> isReported{false};
    std::atomic<bool> hadOther{false};  ///< whether another process was the owner at open() or since
    Stamp openStamp{};
};

}  // namespace durable
