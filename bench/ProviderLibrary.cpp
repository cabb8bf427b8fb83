#include "ProviderLibrary.h"

#include <dlfcn.h>

#include "operations/Interfaces.h"

namespace bench {

bool isLoaded(const std::filesystem::path& file) {
    void* handle = dlopen(file.c_str(), RTLD_NOW | RTLD_NOLOAD);
    if (handle == nullptr) {
        return false;
    }
    dlclose(handle);
    return true;
}

ProviderEntry ProviderEntry::ofProvider() {
    return {BENCH_PROVIDER_LIBRARY, "LeaseAndWarrantyProvider"};
}

ProviderEntry ProviderEntry::ofGate() {
    return {BENCH_GATE_LIBRARY, "LeaseAndWarrantyGate"};
}

ProviderEntry ProviderEntry::ofCopy(const std::filesystem::path& directory) {
    ProviderEntry entry = ofProvider();
    const std::filesystem::path copy = directory / entry.file.filename();
    std::filesystem::copy_file(entry.file, copy, std::filesystem::copy_options::overwrite_existing);
    entry.file = copy;
    return entry;
}

ProviderLibrary::ProviderLibrary(const ProviderEntry& entry, cimhost::Broker& broker)
    : library(entry.file, libraryFlags) {
    using cimhost::FactoryChoice;
    created = {cimhost::createInterface<CMPIInstanceMI>(library, entry.name, broker, FactoryChoice::named),
               cimhost::createInterface<CMPIAssociationMI>(library, entry.name, broker, FactoryChoice::named)};
}

AgentLibraries::AgentLibraries()
    : logging(BENCH_LOGGING_LIBRARY, libraryFlags), framework(BENCH_FRAMEWORK_LIBRARY, libraryFlags) {}

std::array<std::filesystem::path, 2> AgentLibraries::files() {
    return {BENCH_LOGGING_LIBRARY, BENCH_FRAMEWORK_LIBRARY};
}

}  // namespace bench
