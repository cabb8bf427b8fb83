#include "ProviderLibrary.h"

#include <dlfcn.h>

#include <stdexcept>
#include <string>

namespace bench {

namespace {

[[noreturn]] void failLoading(const std::string& what) {
    const char* reason = dlerror();
    throw std::runtime_error(what + ": " + (reason != nullptr ? reason : "no reason given"));
}

/** An entrance's library and the name of its provider. */
struct EntranceNames {
    const char* file;
    const char* provider;
};

EntranceNames namesOf(Entrance entrance) {
    return entrance == Entrance::gate ? EntranceNames{BENCH_GATE_LIBRARY, "LeaseAndWarrantyGate"}
                                      : EntranceNames{BENCH_PROVIDER_LIBRARY, "LeaseAndWarrantyProvider"};
}

template <class Interface>
Interface* make(const SharedLibrary& library, const std::string& factory, const CMPIBroker* broker) {
    using Factory = Interface* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
    CMPIStatus status{CMPI_RC_OK, nullptr};
    Interface* made = reinterpret_cast<Factory>(library.symbol(factory.c_str()))(broker, nullptr, &status);
    if (made == nullptr || status.rc != CMPI_RC_OK) {
        throw std::runtime_error(factory + " made nothing");
    }
    return made;
}

}  // namespace

SharedLibrary::SharedLibrary(std::filesystem::path itsFile) : handle(dlopen(itsFile.c_str(), RTLD_NOW | RTLD_GLOBAL)) {
    if (handle == nullptr) {
        failLoading("cannot load " + itsFile.string());
    }
}

SharedLibrary::~SharedLibrary() {
    dlclose(handle);
}

void* SharedLibrary::symbol(const char* name) const {
    void* address = dlsym(handle, name);
    if (address == nullptr) {
        failLoading(std::string("no ") + name);
    }
    return address;
}

bool SharedLibrary::isLoaded(const std::filesystem::path& file) {
    void* handle = dlopen(file.c_str(), RTLD_NOW | RTLD_NOLOAD);
    if (handle == nullptr) {
        return false;
    }
    dlclose(handle);
    return true;
}

std::filesystem::path ProviderLibrary::file() {
    return BENCH_PROVIDER_LIBRARY;
}

ProviderLibrary::ProviderLibrary(Entrance entrance, const CMPIBroker* broker) : library(namesOf(entrance).file) {
    const std::string provider = namesOf(entrance).provider;
    made.instances = make<CMPIInstanceMI>(library, provider + "_Create_InstanceMI", broker);
    made.associations = make<CMPIAssociationMI>(library, provider + "_Create_AssociationMI", broker);
}

AgentLibraries::AgentLibraries() : logging(BENCH_LOGGING_LIBRARY), framework(BENCH_FRAMEWORK_LIBRARY) {}

}  // namespace bench
