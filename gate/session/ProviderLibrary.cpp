#include <dlfcn.h>

#include <stdexcept>
#include <string>

#include "ProviderConnection.h"

namespace gate {

namespace {

/** The path of the provider's library, which is in the directory of the library that contains this function. */
std::string libraryPath() {
    Dl_info self{};
    const bool isKnown = dladdr(reinterpret_cast<const void*>(&libraryPath), &self) != 0 && self.dli_fname != nullptr;
    const std::string file = isKnown ? self.dli_fname : "";
    return file.substr(0, file.rfind('/') + 1) + "libLeaseAndWarrantyProvider.so";
}

template <class Interface>
Interface* callFactory(void* library, const char* name, const CMPIBroker* broker) {
    using Factory = Interface*(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
    auto* factory = reinterpret_cast<Factory*>(dlsym(library, name));
    CMPIStatus status{CMPI_RC_OK, nullptr};
    return factory == nullptr ? nullptr : factory(broker, nullptr, &status);
}

}  // namespace

void ProviderLibrary::load() {
    const std::string path = libraryPath();
    if (void* const other = dlopen(path.c_str(), RTLD_NOW | RTLD_NOLOAD)) {
        dlclose(other);
        throw std::runtime_error("The provider is also loaded without the gate. Register only one of them.");
    }
    handle = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL);
    if (handle == nullptr) {
        const char* reason = dlerror();
        throw std::runtime_error(std::string("The provider cannot be loaded: ") + (reason == nullptr ? "" : reason));
    }
}

void ProviderLibrary::unload() {
    if (handle != nullptr) {
        dlclose(handle);
        handle = nullptr;
    }
    interfaces = {};
}

void ProviderLibrary::createInterfaces(const CMPIBroker* broker) {
    interfaces = {callFactory<CMPIInstanceMI>(handle, "LeaseAndWarrantyProvider_Create_InstanceMI", broker),
                  callFactory<CMPIAssociationMI>(handle, "LeaseAndWarrantyProvider_Create_AssociationMI", broker)};
    const auto [instances, associations] = interfaces;
    failIf(instances == nullptr || associations == nullptr, CMPI_RC_ERR_FAILED,
           "The provider did not return its interfaces.");
}

}  // namespace gate
