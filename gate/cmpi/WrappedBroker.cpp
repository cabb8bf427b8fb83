#include "WrappedBroker.h"

#include <tuple>
#include <type_traits>

namespace gate {

namespace {

/** Releases a lock during its lifetime. Copies the lock's functions, since the wrapper may be replaced meanwhile. */
class ScopedRelease {
public:
    explicit ScopedRelease(const WrappedBroker::Lock& itsLock) : lock(itsLock) { lock.release(); }
    ~ScopedRelease() { lock.reacquire(); }
    ScopedRelease(const ScopedRelease&) = delete;
    ScopedRelease& operator=(const ScopedRelease&) = delete;

private:
    const WrappedBroker::Lock lock;
};

/** Calls the function that the object manager's table has in this slot. */
template <auto slot, class Table, class Result, class... Arguments>
Result forward(const CMPIBroker* broker, Arguments... arguments) {
    constexpr bool isService = std::is_same_v<Table, CMPIBrokerFT>;
    constexpr bool makesResults = std::is_same_v<Result, CMPIInstance*> || std::is_same_v<Result, CMPIObjectPath*>;
    auto& wrapper = *static_cast<WrappedBroker*>(broker->hdl);
    const CMPIBroker* manager = wrapper.manager;
    const auto function = std::get<Table*>(std::tuple(manager->bft, manager->eft, manager->mft))->*slot;
    if constexpr (isService) {
        const ScopedRelease scopedRelease(wrapper.lock);
        return function(manager, arguments...);
    } else if constexpr (makesResults) {
        const Result made = function(manager, arguments...);
        const CMPIStatus* status = std::get<sizeof...(Arguments) - 1>(std::tie(arguments...));
        wrapper.hasFailed = wrapper.hasFailed || made == nullptr || (status != nullptr && status->rc != CMPI_RC_OK);
        return made;
    } else {
        return function(manager, arguments...);
    }
}

/** A copy of a manager's table in which these slots are replaced, unless they are null. */
template <auto... slots, class Table>
Table wrapped(const Table* original) {
    if (original == nullptr) {
        return Table{};
    }
    Table table = *original;
    ((table.*slots == nullptr ? nullptr : (table.*slots = forward<slots, Table>)), ...);
    return table;
}

CMPIBrokerFT wrappedServices(const CMPIBrokerFT* original) {
    using T = CMPIBrokerFT;
    return wrapped<&T::prepareAttachThread, &T::attachThread, &T::detachThread, &T::deliverIndication,
                   &T::enumerateInstanceNames, &T::getInstance, &T::createInstance, &T::modifyInstance,
                   &T::deleteInstance, &T::execQuery, &T::enumerateInstances, &T::associators, &T::associatorNames,
                   &T::references, &T::referenceNames, &T::invokeMethod, &T::setProperty, &T::getProperty>(original);
}

CMPIBrokerEncFT wrappedEncapsulation(const CMPIBrokerEncFT* original) {
    using T = CMPIBrokerEncFT;
    auto table = wrapped<&T::newInstance, &T::newObjectPath, &T::newArgs, &T::newString, &T::newArray, &T::newDateTime,
                         &T::newDateTimeFromBinary, &T::newDateTimeFromChars, &T::newSelectExp, &T::classPathIsA,
                         &T::toString, &T::isOfType, &T::getType, &T::logMessage, &T::trace, &T::newCMPIError,
                         &T::openMessageFile, &T::closeMessageFile>(original);
    table.getMessage = nullptr;
    table.getMessage2 = nullptr;
    return table;
}

CMPIBrokerMemFT wrappedMemory(const CMPIBrokerMemFT* original) {
    using T = CMPIBrokerMemFT;
    return wrapped<&T::mark, &T::release, &T::cmpiMalloc, &T::cmpiCalloc, &T::cmpiRealloc, &T::cmpiStrDup, &T::cmpiFree,
                   &T::freeInstance, &T::freeObjectPath, &T::freeArgs, &T::freeString, &T::freeArray, &T::freeDateTime,
                   &T::freeSelectExp>(original);
}

}  // namespace

WrappedBroker::WrappedBroker(const CMPIBroker* itsManager, const Lock& itsLock)
    : manager(itsManager),
      lock(itsLock),
      services(wrappedServices(manager->bft)),
      encapsulation(wrappedEncapsulation(manager->eft)),
      memory(wrappedMemory(manager->mft)),
      // The thread functions have no broker parameter, so they are not wrapped.
      broker{this, &services, &encapsulation, manager->xft, manager->mft == nullptr ? nullptr : &memory} {}

}  // namespace gate
