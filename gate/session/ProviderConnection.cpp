#include "ProviderConnection.h"

#include <cxxabi.h>
#include <dlfcn.h>

#include <chrono>
#include <exception>
#include <thread>

#include "KO/PlatformUtilities.h"
#include "durable/DataDirectory.h"

namespace gate {

namespace {

/**
 * How long a shutdown waits for requests that wait for other programs, such as slow clients. Such a request may never
 * end, for example if it waits for the thread that is shutting down.
 */
constexpr std::chrono::seconds drainTimeout{5};

/** How long a request waits for another process that uses the data directory, and for up-calls of the provider. */
constexpr std::chrono::seconds waitTimeout{5};
constexpr std::chrono::milliseconds pollInterval{10};

/** How long a request waits for newer records if older ones suffice. File times have a resolution of up to 10 ms. */
constexpr std::chrono::milliseconds newerTimeout{50};

/** Waits with the lock released while a condition holds, at most for the timeout. Returns whether it still holds. */
template <class Condition>
bool waitWhile(LockGuard& guard, std::chrono::milliseconds timeout, Condition condition) {
    const auto end = std::chrono::steady_clock::now() + timeout;
    while (condition()) {
        if (std::chrono::steady_clock::now() >= end) {
            return true;
        }
        guard.releaseFor([] { std::this_thread::sleep_for(pollInterval); });
    }
    return false;
}

/** Keeps this library and its dependencies in the process, because a request is still running in them. */
void stayLoaded() {
    Dl_info self{};
    if (dladdr(&theRequestLock, &self) != 0) {
        dlopen(self.dli_fname, RTLD_LAZY | RTLD_NOLOAD | RTLD_NODELETE);  // never closed
    }
}

/** Ends the connection when this library is unloaded and when the process ends. */
class ShutdownAtExit {
public:
    ~ShutdownAtExit() { abi::__cxa_finalize(this); }

    /** Called after the provider was loaded, so that requests end before its static objects are destroyed. */
    void registerAgain() {
        isRegistering = true;
        abi::__cxa_finalize(this);  // calls and removes the function registered before
        isRegistering = false;
        abi::__cxa_atexit(
            [](void* self) {
                if (!static_cast<ShutdownAtExit*>(self)->isRegistering) {
                    theRequestLock.close(drainTimeout, RequestLock::Closing::permanent,
                                         [] { theConnection.endProcess(); });
                }
            },
            this, this);
    }

private:
    bool isRegistering = false;
};

/** The agent's data directory. */
durable::DataDirectory theDirectory{[] { return std::string(KO::PlatformUtilities::getKelsaDataDir()); },
                                    [](const std::string& message) { logError(message); }};

}  // namespace

ProviderConnection theConnection;

static ShutdownAtExit shutdownAtExit;  // destroyed before the objects above

void ProviderConnection::connect(const CMPIBroker* manager) {
    theRequestLock.open();
    const ActiveRequest active;
    ManagerGone::throwUnless(active.isAdmitted);
    if (isConnectedTo(manager)) {
        return;
    }
    const LockGuard guard;
    const auto beginUpCall = [] {
        ++theConnection.upCalls;
        theRequestLock.release();
    };
    const auto endUpCall = [] {
        theRequestLock.reacquire();
        --theConnection.upCalls;
    };
    wrapped.emplace(manager, WrappedBroker::Lock{beginUpCall, endUpCall});
    try {
        if (library.isLoaded()) {
            library.createInterfaces(wrapped->handle());
        } else {
            load();  // if the files are being written, the first request tries again
        }
    } catch (...) {
        set(nullptr);
        throw;
    }
    set(manager);
}

void ProviderConnection::requireOwner(LockGuard& guard) {
    durable::DataDirectory::Ownership ownership{};
    waitWhile(guard, waitTimeout, [&] {
        ownership = theDirectory.acquire();
        return ownership.isOtherProcess;
    });
    failIf(!ownership.isOwner, CMPI_RC_ERR_FAILED, ownership.reason);
}

void ProviderConnection::requireCurrent(LockGuard& guard, bool mayBeOlder) {
    const auto isWaiting = [&] {
        const bool needsLoading = isOutdated || !library.isLoaded() || theDirectory.isOutdated();
        return needsLoading && (upCalls != 0 || !load());
    };
    const auto mayUseOlder = [&] { return mayBeOlder && library.isLoaded() && !isOutdated; };
    if (waitWhile(guard, newerTimeout, isWaiting) && !mayUseOlder() && waitWhile(guard, waitTimeout, isWaiting)) {
        failIf(upCalls != 0, CMPI_RC_ERR_FAILED,
               "The provider waits for the object manager and cannot be loaded again. Try again.");
        fail(CMPI_RC_ERR_FAILED, "The record files are incomplete, or another process is writing them. Try again.");
    }
}

/**
 * Unloads the provider, if it is loaded, and loads it, so that it reads its files. Does neither if the files are
 * incomplete. Returns whether the files are complete and did not change during the call.
 */
bool ProviderConnection::load() {
    failIf(theDirectory.hasLostFiles(), CMPI_RC_ERR_FAILED,
           "The record files were removed. Restore the data directory and try again.");
    if (!theDirectory.open()) {
        return false;  // a request can still read the older tables
    }
    isOutdated = true;
    library.unload();
    const auto counts = theDirectory.recordCounts();
    library.load();
    shutdownAtExit.registerAgain();
    if (!theDirectory.hasChanged()) {
        library.createInterfaces(wrapped->handle());
        isOutdated = false;
        for (std::size_t index = 0; index < tables.size(); ++index) {
            tables[index] = {tables[index].name, counts[index]};
        }
    }
    return !isOutdated;
}

void ProviderConnection::requireRead(const Class& requested, std::size_t count) {
    Table* const table = tableOf(requested);
    if (table == nullptr || table->isRead) {
        return;
    }
    if (!table->count) {  // the gate could not read the file before; the provider may have read it
        table->count = theDirectory.recordCounts()[static_cast<std::size_t>(table - tables.data())];
    }
    if (count != table->count) {
        setOutdated();
        fail(CMPI_RC_ERR_FAILED, "The provider could not read the records of ", requested.name,
             "; see the agent's log at level 3000. It reads them again; repeat the request.");
    }
    table->isRead = true;
}

const CMPIBroker* ProviderConnection::broker() const {
    const std::lock_guard<std::mutex> lock(mutex);
    return managersOwn;
}

void ProviderConnection::shutdown(const CMPIContext* context) {
    std::exception_ptr failure;
    theRequestLock.close(drainTimeout, RequestLock::Closing::temporary, [&] {
        auto* const instances = library.interfaceWith(&CMPIInstanceMIFT::cleanup);
        auto* const associations = library.interfaceWith(&CMPIAssociationMIFT::cleanup);
        try {
            if (broker() != nullptr && instances != nullptr && associations != nullptr) {
                instances->ft->cleanup(instances, context, 1);
                associations->ft->cleanup(associations, context, 1);
            }
            set(nullptr);
            endProcess();
        } catch (...) {
            failure = std::current_exception();
        }
    });
    if (theRequestLock.hasOtherRequests()) {
        stayLoaded();
    }
    if (failure) {
        std::rethrow_exception(failure);
    }
}

bool ProviderConnection::isConnectedTo(const CMPIBroker* manager) const {
    const std::lock_guard<std::mutex> lock(mutex);
    return managersOwn == manager && connectedBroker.bft == manager->bft && connectedBroker.eft == manager->eft &&
           connectedBroker.xft == manager->xft && connectedBroker.mft == manager->mft;
}

void ProviderConnection::set(const CMPIBroker* manager) {
    const std::lock_guard<std::mutex> lock(mutex);
    managersOwn = manager;
    connectedBroker = manager == nullptr ? CMPIBroker{} : *manager;
}

void ProviderConnection::endProcess() {
    if (upCalls == 0) {
        library.unload();
        theDirectory.close();
    }
}

}  // namespace gate
