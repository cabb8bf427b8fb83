#pragma once

#include "Requests.h"

#include <array>
#include <filesystem>
#include <string>

namespace bench {

/** A shared library in this process. */
class SharedLibrary {
public:
    /** @throws std::runtime_error with the loader's reason */
    explicit SharedLibrary(const std::filesystem::path& file);
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

/** What an object manager loads: a library, and the name of the provider that it looks for there. */
struct Entrance {
    std::filesystem::path file;
    std::string provider;

    static Entrance provided();                                      ///< the provider itself
    static Entrance gate();                                          ///< the gate that has the provider behind it
    static Entrance copyOf(const std::filesystem::path& directory);  ///< a copy of the provider, made there
};

/** The library of an entrance with its two interfaces, loaded as long as this lives. */
class ProviderLibrary {
public:
    ProviderLibrary(const Entrance& entrance, const CMPIBroker* broker);

    Interfaces interfaces() const { return made; }

private:
    SharedLibrary library;
    Interfaces made{};
};

/** The agent's framework and logging libraries, which stay loaded while the provider comes and goes. */
class AgentLibraries {
public:
    AgentLibraries();

    /** Where they are. */
    static std::array<std::filesystem::path, 2> files();

private:
    SharedLibrary logging;
    SharedLibrary framework;
};

}  // namespace bench
