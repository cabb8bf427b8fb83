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

/** What an object manager loads: the provider, or the gate that has the provider behind it. */
enum class Entrance { bare, gate };

/** The provider library with the two interfaces of its entrance, loaded as long as this lives. */
class ProviderLibrary {
public:
    ProviderLibrary(Entrance entrance, const CMPIBroker* broker);

    Interfaces interfaces() const { return made; }

    /** The file of the provider itself. */
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
