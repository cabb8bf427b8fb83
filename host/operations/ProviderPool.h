#pragma once

#include <map>
#include <memory>
#include <string>

#include "operations/Interfaces.h"
#include "operations/LoadedLibrary.h"
#include "operations/ProviderRegistry.h"
#include "operations/RequestThread.h"

namespace cimhost {

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

    /** The provider's interface; good as long as the pool. @throws LibraryError when it cannot be had */
    template <class Interface>
    Interface* get(const ProviderAddress& address);

    /** Cleans up all providers and unloads the libraries that do not ask to stay. Not while a request is inside. */
    void idle();

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

    template <class Interface>
    void end(Provider& provider, Interface* interface);

    /** Cleans up the providers of a library; whether it stays. */
    bool staysWhenIdle(const LoadedLibrary& library);

    LoadedLibrary& library(const std::string& location);
    Provider& provider(const ProviderAddress& address);

    Broker& broker;
    LibraryOptions options;
    ChainMutex mutex;  ///< held while a factory runs, which may make a request that needs another provider
    std::map<std::string, std::unique_ptr<LoadedLibrary>> libraries;  ///< by location
    std::map<ProviderAddress, Provider, AddressLess> providers;
};

}  // namespace cimhost
