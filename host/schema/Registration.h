#pragma once

#include <filesystem>
#include <istream>
#include <string>
#include <vector>

namespace cimhost {

/** One stanza of a registration file: which provider serves a class. */
struct ProviderRegistration {
    std::string className;
    std::string provider;                 ///< name of the provider, prefix of its factory functions
    std::string location;                 ///< library lib<location>.so
    bool instance = false;                ///< has an instance interface
    bool association = false;             ///< has an association interface
    std::vector<std::string> nameSpaces;  ///< where the class is served; never empty
    std::string group;                    ///< empty when the stanza names none
    std::string unload;                   ///< as written, "never" for instance; empty when the stanza names none
    std::string source;                   ///< file and line of the stanza, for messages
};

/**
 * Reads registrations in SFCB's form: "[CLASS]", then lines "keyword: words", keywords in any letter case, several
 * namespaces on one line or on several; a line that begins with "#" ends a stanza or is a comment. Unknown
 * keywords and unknown words of "type" are passed over. LoadError with file and line for anything else.
 */
std::vector<ProviderRegistration> readRegistrationFile(const std::filesystem::path& file);

/** @param sourceName stands for the file in messages */
std::vector<ProviderRegistration> readRegistrations(std::istream& text, const std::string& sourceName);

}  // namespace cimhost
