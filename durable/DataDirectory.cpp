#include "DataDirectory.h"

#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <ctime>
#include <system_error>

namespace durable {

namespace {

constexpr long long second = 1000000000;

long long nanosecondsIn(const timespec& time) {
    return time.tv_sec * second + time.tv_nsec;
}

/** The current time of the clock that file systems use. The clock advances every few milliseconds. */
long long timeOfFiles() {
    timespec now{};
    clock_gettime(CLOCK_REALTIME_COARSE, &now);
    return nanosecondsIn(now);
}

bool isStored(const RecordFile& file) {
    try {
        return file.isStored();
    } catch (const std::system_error&) {
        return true;  // the file or a copy exists, but cannot be read
    }
}

bool isIncomplete(const RecordFile& file) {
    try {
        return !file.isComplete(file.content().value_or(std::string()));
    } catch (const std::system_error&) {
        return false;  // the provider cannot read it either
    }
}

bool needsRecovery(const RecordFile& file) {
    try {
        return file.needsRecovery();
    } catch (const std::system_error&) {
        return isIncomplete(file);  // a file exists that this process cannot read, such as a copy
    }
}

}  // namespace

bool DataDirectory::open() {
    const bool hadOtherOwner = hasOtherOwner;
    hasOtherOwner = true;  // stays true if an exception is thrown
    acquireLock();
    if (isOwner()) {
        recover();
    }
    const long long now = timeOfFiles();
    const Stamp current = stamp();
    remember(current);
    // Another write with the same file time would not be detected, so that time must have passed. A time more than a
    // second ahead is ignored as wrong.
    const bool isSettled = std::none_of(current.begin(), current.end(),
                                        [&](const auto& file) { return file[2] >= now && file[2] < now + second; });
    const bool isReadable = isOwner() || (isSettled && !needRecovery());
    if (isReadable) {
        openStamp = current;
    }
    hasOtherOwner = hadOtherOwner && !isReadable;
    return isReadable;
}

void DataDirectory::close() {
    if (isOwner()) {
        finish();
    }
    lock.release();
    owner = 0;
    wereStored = {};
}

std::array<std::optional<std::size_t>, recordFileCount> DataDirectory::recordCounts() const {
    std::array<std::optional<std::size_t>, recordFileCount> counts;
    const std::vector<RecordFile> files = recordFilesIn(path());
    for (std::size_t index = 0; index < counts.size(); ++index) {
        try {
            counts[index] = RecordFile::declaredIn(files[index].content().value_or(std::string())).value_or(0);
        } catch (const std::system_error&) {
            counts[index] = std::nullopt;
        }
    }
    return counts;
}

/** Stops at a file that cannot be read or written: its copies stay marked as in use. */
void DataDirectory::finish() const {
    try {
        for (const RecordFile& file : recordFilesIn(path())) {
            file.finish();
        }
    } catch (const std::exception&) {
        return;
    }
}

bool DataDirectory::hasLostFiles() const {
    const std::vector<RecordFile> files = recordFilesIn(path());
    for (std::size_t index = 0; index < files.size(); ++index) {
        if (wereStored[index] && !isStored(files[index])) {
            return true;
        }
    }
    return false;
}

void DataDirectory::remember(const Stamp& stamp) {
    for (std::size_t index = 0; index < stamp.size(); ++index) {
        wereStored[index] = wereStored[index] || stamp[index][1] != 0;
    }
}

bool DataDirectory::hasStored(const Stamp& stamp) const {
    const std::vector<RecordFile> files = recordFilesIn(path());
    return stamp != Stamp{} || std::any_of(files.begin(), files.end(), isStored);
}

bool DataDirectory::exists() const {
    return access(path().c_str(), F_OK) == 0;
}

DataDirectory::Ownership DataDirectory::acquire() {
    const bool hadOtherOwner = hasOtherOwner;
    hasOtherOwner = true;  // stays true if an exception is thrown
    const DirectoryLock::Result result = acquireLock();
    const bool isOther = result.state == DirectoryLock::State::heldByOther;
    const Stamp now = stamp();
    // Without record files and copies, no other owner has stored records.
    hasOtherOwner = hadOtherOwner || (result.state == DirectoryLock::State::acquired && hasStored(now));
    remember(now);
    return {isOwner(), isOther,
            "The data directory " + path() +
                (isOther ? " is in use by " + result.reason + ". Send the request to that process, or end it."
                         : " cannot be changed by this process. " + result.reason + ".")};
}

DirectoryLock::Result DataDirectory::acquireLock() {
    DirectoryLock::Result result = lock.acquire(path());
    const bool isUnavailable = result.state == DirectoryLock::State::unavailable;
    if (isUnavailable && exists() && !isReported) {
        isReported = true;
        log("The data directory cannot be locked, so do not let two processes change it. " + result.reason);
    }
    const bool isDenied =
        result.state == DirectoryLock::State::heldByOther || result.state == DirectoryLock::State::denied;
    owner = isDenied ? 0 : currentProcess();
    return result;
}

void DataDirectory::recover() const {
    for (const RecordFile& file : recordFilesIn(path())) {
        std::string done;
        try {
            done = file.recover();
        } catch (const std::system_error& error) {
            if (access(file.path().c_str(), R_OK | W_OK) == 0) {
                throw;  // the provider would read an incomplete file, and a change would make the loss permanent
            }
            done = std::string("A record file cannot be read and written. ") + error.what();
        }
        if (!done.empty()) {
            log(done);
        }
    }
}

bool DataDirectory::needRecovery() const {
    const std::vector<RecordFile> files = recordFilesIn(path());
    return std::any_of(files.begin(), files.end(), needsRecovery);
}

DataDirectory::Stamp DataDirectory::stamp() const {
    Stamp stamp{};
    const std::vector<RecordFile> files = recordFilesIn(path());
    for (std::size_t index = 0; index < stamp.size(); ++index) {
        struct stat status {};
        stat(files[index].path().c_str(), &status);
        stamp[index] = {static_cast<long long>(status.st_ino), status.st_size, nanosecondsIn(status.st_mtim)};
    }
    return stamp;
}

}  // namespace durable
