#include "operations/LoadedLibrary.h"

#include <utility>

namespace cimhost {
namespace {

std::string reason() {
    const char* text = dlerror();
    return text == nullptr ? "unknown reason" : text;
}

}  // namespace

std::filesystem::path findLibrary(const std::string& location, const LibraryOptions& options) {
    if (location.find('/') != std::string::npos) {
        return location;
    }
    const std::string name = "lib" + location + ".so";
    std::string folders;
    for (const std::filesystem::path& folder : options.searchPath) {
        if (std::error_code ignored; std::filesystem::exists(folder / name, ignored)) {
            return folder / name;
        }
        folders += (folders.empty() ? "" : ", ") + folder.string();
    }
    if (!folders.empty()) {
        throw LibraryNotFound(name + " is in none of these folders: " + folders);
    }
    return name;
}

LoadedLibrary::LoadedLibrary(std::filesystem::path itsFile, int flags)
    : libraryFile(std::move(itsFile)), handle(dlopen(libraryFile.c_str(), flags)) {
    if (handle == nullptr) {
        const std::string text = "Cannot load " + libraryFile.string() + ": " + reason();
        if (libraryFile.has_parent_path()) {
            throw LibraryNotLoaded(text);
        }
        throw LibraryNotFound(text);
    }
}

LoadedLibrary::~LoadedLibrary() {
    if (!isKept) {
        dlclose(handle);
    }
}

void* LoadedLibrary::symbol(const std::string& name) const {
    return dlsym(handle, name.c_str());
}

}  // namespace cimhost
