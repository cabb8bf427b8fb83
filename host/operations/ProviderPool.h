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

/** What comes too late is told. */
constexpr const char* stoppingText = "The object manager is stopping.";

/**
 * The providers in this process. Libraries are loaded and factories called when a provider is first needed, once an
 * interface; after a failure the next need tries again. In the end every interface is cleaned up and every library
 * closed, unless its provider's cleanup asks to stay. Safe to use from several threads and from inside requests.
 */
class ProviderPool {
public:
    ProviderPool(Broker& itsBroker, LibraryOptions itsOptions);
    ~ProviderPool();
    ProviderPool(const ProviderPool&) = delete;
    ProviderPool& operator=(const ProviderPool&) = delete;

    /** A request's stay with the providers; requests may come out of requests. */
    class Stay {
    public:
        explicit Stay(ProviderPool& itsPool);
        ~Stay();
        Stay(const Stay&) = delete;
        Stay& operator=(const Stay&) = delete;

    private:
        ProviderPool& pool;
    };

    /** The provider's interface; good while the caller stays. @throws LibraryError when it cannot be had */
    template <class Interface>
    Interface* get(const ProviderAddress& address);

    /** Cleans up all providers and unloads the libraries that do not ask to stay. Not while a request is inside. */
    void idle();

    /**
     * A library's process has ended: the library goes, without cleanup, when no request is inside, and is loaded again
     * when it is needed.
     */
    void lose(const std::string& location);

    /** Cleans up all providers for good, though requests may be inside. Libraries stay until the pool ends. */
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
    void unloadLost();

    /** Cleans up the providers of a library; whether it stays. */
    bool staysWhenIdle(const LoadedLibrary& library);

    /** What guards the interfaces of a provider. */
    ChainMutex& guardOf(Provider& provider);
    void requireRunning() const;

    LoadedLibrary& library(const std::string& location);
    Provider& provider(const ProviderAddress& address);

    Broker& broker;
    LibraryOptions options;
    ChainMutex mutex;  ///< held while a factory runs, which may make a request that needs another provider
    Libraries libraries;
    std::map<ProviderAddress, Provider, AddressLess> providers;
    std::atomic<std::size_t> staying{0};
    std::mutex lostMutex{};
    std::set<std::string> lost;  ///< locations of libraries that go when nobody stays
    std::atomic<bool> stopped{false};
};

}  // namespace cimhost
