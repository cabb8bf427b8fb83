#include "operations/Interfaces.h"

#include <type_traits>

namespace cimhost {
namespace {

template <class Interface>
using NamedFactory = Interface*(const CMPIBroker*, const CMPIContext*, CMPIStatus*);

template <class Interface>
using GenericFactory = Interface*(const CMPIBroker*, const CMPIContext*, const char*, CMPIStatus*);

/** Calls one of the two factories that a library can have for a provider. */
template <class Interface>
Interface* callFactory(const LoadedLibrary& library, const std::string& provider, FactoryChoice choice,
                       const CMPIBroker* broker, const CMPIContext* context, CMPIStatus* rc) {
    const bool isInstance = std::is_same_v<Interface, CMPIInstanceMI>;
    const std::string suffix = isInstance ? "_Create_InstanceMI" : "_Create_AssociationMI";
    auto* named = library.function<NamedFactory<Interface>>(provider + suffix);
    auto* generic = library.function<GenericFactory<Interface>>("_Generic" + suffix);
    if (named != nullptr && generic != nullptr && choice == FactoryChoice::neither) {
        throw LibraryError(library.file().string() + " has both " + provider + suffix + " and _Generic" + suffix);
    }
    if (named != nullptr && (generic == nullptr || choice == FactoryChoice::named)) {
        return named(broker, context, rc);
    }
    if (generic != nullptr) {
        return generic(broker, context, provider.c_str(), rc);
    }
    throw LibraryError(library.file().string() + " has neither " + provider + suffix + " nor _Generic" + suffix);
}

[[noreturn]] void factoryFailed(const LoadedLibrary& library, const std::string& provider, const Status& status) {
    throw LibraryError("The factory of provider " + provider + " in " + library.file().string() + " failed with code " +
                       std::to_string(status.rc) + (status.message.empty() ? std::string{} : ": " + status.message));
}

}  // namespace

template <class Interface>
Interface* createInterface(const LoadedLibrary& library, const std::string& provider, Broker& broker,
                           FactoryChoice choice) {
    RequestScope scope(broker);
    const CMPIContext* context = scope.context({});
    Interface* interface = nullptr;
    const ProviderCall call = callProvider([&] {
        CMPIStatus status{CMPI_RC_OK, nullptr};
        interface = callFactory<Interface>(library, provider, choice, broker.handle(), context, &status);
        return status;
    });
    if (!call.status.ok()) {
        factoryFailed(library, provider, call.status);
    }
    if (interface == nullptr || interface->ft == nullptr) {
        factoryFailed(library, provider, {CMPI_RC_OK, "it returned no interface"});
    }
    return interface;
}

template <class Interface>
int cleanUp(Interface* interface, Broker& broker, bool terminating) {
    if (interface->ft->cleanup == nullptr) {
        return CMPI_RC_OK;
    }
    RequestScope scope(broker);
    const CMPIContext* context = scope.context({});
    const CMPIBoolean flag = terminating ? 1 : 0;
    return callProvider([&] { return interface->ft->cleanup(interface, context, flag); }).status.rc;
}

template CMPIInstanceMI* createInterface(const LoadedLibrary&, const std::string&, Broker&, FactoryChoice);
template CMPIAssociationMI* createInterface(const LoadedLibrary&, const std::string&, Broker&, FactoryChoice);
template int cleanUp(CMPIInstanceMI*, Broker&, bool);
template int cleanUp(CMPIAssociationMI*, Broker&, bool);

}  // namespace cimhost
