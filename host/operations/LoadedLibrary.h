#pragma once

#include <dlfcn.h>

#include <filesystem>
#include <stdexcept>
#include <string>
#include <vector>

namespace cimhost {

/** A provider cannot be started: for example, its library cannot be loaded, or its factory is missing or fails. */
class LibraryError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/** A library is missing or cannot be loaded. */
class LibraryNotLoaded : public LibraryError {
public:
    using LibraryError::LibraryError;
};

/** None of the searched directories contains the library. */
class LibraryNotFound : public LibraryNotLoaded {
public:
    using LibraryNotLoaded::LibraryNotLoaded;
};

/** The directories to search for libraries, and the flags to load them with. */
struct LibraryOptions {
    std::vector<std::filesystem::path> searchPath{};  ///< searched in order; empty: the system's directories
    int flags = RTLD_NOW | RTLD_GLOBAL;               ///< for dlopen; the default is that of other object managers
};

/**
 * Finds the file of a provider library.
 * @param location "Name" for libName.so in one of the directories; a name with a slash is a file name
 * @throws LibraryNotFound if no directory contains it; the message names all directories
 */
std::filesystem::path findLibrary(const std::string& location, const LibraryOptions& options);

/** A shared library in this process. The destructor closes it unless keep() was called. */
class LoadedLibrary {
public:
    /** @throws LibraryNotLoaded with the error message of dlopen */
    LoadedLibrary(std::filesystem::path itsFile, int flags);
    ~LoadedLibrary();
    LoadedLibrary(const LoadedLibrary&) = delete;
    LoadedLibrary& operator=(const LoadedLibrary&) = delete;

    /** Returns a function of the library; null if it does not export the name. */
    template <class Function>
    Function* function(const std::string& name) const {
        return reinterpret_cast<Function*>(dlsym(handle, name.c_str()));
    }

    const std::filesystem::path& file() const { return libraryFile; }

    /** Keeps the library loaded until the process ends. */
    void keep() { staysLoaded = true; }

private:
    std::filesystem::path libraryFile;
    void* handle;
    bool staysLoaded = false;
};

}  // namespace cimhost
