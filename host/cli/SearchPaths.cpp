#include "cli/SearchPaths.h"

#include <algorithm>
#include <cstdlib>
#include <iterator>
#include <sstream>
#include <system_error>

#include "Installation.h"
#include "schema/Errors.h"

namespace cimhost {
namespace {

namespace fs = std::filesystem;

/** A kind of files: its name in messages, its option and its environment variable. */
struct Kind {
    const char* name;
    const char* option;
    const char* variable;
    const char* extension;
};

constexpr Kind schemaKind{"schema", "--schema", "CIMHOST_SCHEMA", ".mof"};
constexpr Kind registrationKind{"registration", "--registration", "CIMHOST_REGISTRATION", ".reg"};
constexpr auto libraryVariable = "CIMHOST_LIBRARY_PATH";

fs::path programDirectory() {
    std::error_code error;
    return fs::read_symlink("/proc/self/exe", error).parent_path();
}

/** The entries of an environment variable; none if it is not set or empty. */
std::vector<std::string> listFrom(const char* variable) {
    std::vector<std::string> entries;
    const char* value = ::secure_getenv(variable);
    std::istringstream list(value == nullptr ? "" : value);
    for (std::string entry; std::getline(list, entry, ':');) {
        if (!entry.empty()) {
            entries.push_back(entry);
        }
    }
    return entries;
}

/** The entries of the options, or of the variable if there are none. */
std::vector<std::string> configured(const std::vector<std::string>& options, const char* variable) {
    return options.empty() ? listFrom(variable) : options;
}

std::vector<fs::path> filesIn(const fs::path& directory, const Kind& kind) {
    std::vector<fs::path> files;
    std::error_code error;
    for (fs::directory_iterator entry(directory, error), end; !error && entry != end; entry.increment(error)) {
        if (entry->path().extension() == kind.extension) {
            files.push_back(entry->path());
        }
    }
    if (error) {
        throw LoadError(directory.string() + ": this directory cannot be read: " + error.message());
    }
    std::sort(files.begin(), files.end());
    return files;
}

std::vector<fs::path> findFiles(const std::vector<std::string>& options, const Kind& kind) {
    std::vector<std::string> entries = configured(options, kind.variable);
    const fs::path standard = programDirectory() / installation::dataDirectory;
    std::error_code error;
    if (entries.empty() && fs::is_directory(standard, error)) {
        entries.push_back(standard.lexically_normal().string());
    }
    std::vector<fs::path> files;
    for (const std::string& entry : entries) {
        const std::vector<fs::path> found =
            fs::is_directory(entry, error) ? filesIn(entry, kind) : std::vector<fs::path>{entry};
        files.insert(files.end(), found.begin(), found.end());
    }
    if (files.empty()) {
        throw LoadError(std::string("there is no ") + kind.name + ": name a file with " + kind.option + " or in " +
                        kind.variable);
    }
    return files;
}

std::vector<fs::path> findLibraryPaths(const std::vector<std::string>& options) {
    const std::vector<std::string> entries = configured(options, libraryVariable);
    std::vector<fs::path> directories(entries.begin(), entries.end());
    std::error_code error;
    for (const fs::path& directory : directories) {
        if (!fs::is_directory(directory, error)) {
            throw LoadError(directory.string() + ": this library directory does not exist");
        }
    }
    if (entries.empty()) {
        for (const char* relative : installation::libraryDirectories) {
            const fs::path directory = (programDirectory() / relative).lexically_normal();
            if (std::find(directories.begin(), directories.end(), directory) == directories.end()) {
                directories.push_back(directory);
            }
        }
    }
    return directories;
}

}  // namespace

SearchPaths findSearchPaths(const Arguments& arguments) {
    return {findFiles(arguments.schemas, schemaKind), findFiles(arguments.registrations, registrationKind),
            findLibraryPaths(arguments.libraryPaths)};
}

}  // namespace cimhost
