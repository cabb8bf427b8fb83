#include "WrappedBroker.h"

#include "Gate.h"

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

template <class Object>
constexpr bool isAnswer = std::is_same_v<Object, CMPIInstance*> || std::is_same_v<Object, CMPIObjectPath*>;

/** Notes when a function that makes answers has made none. */
template <class Object, class... Arguments>
void note(WrappedBroker& wrapper, Object made, Arguments... arguments) {
    const CMPIStatus* status = std::get<sizeof...(Arguments) - 1>(std::tie(arguments...));
    if (made == nullptr || (status != nullptr && status->rc != CMPI_RC_OK)) {
        wrapper.noteFailure();
    }
}

/** The function that takes a slot's place. */
template <auto slot>
struct Forward;

template <class Table, class Result, class... Arguments, Result (*Table::*slot)(const CMPIBroker*, Arguments...)>
struct Forward<slot> {
    static Result call(const CMPIBroker* broker, Arguments... arguments) {
        WrappedBroker& wrapper = wrapperOf(broker);
        const CMPIBroker* manager = wrapper.manager();
        const auto function = table(manager, static_cast<const Table*>(nullptr)).*slot;
        if constexpr (std::is_same_v<Table, CMPIBrokerFT>) {
            const Pause pause;
            return function(manager, arguments...);
        } else if constexpr (isAnswer<Result>) {
            const Result made = function(manager, arguments...);
            note(wrapper, made, arguments...);
            return made;
        } else {
            return function(manager, arguments...);
        }
    }

    static auto in(const Table& original) { return original.*slot != nullptr ? &call : nullptr; }
};

/** Fills the named slots of a table that has none filled. */
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

/** A version that cannot be set later makes this table one to be filled at once, in its own order. */
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

WrappedBroker::WrappedBroker(const CMPIBroker* manager)
    : services(wrapped(manager->bft)),
      encapsulation(wrapped(manager->eft)),
      memory(wrapped(manager->mft)),
      // The thread functions name no broker: they are the object manager's own.
      broker{this, &services, &encapsulation, manager->xft, manager->mft == nullptr ? nullptr : &memory},
      managersOwn(manager) {}

}  // namespace gate
