#include "operations/ProviderPool.h"

#include <mutex>
#include <tuple>
#include <type_traits>
#include <utility>

#include "operations/LibraryError.h"

namespace cimhost {
namespace {

/** Marks a provider as starting, for as long as it lives. */
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

ProviderPool::ProviderPool(Broker& itsBroker, LibraryOptions itsOptions)
    : broker(itsBroker), options(std::move(itsOptions)) {}

ProviderPool::~ProviderPool() {
    for (auto& [address, provider] : providers) {
        end(provider, provider.instance);
        end(provider, provider.association);
    }
}

bool ProviderPool::AddressLess::operator()(const ProviderAddress& left, const ProviderAddress& right) const {
    return std::tie(left.location, left.provider, left.forClass) <
           std::tie(right.location, right.provider, right.forClass);
}

template <class Interface>
Interface*& ProviderPool::member(Provider& provider) {
    if constexpr (std::is_same_v<Interface, CMPIInstanceMI>) {
        return provider.instance;
    } else {
        return provider.association;
    }
}

template <class Interface>
void ProviderPool::end(Provider& provider, Interface* interface) {
    if (interface == nullptr) {
        return;
    }
    const int answer = cleanUp(interface, broker, true);
    if (answer == CMPI_RC_DO_NOT_UNLOAD || answer == CMPI_RC_NEVER_UNLOAD) {
        provider.library->keep();
    }
}

LoadedLibrary& ProviderPool::library(const std::string& location) {
    auto& entry = libraries[location];
    if (!entry) {
        entry = std::make_unique<LoadedLibrary>(findLibrary(location, options), options.flags);
    }
    return *entry;
}

template <class Interface>
Interface* ProviderPool::get(const ProviderAddress& address) {
    const std::lock_guard<ChainMutex> lock(mutex);
    Provider& provider = providers[address];
    Interface*& interface = member<Interface>(provider);
    if (interface == nullptr) {
        if (provider.isStarting) {
            throw LibraryError("Provider " + address.provider + " needs itself to start.");
        }
        const Starting starting(provider.isStarting);
        provider.library = &library(address.location);
        interface = createInterface<Interface>(*provider.library, address.provider, broker, broker.handle());
    }
    return interface;
}

template CMPIInstanceMI* ProviderPool::get(const ProviderAddress&);
template CMPIAssociationMI* ProviderPool::get(const ProviderAddress&);

}  // namespace cimhost
