#pragma once

#include <atomic>
#include <cstddef>
#include <map>
#include <memory>
#include <mutex>
#include <set>
#include <string>
#include <utility>

#include "operations/Interfaces.h"
#include "operations/LoadedLibrary.h"
#include "operations/ProviderRegistry.h"
#include "operations/RequestThread.h"

namespace cimhost {

/** Message for requests that arrive after stop(). */
constexpr const char* stoppingMessage = "The object manager is stopping.";

/**
 * The providers in this process. The first request for an interface of a provider loads the library, if necessary, and
 * calls the factory; after a failure, the next request tries again. stop() cleans up all interfaces. The destructor
 * also closes the libraries, except those whose providers ask to stay. Safe to use concurrently and during requests.
 */
class ProviderPool {
public:
    ProviderPool(Broker& itsBroker, LibraryOptions itsOptions, const ProviderPolicy& itsPolicy)
        : broker(itsBroker), options(std::move(itsOptions)), policy(itsPolicy) {}
    ~ProviderPool() { stop(); }
    ProviderPool(const ProviderPool&) = delete;
    ProviderPool& operator=(const ProviderPool&) = delete;

    /** Marks the pool as used by a request while this object exists. Requests can be nested. */
    class InUse {
    public:
        explicit InUse(ProviderPool& itsPool) : pool(itsPool) { ++pool.uses; }
        ~InUse();
        InUse(const InUse&) = delete;
        InUse& operator=(const InUse&) = delete;

    private:
        ProviderPool& pool;
    };

    /** Returns a provider's interface, valid for the lifetime of the caller's InUse. @throws LibraryError on failure */
    template <class Interface>
    Interface* get(const ProviderAddress& address);

    /** See ObjectManager::idle(). */
    void idle();

    /**
     * Unloads a library without cleanup as soon as no request uses the pool, as if its process had crashed. The next
     * request for its providers loads it again.
     */
    void unloadWhenUnused(const std::string& location);

    /** Cleans up all providers, even while requests run. Their libraries stay loaded until the pool is destroyed. */
    void stop();
    bool isStopped() const { return stopped; }

private:
    /** A provider and its interfaces, which are null until their creation. */
    struct Provider {
        LoadedLibrary* library = nullptr;
        CMPIInstanceMI* instance = nullptr;
        CMPIAssociationMI* association = nullptr;
        bool isStarting = false;  ///< a factory is running
        ChainMutex mutex{};       ///< held while a factory runs, if factories can run concurrently
    };

    template <class Interface>
    static Interface*& member(Provider& provider);

    using Libraries = std::map<std::string, std::unique_ptr<LoadedLibrary>>;  ///< by location

    /** Cleans up an interface, unless it is null. Keeps the library if the interface asks to stay. */
    template <class Interface>
    void end(LoadedLibrary* library, Interface* interface);

    /** Closes a library and removes its providers. */
    Libraries::iterator unload(Libraries::iterator library);
    void unloadCrashed();

    /** Cleans up the providers of a library. @return whether the library stays */
    bool staysWhenIdle(const LoadedLibrary& library);

    /** The mutex of a provider's interfaces. */
    ChainMutex& mutexOf(Provider& provider);
    void requireRunning() const;

    LoadedLibrary& library(const std::string& location);
    Provider& provider(const ProviderAddress& address);

    Broker& broker;
    LibraryOptions options;
    ProviderPolicy policy;
    ChainMutex mutex;  ///< held while a factory runs, unless Provider::mutex is held instead
    Libraries libraries;
    std::map<ProviderAddress, Provider> providers;
    std::atomic<std::size_t> uses{0};
    std::mutex crashedMutex{};
    std::set<std::string> crashed;  ///< locations of the libraries to unload
    std::atomic<bool> stopped{false};
};

}  // namespace cimhost
