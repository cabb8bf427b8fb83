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

SharedLibrary::SharedLibrary(const std::filesystem::path& file) : handle(dlopen(file.c_str(), RTLD_NOW | RTLD_LOCAL)) {
    if (handle == nullptr) {
        failLoading("cannot load " + file.string());
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

Entrance Entrance::provided() {
    return {BENCH_PROVIDER_LIBRARY, "LeaseAndWarrantyProvider"};
}

Entrance Entrance::gate() {
    return {BENCH_GATE_LIBRARY, "LeaseAndWarrantyGate"};
}

Entrance Entrance::copyOf(const std::filesystem::path& directory) {
    Entrance entrance = provided();
    const std::filesystem::path copy = directory / entrance.file.filename();
    std::filesystem::copy_file(entrance.file, copy, std::filesystem::copy_options::overwrite_existing);
    entrance.file = copy;
    return entrance;
}

ProviderLibrary::ProviderLibrary(const Entrance& entrance, const CMPIBroker* broker) : library(entrance.file) {
    made.instances = make<CMPIInstanceMI>(library, entrance.provider + "_Create_InstanceMI", broker);
    made.associations = make<CMPIAssociationMI>(library, entrance.provider + "_Create_AssociationMI", broker);
}

AgentLibraries::AgentLibraries() : logging(BENCH_LOGGING_LIBRARY), framework(BENCH_FRAMEWORK_LIBRARY) {}

std::array<std::filesystem::path, 2> AgentLibraries::files() {
    return {BENCH_LOGGING_LIBRARY, BENCH_FRAMEWORK_LIBRARY};
}

}  // namespace bench
