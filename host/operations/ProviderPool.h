#pragma once

#include <atomic>
#include <cstddef>
#include <map>
#include <memory>
#include <mutex>
#include <set>
#include <string>

#include "operations/Interfaces.h"
#include "operations/LoadedLibrary.h"
#include "operations/ProviderRegistry.h"
#include "operations/RequestThread.h"

namespace cimhost {

/** Message for requests that arrive after stop(). */
constexpr const char* stoppingText = "The object manager is stopping.";

/**
 * The providers in this process. Libraries are loaded and factories called when a provider is first needed, once an
 * interface; after a failure the next need tries again. In the end every interface is cleaned up and every library
 * closed, unless its provider's cleanup asks to stay. Safe to use from several threads and from inside requests.
 */
class ProviderPool {
public:
    ProviderPool(Broker& itsBroker, LibraryOptions itsOptions, const ProviderPolicy& itsPolicy);
    ~ProviderPool();
    ProviderPool(const ProviderPool&) = delete;
    ProviderPool& operator=(const ProviderPool&) = delete;

    /** Marks the pool as used by a request; requests may be nested. */
    class InUse {
    public:
        explicit InUse(ProviderPool& itsPool);
        ~InUse();
        InUse(const InUse&) = delete;
        InUse& operator=(const InUse&) = delete;

    private:
        ProviderPool& pool;
    };

    /** The provider's interface, valid while the caller's InUse lives. @throws LibraryError when it cannot be started
     */
    template <class Interface>
    Interface* get(const ProviderAddress& address);

    /** Cleans up all providers and unloads the libraries that do not ask to stay. Not while a request runs. */
    void idle();

    /**
     * Unloads a library without cleanup, as if its process had ended, as soon as no request uses the pool. The next
     * request that needs it loads it again.
     */
    void unloadWhenUnused(const std::string& location);

    /** Cleans up all providers for good, even while requests run. Libraries stay until the pool is destroyed. */
    void stop();
    bool isStopped() const { return stopped; }

private:
    /** A provider in its library, with the interfaces made so far. */
    struct Provider {
        LoadedLibrary* library = nullptr;
        CMPIInstanceMI* instance = nullptr;
        CMPIAssociationMI* association = nullptr;
        bool isStarting = false;  ///< a factory is running
        ChainMutex mutex{};       ///< held while a factory runs, where factories of other classes may run meanwhile
    };

    /** Some order of addresses. */
    struct AddressLess {
        bool operator()(const ProviderAddress& left, const ProviderAddress& right) const;
    };

    template <class Interface>
    static Interface*& member(Provider& provider);

    using Libraries = std::map<std::string, std::unique_ptr<LoadedLibrary>>;  ///< by location

    /** @param library null only where there is no interface either */
    template <class Interface>
    void end(LoadedLibrary* library, Interface* interface);

    /** Closes a library, and forgets its providers. */
    Libraries::iterator unload(Libraries::iterator library);
    void unloadCrashed();

    /** Cleans up the providers of a library; whether it stays. */
    bool staysWhenIdle(const LoadedLibrary& library);

    /** The mutex of a provider's interfaces. */
    ChainMutex& mutexOf(Provider& provider);
    void requireRunning() const;

    LoadedLibrary& library(const std::string& location);
    Provider& provider(const ProviderAddress& address);

    Broker& broker;
    LibraryOptions options;
    ProviderPolicy policy;
    ChainMutex mutex;  ///< held while a factory runs, which may make a request that needs another provider
    Libraries libraries;
    std::map<ProviderAddress, Provider, AddressLess> providers;
    std::atomic<std::size_t> uses{0};
    std::mutex crashedMutex{};
    std::set<std::string> crashed;  ///< locations of libraries to unload when the pool is not in use
    std::atomic<bool> stopped{false};
};

}  // namespace cimhost
