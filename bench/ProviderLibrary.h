#pragma once

#include <array>
#include <filesystem>
#include <string>

#include "Requests.h"
#include "operations/LoadedLibrary.h"

namespace bench {

/** The dlopen flags of all libraries. */
constexpr int libraryFlags = RTLD_NOW | RTLD_LOCAL;

/** Whether a library is loaded in this process. */
bool isLoaded(const std::filesystem::path& file);

/** A provider that an object manager loads. */
struct ProviderEntry {
    std::filesystem::path file;
    std::string name;  ///< prefix of the names of its factory functions

    static ProviderEntry ofProvider();
    static ProviderEntry ofGate();

    /** Copies the provider's library to a directory. */
    static ProviderEntry ofCopy(const std::filesystem::path& directory);
};

/** The library of a provider and its two interfaces, loaded for the lifetime of this object. */
class ProviderLibrary {
public:
    ProviderLibrary(const ProviderEntry& entry, cimhost::Broker& broker);

    Interfaces interfaces() const { return created; }

private:
    cimhost::LoadedLibrary library;
    Interfaces created{};
};

/** The agent's framework and logging libraries, which stay loaded while the provider is loaded and unloaded. */
class AgentLibraries {
public:
    AgentLibraries();

    static std::array<std::filesystem::path, 2> files();

private:
    cimhost::LoadedLibrary logging;
    cimhost::LoadedLibrary framework;
};

}  // namespace bench
