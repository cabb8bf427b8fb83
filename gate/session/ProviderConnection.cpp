#include "ProviderConnection.h"

#include <dlfcn.h>

#include <chrono>
#include <exception>

extern "C" {
CMPIInstanceMI* LeaseAndWarrantyProvider_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
CMPIAssociationMI* LeaseAndWarrantyProvider_Create_AssociationMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
}

namespace gate {

namespace {

/**
 * How long a shutdown waits for requests that wait for other programs, such as slow clients. They may wait for the
 * thread that ends the object manager or the process.
 */
constexpr std::chrono::seconds drainTimeout{5};

/** Destroyed before the provider's static objects, so that no request is running when these are destroyed. */
const struct ShutdownAtExit {
    ~ShutdownAtExit() { theRequestLock.close(drainTimeout, RequestLock::Closing::permanent); }
} shutdownAtExit;

/** Keeps this library and its dependencies in the process, for a request that is still running in them. */
void stayLoaded() {
    Dl_info self{};
    if (dladdr(&theRequestLock, &self) != 0) {
        dlopen(self.dli_fname, RTLD_LAZY | RTLD_NOLOAD | RTLD_NODELETE);  // not closed, which would end its effect
    }
}

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
    wrapped.emplace(manager, WrappedBroker::Lock{[] { theRequestLock.release(); }, [] { theRequestLock.reacquire(); }});
    CMPIStatus status{CMPI_RC_OK, nullptr};
    instances = LeaseAndWarrantyProvider_Create_InstanceMI(wrapped->handle(), nullptr, &status);
    associations = LeaseAndWarrantyProvider_Create_AssociationMI(wrapped->handle(), nullptr, &status);
    const bool isConnected = instances != nullptr && associations != nullptr;
    set(isConnected ? manager : nullptr);
    if (!isConnected) {
        fail(CMPI_RC_ERR_FAILED, "The provider did not return its interfaces.");
    }
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
    if (broker() != nullptr) {
        instances->ft->cleanup(instances, context, 1);
        associations->ft->cleanup(associations, context, 1);
    }
    set(nullptr);
}

}  // namespace gate
