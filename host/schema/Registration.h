#pragma once

#include <filesystem>
#include <istream>
#include <string>
#include <vector>

namespace cimhost {

/** One section of a registration file: the provider of a class. */
struct ProviderRegistration {
    std::string className;
    std::string provider;                 ///< name of the provider, prefix of its factory functions
    std::string location;                 ///< library lib<location>.so, or a file name with a slash
    bool instance = false;                ///< has an instance interface
    bool association = false;             ///< has an association interface
    std::vector<std::string> nameSpaces;  ///< in which the class is served; never empty
    std::string group;                    ///< empty: none
    std::string unload;                   ///< as written, such as "never"; empty: none
    std::string source;                   ///< file and line of the section, for messages
};

/**
 * Reads registrations in SFCB's form: "[CLASS]", then lines "keyword: words". Keywords are case-insensitive. There may
 * be several namespaces per line and several such lines. Lines that begin with "#", unknown keywords, and unknown words
 * after "type" are ignored.
 * @throws LoadError with the file if it cannot be read, and with file and line for an error in it
 */
std::vector<ProviderRegistration> readRegistrationFile(const std::filesystem::path& file);

/** @param sourceName replaces the file name in messages */
std::vector<ProviderRegistration> readRegistrations(std::istream& stream, const std::string& sourceName);

}  // namespace cimhost
