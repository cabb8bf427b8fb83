#include "DataDirectory.h"

#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <system_error>
#include <thread>

namespace durable {

namespace {

/** Maximum time that open() waits for the owner to finish writing. */
constexpr std::chrono::seconds writeTimeout{1};
constexpr std::chrono::milliseconds pollInterval{20};

}  // namespace

void DataDirectory::open() {
    acquireLock();
    if (isOwner) {
        recover();
    } else {
        const auto end = std::chrono::steady_clock::now() + writeTimeout;
        while (needRecovery() && std::chrono::steady_clock::now() < end) {
            std::this_thread::sleep_for(pollInterval);
        }
    }
    hasOtherOwner = false;
    openStamp = stamp();
}

bool DataDirectory::exists() const {
    return access(path().c_str(), F_OK) == 0;
}

DataDirectory::Ownership DataDirectory::acquire() {
    const bool hadOtherOwner = hasOtherOwner;
    hasOtherOwner = true;  // if an exception leaves the question open
    const DirectoryLock::Result result = acquireLock();
    const bool isOther = result.state == DirectoryLock::State::heldByOther;
    // Without record files, the provider's records are the only ones.
    hasOtherOwner = hadOtherOwner || (result.state == DirectoryLock::State::acquired && stamp() != Stamp{});
    return {isOwner, isOther,
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
    isOwner = result.state != DirectoryLock::State::heldByOther && result.state != DirectoryLock::State::denied;
    return result;
}

void DataDirectory::recover() const {
    for (const RecordFile& file : recordFilesIn(path())) {
        std::string done;
        try {
            done = file.recover();
        } catch (const std::system_error& error) {
            if (access(file.path().c_str(), R_OK | W_OK) == 0) {
                throw;  // the provider would read an incomplete file, and a change would write that
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
    return std::any_of(files.begin(), files.end(), [](const RecordFile& file) {
        try {
            return file.needsRecovery();
        } catch (const std::system_error&) {
            return false;  // it has no copy that this process can read
        }
    });
}

DataDirectory::Stamp DataDirectory::stamp() const {
    Stamp stamp{};
    const std::vector<RecordFile> files = recordFilesIn(path());
    for (std::size_t index = 0; index < stamp.size(); ++index) {
        struct stat status {};
        stat(files[index].path().c_str(), &status);
        stamp[index] = {static_cast<long long>(status.st_ino), status.st_size, status.st_mtim.tv_sec,
                        status.st_mtim.tv_nsec};
    }
    return stamp;
}

}  // namespace durable
