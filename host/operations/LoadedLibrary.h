#pragma once

#include <dlfcn.h>

#include <filesystem>
#include <stdexcept>
#include <string>
#include <vector>

namespace cimhost {

/** A provider cannot be used: its library is missing or cannot be loaded, or its factory is missing or fails. */
class LibraryError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/** A library is missing or cannot be loaded. */
class LibraryNotLoaded : public LibraryError {
public:
    using LibraryError::LibraryError;
};

/** A library is in none of the directories that were searched. */
class LibraryNotFound : public LibraryNotLoaded {
public:
    using LibraryNotLoaded::LibraryNotLoaded;
};

/** The directories to search for libraries, and the flags to load them with. */
struct LibraryOptions {
    std::vector<std::filesystem::path> searchPath{};  ///< directories, the first wins; none: where the system looks
    int flags = RTLD_NOW | RTLD_GLOBAL;               ///< for dlopen; these are what other object managers use
};

/**
 * The file of a provider library.
 * @param location "Name" for libName.so in one of the directories; a name with a slash is the file itself
 * @throws LibraryNotFound when no directory has it; the message names them all
 */
std::filesystem::path findLibrary(const std::string& location, const LibraryOptions& options);

/** A shared library in this process, closed at the end unless it is kept. */
class LoadedLibrary {
public:
    /** @throws LibraryNotLoaded with the reason that the system gives */
    LoadedLibrary(std::filesystem::path itsFile, int flags);
    ~LoadedLibrary();
    LoadedLibrary(const LoadedLibrary&) = delete;
    LoadedLibrary& operator=(const LoadedLibrary&) = delete;

    /** A function of the library; null when it has none of that name. The caller knows its type. */
    template <class Function>
    Function* function(const std::string& name) const {
        return reinterpret_cast<Function*>(symbol(name));
    }

    const std::filesystem::path& file() const { return libraryFile; }

    /** Leaves the library in the process for good. */
    void keep() { isKept = true; }

private:
    void* symbol(const std::string& name) const;

    std::filesystem::path libraryFile;
    void* handle;
    bool isKept = false;
};

}  // namespace cimhost
