#include "ProviderConnection.h"

#include "durable/DataDirectory.h"

#include "KO/PlatformUtilities.h"

#include <dlfcn.h>

#include <chrono>
#include <cstdlib>
#include <exception>
#include <thread>

namespace gate {

namespace {

/**
 * How long a shutdown waits for requests that wait for other programs, such as slow clients. They may wait for the
 * thread that ends the object manager or the process.
 */
constexpr std::chrono::seconds drainTimeout{5};

/** How long a request waits for up-calls of the provider before that is loaded again. */
constexpr std::chrono::seconds upCallTimeout{5};
constexpr std::chrono::milliseconds pollInterval{10};

/** Called when this library is unloaded and when the process ends. */
void endAtExit() {
    theRequestLock.close(drainTimeout, RequestLock::Closing::permanent, [] { theConnection.endProcess(); });
}

/** Keeps this library and its dependencies in the process, for a request that is still running in them. */
void stayLoaded() {
    Dl_info self{};
    if (dladdr(&theRequestLock, &self) != 0) {
        dlopen(self.dli_fname, RTLD_LAZY | RTLD_NOLOAD | RTLD_NODELETE);  // not closed, which would end its effect
    }
}

/** The agent's data directory. */
durable::DataDirectory theDirectory{[] { return std::string(KO::PlatformUtilities::getKelsaDataDir()); },
                                    [](const std::string& message) { logError(message); }};

}  // namespace

ProviderConnection theConnection;

void ProviderConnection::connect(const CMPIBroker* manager) {
    const bool isOpen = theRequestLock.open();
    const ActiveRequest active;
    if (!isOpen) {
        throw ManagerGone{};
    }
    if (isConnectedTo(manager)) {
        return;
    }
    const LockGuard guard;
    wrapped.emplace(manager,
                    WrappedBroker::Lock{[] { theConnection.beginUpCall(); }, [] { theConnection.endUpCall(); }});
    try {
        library.isLoaded() ? createInterfaces() : load();
    } catch (...) {
        set(nullptr);
        throw;
    }
    set(manager);
}

void ProviderConnection::requireOwnedDirectory() {
    theDirectory.requireOwned();
}

bool ProviderConnection::needsLoading() const {
    return isOutdated || !library.isLoaded() || theDirectory.isOutdated();
}

void ProviderConnection::requireCurrent(LockGuard& guard) {
    const auto end = std::chrono::steady_clock::now() + upCallTimeout;
    while (needsLoading() && upCalls != 0 && std::chrono::steady_clock::now() < end) {
        guard.releaseFor([] { std::this_thread::sleep_for(pollInterval); });
    }
    if (needsLoading()) {
        if (upCalls != 0) {
            fail(CMPI_RC_ERR_FAILED,
                 "The provider waits for the object manager and cannot be loaded again. Try again.");
        }
        load();
    }
}

/** Loads the provider, which reads its files. Unloads it first if it is loaded. */
void ProviderConnection::load() {
    constexpr int attempts = 10;
    isOutdated = true;
    for (int attempt = 0; attempt == 0 || (theDirectory.hasChanged() && attempt < attempts); ++attempt) {
        theDirectory.open();
        if (!unload()) {
            logError(
                "The provider is also loaded without the gate, so it cannot read its files again. "
                "Register only one.");
        }
        library.load();
    }
    // Registered after the provider's static objects, so that no request is running when these are destroyed.
    std::atexit(endAtExit);
    createInterfaces();
    isOutdated = false;
    verified = 0;
}

/** Unloads the provider if it is loaded. Returns false if it stays in the process. */
bool ProviderConnection::unload() {
    instances = nullptr;
    associations = nullptr;
    return !library.isLoaded() || library.unload();
}

void ProviderConnection::createInterfaces() {
    instances = library.createInstanceMI(wrapped->handle());
    associations = library.createAssociationMI(wrapped->handle());
    if (instances == nullptr || associations == nullptr) {
        fail(CMPI_RC_ERR_FAILED, "The provider did not return its interfaces.");
    }
}

void ProviderConnection::beginUpCall() {
    ++upCalls;
    theRequestLock.release();
}

void ProviderConnection::endUpCall() {
    theRequestLock.reacquire();
    --upCalls;
}

const CMPIBroker* ProviderConnection::broker() const {
    const std::lock_guard<std::mutex> lock(mutex);
    return managersOwn;
}

void ProviderConnection::shutdown(const CMPIContext* context) {
    std::exception_ptr failure;
    theRequestLock.close(drainTimeout, RequestLock::Closing::temporary, [&] {
        try {
            endProvider(context);
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
    return managersOwn == manager && tables.bft == manager->bft && tables.eft == manager->eft &&
           tables.xft == manager->xft && tables.mft == manager->mft;
}

void ProviderConnection::set(const CMPIBroker* manager) {
    const std::lock_guard<std::mutex> lock(mutex);
    managersOwn = manager;
    tables = manager == nullptr ? CMPIBroker{} : *manager;
}

void ProviderConnection::endProvider(const CMPIContext* context) {
    if (broker() != nullptr && instances != nullptr && associations != nullptr) {
        instances->ft->cleanup(instances, context, 1);
        associations->ft->cleanup(associations, context, 1);
    }
    set(nullptr);
    endProcess();
}

void ProviderConnection::endProcess() {
    if (upCalls == 0) {
        unload();
        theDirectory.close();
    }
}

}  // namespace gate
