#pragma once

#include <dlfcn.h>

#include <filesystem>
#include <string>
#include <vector>

namespace cimhost {

/** Where libraries are looked for, and how they are loaded. */
struct LibraryOptions {
    std::vector<std::filesystem::path> searchPath{};  ///< folders, the first wins; none: where the system looks
    int flags = RTLD_NOW | RTLD_GLOBAL;               ///< for dlopen; these are what other object managers use
};

/**
 * The file of a provider library.
 * @param location "Name" for libName.so in one of the folders; anything with a slash is a file itself
 * @throws LibraryError when no folder has it; the text names them all
 */
std::filesystem::path findLibrary(const std::string& location, const LibraryOptions& options);

/** A shared library in this process, closed at the end unless it is kept. */
class LoadedLibrary {
public:
    /** @throws LibraryError with the reason that the system gives */
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
