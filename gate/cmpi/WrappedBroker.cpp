#include "WrappedBroker.h"

#include <tuple>
#include <type_traits>

namespace gate {

namespace {

WrappedBroker& wrapperOf(const CMPIBroker* broker) {
    return *static_cast<WrappedBroker*>(broker->hdl);
}

const CMPIBrokerFT& table(const CMPIBroker* broker, const CMPIBrokerFT*) {
    return *broker->bft;
}
const CMPIBrokerEncFT& table(const CMPIBroker* broker, const CMPIBrokerEncFT*) {
    return *broker->eft;
}
const CMPIBrokerMemFT& table(const CMPIBroker* broker, const CMPIBrokerMemFT*) {
    return *broker->mft;
}

/** Releases a lock while it exists. Copies its functions, since the wrapper may be replaced meanwhile. */
class ScopedRelease {
public:
    explicit ScopedRelease(const WrappedBroker::Lock& itsLock) : lock(itsLock) { lock.release(); }
    ~ScopedRelease() { lock.reacquire(); }
    ScopedRelease(const ScopedRelease&) = delete;
    ScopedRelease& operator=(const ScopedRelease&) = delete;

private:
    const WrappedBroker::Lock lock;
};

template <class Object>
constexpr bool isAnswer = std::is_same_v<Object, CMPIInstance*> || std::is_same_v<Object, CMPIObjectPath*>;

/** Records if a function that creates answers has created none. */
template <class Object, class... Arguments>
void recordIfNull(WrappedBroker& wrapper, Object made, Arguments... arguments) {
    const CMPIStatus* status = std::get<sizeof...(Arguments) - 1>(std::tie(arguments...));
    if (made == nullptr || (status != nullptr && status->rc != CMPI_RC_OK)) {
        wrapper.recordFailure();
    }
}

/** The function that replaces the one of a slot. */
template <auto slot>
struct Forward;

template <class Table, class Result, class... Arguments, Result (*Table::*slot)(const CMPIBroker*, Arguments...)>
struct Forward<slot> {
    static Result call(const CMPIBroker* broker, Arguments... arguments) {
        WrappedBroker& wrapper = wrapperOf(broker);
        const CMPIBroker* manager = wrapper.manager();
        const auto function = table(manager, static_cast<const Table*>(nullptr)).*slot;
        if constexpr (std::is_same_v<Table, CMPIBrokerFT>) {
            const ScopedRelease scopedRelease(wrapper.lock());
            return function(manager, arguments...);
        } else if constexpr (isAnswer<Result>) {
            const Result made = function(manager, arguments...);
            recordIfNull(wrapper, made, arguments...);
            return made;
        } else {
            return function(manager, arguments...);
        }
    }

    static auto in(const Table& original) { return original.*slot != nullptr ? &call : nullptr; }
};

/** Fills these slots of an empty table. */
template <auto... slots, class Table>
void forward(const Table& original, Table& wrapped) {
    ((wrapped.*slots = Forward<slots>::in(original)), ...);
}

CMPIBrokerFT wrapped(const CMPIBrokerFT* original) {
    CMPIBrokerFT services{};
    if (original == nullptr) {
        return services;
    }
    services.brokerCapabilities = original->brokerCapabilities;
    services.brokerVersion = original->brokerVersion;
    services.brokerName = original->brokerName;
    using T = CMPIBrokerFT;
    forward<&T::prepareAttachThread, &T::attachThread, &T::detachThread, &T::deliverIndication,
            &T::enumerateInstanceNames, &T::getInstance, &T::createInstance, &T::modifyInstance, &T::deleteInstance,
            &T::execQuery, &T::enumerateInstances, &T::associators, &T::associatorNames, &T::references,
            &T::referenceNames, &T::invokeMethod, &T::setProperty, &T::getProperty>(*original, services);
    return services;
}

CMPIBrokerEncFT wrapped(const CMPIBrokerEncFT* original) {
    CMPIBrokerEncFT encapsulation{};
    if (original == nullptr) {
        return encapsulation;
    }
    encapsulation.ftVersion = original->ftVersion;
    using T = CMPIBrokerEncFT;
    forward<&T::newInstance, &T::newObjectPath, &T::newArgs, &T::newString, &T::newArray, &T::newDateTime,
            &T::newDateTimeFromBinary, &T::newDateTimeFromChars, &T::newSelectExp, &T::classPathIsA, &T::toString,
            &T::isOfType, &T::getType, &T::logMessage, &T::trace, &T::newCMPIError, &T::openMessageFile,
            &T::closeMessageFile>(*original, encapsulation);
    return encapsulation;
}

/** Fills this table at once, in its own order, since its version is a constant. */
template <auto... slots>
CMPIBrokerMemFT inOrder(const CMPIBrokerMemFT& original) {
    return {original.ftVersion, Forward<slots>::in(original)...};
}

CMPIBrokerMemFT wrapped(const CMPIBrokerMemFT* original) {
    using T = CMPIBrokerMemFT;
    return original == nullptr
               ? CMPIBrokerMemFT{}
               : inOrder<&T::mark, &T::release, &T::cmpiMalloc, &T::cmpiCalloc, &T::cmpiRealloc, &T::cmpiStrDup,
                         &T::cmpiFree, &T::freeInstance, &T::freeObjectPath, &T::freeArgs, &T::freeString,
                         &T::freeArray, &T::freeDateTime, &T::freeSelectExp>(*original);
}

}  // namespace

WrappedBroker::WrappedBroker(const CMPIBroker* manager, const Lock& lock)
    : callersLock(lock),
      services(wrapped(manager->bft)),
      encapsulation(wrapped(manager->eft)),
      memory(wrapped(manager->mft)),
      // The thread functions have no broker parameter, so they are not wrapped.
      broker{this, &services, &encapsulation, manager->xft, manager->mft == nullptr ? nullptr : &memory},
      managersOwn(manager) {}

}  // namespace gate
