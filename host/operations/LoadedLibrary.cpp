#include "operations/LoadedLibrary.h"

#include <utility>

namespace cimhost {
namespace {

std::string reason() {
    const char* message = dlerror();
    return message == nullptr ? "unknown reason" : message;
}

}  // namespace

std::filesystem::path findLibrary(const std::string& location, const LibraryOptions& options) {
    if (location.find('/') != std::string::npos) {
        return location;
    }
    const std::string name = "lib" + location + ".so";
    std::string searched;
    for (const std::filesystem::path& directory : options.searchPath) {
        if (std::error_code ignored; std::filesystem::exists(directory / name, ignored)) {
            return directory / name;
        }
        searched += (searched.empty() ? "" : ", ") + directory.string();
    }
    if (!searched.empty()) {
        throw LibraryNotFound(name + " is in none of these directories: " + searched);
    }
    return name;
}

LoadedLibrary::LoadedLibrary(std::filesystem::path itsFile, int flags)
    : libraryFile(std::move(itsFile)), handle(dlopen(libraryFile.c_str(), flags)) {
    if (handle == nullptr) {
        const std::string message = "Cannot load " + libraryFile.string() + ": " + reason();
        if (libraryFile.has_parent_path()) {
            throw LibraryNotLoaded(message);
        }
        throw LibraryNotFound(message);
    }
}

LoadedLibrary::~LoadedLibrary() {
    if (!staysLoaded) {
        dlclose(handle);
    }
}

}  // namespace cimhost
