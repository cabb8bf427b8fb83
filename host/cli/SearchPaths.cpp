#include "cli/SearchPaths.h"

#include <algorithm>
#include <cstdlib>
#include <sstream>
#include <system_error>

#include "Installation.h"
#include "cli/Arguments.h"
#include "schema/Errors.h"

namespace cimhost {
namespace {

namespace fs = std::filesystem;

/** A kind of file: its name in messages, its option, its environment variable and its file name extension. */
struct Kind {
    const char* name;
    const char* option;
    const char* variable;
    const char* extension;
};

constexpr Kind schemaKind{"schema", "--schema", "CIMHOST_SCHEMA", ".mof"};
constexpr Kind registrationKind{"registration", "--registration", "CIMHOST_REGISTRATION", ".reg"};
constexpr auto libraryVariable = "CIMHOST_LIBRARY_PATH";
constexpr auto providerVariable = "CIMHOST_PROVIDER";

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

/** The entries of the options, or of the variable if the options have none. */
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

/** The files and directories of the options, of the environment variable, or of the installation or build tree. */
std::vector<std::string> findEntries(const std::vector<std::string>& options, const Kind& kind) {
    std::vector<std::string> entries = configured(options, kind.variable);
    const fs::path standard = programDirectory() / installation::dataDirectory;
    std::error_code error;
    if (entries.empty() && fs::is_directory(standard, error)) {
        entries.push_back(standard.lexically_normal().string());
    }
    return entries;
}

std::vector<fs::path> findFiles(const std::vector<std::string>& entries, const Kind& kind) {
    std::vector<fs::path> files;
    std::error_code error;
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

/** Whether to use gates: the choice of the option, or else of the environment variable. */
bool usesGates(const std::string& option) {
    const char* value = ::secure_getenv(providerVariable);
    const std::string provider = !option.empty() ? option : value == nullptr ? "" : value;
    if (provider != "gate" && provider != "bare" && !provider.empty()) {
        throw UsageError(std::string(providerVariable) + " is \"" + provider + "\"; set it to gate or bare");
    }
    return provider != "bare";
}

std::vector<fs::path> findGates(const std::vector<std::string>& entries, const std::string& option) {
    std::vector<fs::path> files;
    if (usesGates(option)) {
        for (const std::string& entry : entries) {
            std::error_code error;
            const fs::path directory = fs::path(entry) / "gate";
            const std::vector<fs::path> found =
                fs::is_directory(directory, error) ? filesIn(directory, registrationKind) : std::vector<fs::path>{};
            files.insert(files.end(), found.begin(), found.end());
        }
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
    const std::vector<std::string> registrations = findEntries(arguments.registrations, registrationKind);
    return {findFiles(findEntries(arguments.schemas, schemaKind), schemaKind),
            findFiles(registrations, registrationKind), findGates(registrations, arguments.provider),
            findLibraryPaths(arguments.libraryPaths)};
}

}  // namespace cimhost
