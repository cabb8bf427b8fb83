#pragma once

#include "Requests.h"

#include <filesystem>

namespace bench {

/** A shared library in this process. */
class SharedLibrary {
public:
    /** @throws std::runtime_error with the loader's reason */
    explicit SharedLibrary(std::filesystem::path itsFile);
    ~SharedLibrary();
    SharedLibrary(const SharedLibrary&) = delete;
    SharedLibrary& operator=(const SharedLibrary&) = delete;

    /** The address of a symbol. @throws std::runtime_error when there is none of that name */
    void* symbol(const char* name) const;

    /** Whether a library is in the process, without loading it. */
    static bool isLoaded(const std::filesystem::path& file);

private:
    void* handle;
};

/** The provider library with its two interfaces, loaded as long as this lives. */
class ProviderLibrary {
public:
    explicit ProviderLibrary(const CMPIBroker* broker);

    Interfaces interfaces() const { return made; }

    static std::filesystem::path file();

private:
    SharedLibrary library;
    Interfaces made{};
};

/** The agent's framework and logging libraries, which stay loaded while the provider comes and goes. */
class AgentLibraries {
public:
    AgentLibraries();

private:
    SharedLibrary logging;
    SharedLibrary framework;
};

}  // namespace bench
