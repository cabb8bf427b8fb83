#include "operations/ProviderPool.h"

#include <iterator>
#include <mutex>
#include <type_traits>
#include <utility>
#include <vector>

namespace cimhost {
namespace {

/** Whether the status code of a cleanup asks to keep the library loaded. */
bool asksToStay(int rc) {
    return rc == CMPI_RC_DO_NOT_UNLOAD || rc == CMPI_RC_NEVER_UNLOAD;
}

/** Marks a provider as starting while this object exists. */
class Starting {
public:
    explicit Starting(bool& itsFlag) : flag(itsFlag) { flag = true; }
    ~Starting() { flag = false; }
    Starting(const Starting&) = delete;
    Starting& operator=(const Starting&) = delete;

private:
    bool& flag;
};

}  // namespace

ProviderPool::InUse::~InUse() {
    if (--pool.uses == 0) {
        pool.unloadCrashed();
    }
}

template <class Interface>
Interface*& ProviderPool::member(Provider& provider) {
    if constexpr (std::is_same_v<Interface, CMPIInstanceMI>) {
        return provider.instance;
    } else {
        return provider.association;
    }
}

bool ProviderPool::staysWhenIdle(const LoadedLibrary& library) {
    std::size_t interfaces = 0;
    std::size_t asking = 0;
    const auto ask = [&](auto* interface) {
        if (interface != nullptr) {
            ++interfaces;
            asking += asksToStay(cleanUp(interface, broker, false)) ? 1 : 0;
        }
    };
    for (auto& [address, provider] : providers) {
        if (provider.library == &library) {
            ask(provider.instance);
            ask(provider.association);
        }
    }
    return policy.staysOnlyIfAllAsk ? asking == interfaces : asking > 0;
}

void ProviderPool::idle() {
    const InUse use(*this);
    const std::lock_guard<ChainMutex> lock(mutex);
    for (auto library = libraries.begin(); library != libraries.end();) {
        const LoadedLibrary* loaded = library->second.get();
        if (loaded == nullptr || staysWhenIdle(*loaded)) {
            ++library;
            continue;
        }
        library = unload(library);
    }
}

ProviderPool::Libraries::iterator ProviderPool::unload(Libraries::iterator library) {
    for (auto provider = providers.begin(); provider != providers.end();) {
        provider = provider->second.library == library->second.get() ? providers.erase(provider) : std::next(provider);
    }
    return libraries.erase(library);
}

void ProviderPool::unloadWhenUnused(const std::string& location) {
    const std::lock_guard<std::mutex> lock(crashedMutex);
    crashed.insert(location);
}

/** Requests that arrive meanwhile wait for the mutex before they receive an interface. */
void ProviderPool::unloadCrashed() {
    const std::lock_guard<std::mutex> crashedLock(crashedMutex);
    if (crashed.empty()) {
        return;
    }
    const std::lock_guard<ChainMutex> lock(mutex);
    for (auto location = crashed.begin(); location != crashed.end() && uses == 0 && !stopped;
         location = crashed.erase(location)) {
        const auto library = libraries.find(*location);
        if (library != libraries.end()) {
            unload(library);
        }
    }
}

/** Holds no mutex during a cleanup, which can wait for requests that need one. */
void ProviderPool::stop() {
    const InUse use(*this);
    if (stopped.exchange(true)) {
        return;
    }
    std::vector<Provider*> all;
    {
        const std::lock_guard<ChainMutex> lock(mutex);
        for (auto& [address, provider] : providers) {
            all.push_back(&provider);
        }
    }
    for (Provider* provider : all) {
        std::unique_lock<ChainMutex> lock(mutexOf(*provider));
        LoadedLibrary* const library = provider->library;
        CMPIInstanceMI* const instance = provider->instance;
        CMPIAssociationMI* const association = provider->association;
        lock.unlock();
        end(library, instance);
        end(library, association);
    }
}

template <class Interface>
void ProviderPool::end(LoadedLibrary* library, Interface* interface) {
    if (interface != nullptr && asksToStay(cleanUp(interface, broker, true))) {
        library->keep();
    }
}

LoadedLibrary& ProviderPool::library(const std::string& location) {
    auto& entry = libraries[location];
    if (!entry) {
        const int flags = policy.bindsLazily ? (options.flags & ~RTLD_NOW) | RTLD_LAZY : options.flags;
        entry = std::make_unique<LoadedLibrary>(findLibrary(location, options), flags);
    }
    return *entry;
}

ProviderPool::Provider& ProviderPool::provider(const ProviderAddress& address) {
    const std::lock_guard<ChainMutex> lock(mutex);
    Provider& found = providers[address];
    if (found.library == nullptr) {
        found.library = &library(address.location);
    }
    return found;
}

template <class Interface>
Interface* ProviderPool::get(const ProviderAddress& address) {
    Provider& found = provider(address);
    const std::lock_guard<ChainMutex> lock(mutexOf(found));
    Interface*& interface = member<Interface>(found);
    if (interface == nullptr) {
        requireRunning();
        if (found.isStarting) {
            throw LibraryError("Provider " + address.provider + " sent a request to itself while it was starting.");
        }
        const Starting starting(found.isStarting);
        Interface* created = createInterface<Interface>(*found.library, address.provider, broker, policy.factory);
        if (stopped) {
            end(found.library, created);
        }
        requireRunning();
        interface = created;
    }
    return interface;
}

void ProviderPool::requireRunning() const {
    if (stopped) {
        throw LibraryError(stoppingMessage);
    }
}

ChainMutex& ProviderPool::mutexOf(Provider& provider) {
    return policy.startsConcurrently ? provider.mutex : mutex;
}

template CMPIInstanceMI* ProviderPool::get(const ProviderAddress&);
template CMPIAssociationMI* ProviderPool::get(const ProviderAddress&);

}  // namespace cimhost
