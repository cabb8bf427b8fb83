#include "DataDirectory.h"

#include <sys/stat.h>
#include <unistd.h>

#include <chrono>
#include <stdexcept>
#include <system_error>
#include <thread>

namespace durable {

namespace {

/** Maximum time that a change waits for another owner to end. */
constexpr std::chrono::seconds ownerTimeout{5};
/** Maximum time that open() waits for another owner to finish writing. */
constexpr std::chrono::seconds writeTimeout{1};
constexpr std::chrono::milliseconds pollInterval{20};

/** Waits until the condition holds, but no longer than the timeout. Returns whether it holds. */
template <class Condition>
bool waitFor(std::chrono::seconds timeout, Condition condition) {
    const auto end = std::chrono::steady_clock::now() + timeout;
    bool holds = condition();
    while (!holds && std::chrono::steady_clock::now() < end) {
        std::this_thread::sleep_for(pollInterval);
        holds = condition();
    }
    return holds;
}

}  // namespace

void DataDirectory::open() {
    std::string owner;
    const bool isOwner = acquire(owner);
    if (isOwner) {
        recover();
    } else {
        waitFor(writeTimeout, [&] { return areComplete(); });
    }
    hadOther = !isOwner;
    openStamp = stamp();
}

void DataDirectory::requireOwned() {
    std::string owner;
    if (!waitFor(ownerTimeout, [&] { return acquire(owner); })) {
        throw std::runtime_error("The data directory " + path() + " is in use by " + owner +
                                 ". Send the request to that process, or end it.");
    }
}

/** Whether this process may change the files now. If not, names the process that may. */
bool DataDirectory::acquire(std::string& owner) {
    const DirectoryLock::Result result = lock.acquire(path());
    const bool isOther = result.state == DirectoryLock::State::heldByOther;
    const bool isUnavailable = result.state == DirectoryLock::State::unavailable;
    if (isUnavailable && access(path().c_str(), F_OK) == 0 && !isReported.exchange(true)) {
        log("The data directory cannot be locked, so do not let two processes change it. " + result.reason);
    }
    isOwned = !isOther;
    hadOther = hadOther || isOther;
    owner = result.reason;
    return !isOther;
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

bool DataDirectory::areComplete() const {
    for (const RecordFile& file : recordFilesIn(path())) {
        const auto content = file.content();
        if (content && !file.isComplete(*content)) {
            return false;
        }
    }
    return true;
}

bool DataDirectory::hasChanged() const {
    return hadOther && stamp() != openStamp;
}

bool DataDirectory::isOutdated() const {
    return hadOther && (isOwned || (hasChanged() && areComplete()));
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
