#pragma once

#include <optional>
#include <stdexcept>
#include <string>
#include <vector>

#include "cli/TextLayout.h"
#include "model/Request.h"

namespace cimhost {

class CommandExtension;

/** Exit statuses of the program. */
enum ExitStatus {
    exitSuccess = 0,
    exitCimError = 1,  ///< the request failed
    exitUsage = 2,     ///< the command line is wrong
    exitLoad = 3,      ///< a library, a registration or a schema cannot be loaded
    exitOutput = 4     ///< the output could not be written
};

/** A wrong command line. The message says what to write instead. */
class UsageError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

enum class Format { text, json, mof };

/** The options and arguments of a command line. */
struct Arguments {
    std::optional<Operation> operation{};    ///< none: list the classes, or a command of the extension
    std::string target{};                    ///< class name or object path; empty for classes
    std::vector<std::string> assignments{};  ///< NAME=VALUE
    std::vector<std::string> nulls{};        ///< properties to set to null
    AssociationFilter filter{};
    PropertyList properties{};
    std::vector<std::string> schemas{};
    std::vector<std::string> registrations{};
    std::vector<std::string> libraryPaths{};
    std::string provider{};  ///< "gate" or "bare"; empty: not given
    std::string nameSpace = "root/cimv2";
    Format format = Format::text;
    bool raw = false;
    text::Colours colours = text::Colours::automatic;
    text::Style style{};  ///< of text on standard output
};

/** The arguments of a command line, or the output and exit status of a program that ends without running a command. */
struct ParsedArguments {
    Arguments arguments{};
    bool ended = false;    ///< after --help, --version or a wrong command line
    int exitStatus = 0;    ///< if ended
    std::string output{};  ///< for standard output, if ended
    std::string error{};   ///< for standard error, if ended
};

ParsedArguments parseArguments(int count, const char* const* values, CommandExtension& extension);

}  // namespace cimhost
