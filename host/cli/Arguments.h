#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "cli/Style.h"
#include "operations/Request.h"

namespace cimhost {

enum class Format { text, json, mof };

/** What the command load was given. */
struct LoadArguments {
    std::vector<std::string> classes{};
    unsigned clients = 8;
    std::size_t requests = 10'000;
    std::uint64_t seed = 1;
    std::string mix{};     ///< empty: the usual one
    std::string source{};  ///< object path; empty: none
    std::optional<std::string> associationClass{};
    bool fills = false;
    bool keeps = false;
    bool isTrusting = false;
    std::string shown{};  ///< a number or "all"; empty: what suits the form of the output
};

/** The command line, as it was given. */
struct Arguments {
    std::optional<Operation> operation{};  ///< none: list the classes, or run a load
    bool isLoad = false;
    LoadArguments load{};
    std::string target{};                    ///< class name or object path; empty for classes
    std::vector<std::string> assignments{};  ///< NAME=VALUE
    std::vector<std::string> nulls{};        ///< properties to set to null
    AssociationFilter filter{};
    PropertyList properties{};
    std::vector<std::string> schemas{};
    std::vector<std::string> registrations{};
    std::vector<std::string> libraryPaths{};
    std::string nameSpace = "root/cimv2";
    Format format = Format::text;
    bool raw = false;
    Manager manager = Manager::standard;
    text::Colours colours = text::Colours::automatic;
    text::Style style{};  ///< for people, on standard output
};

/** What became of reading a command line: arguments to act on, or an end with something to say. */
struct ParsedArguments {
    Arguments arguments{};
    bool ended = false;    ///< help or version was asked for, or the command line is wrong
    int exitStatus = 0;    ///< when ended
    std::string output{};  ///< for standard output, when ended
    std::string error{};   ///< for standard error, when ended
};

ParsedArguments parseArguments(int count, const char* const* values);

}  // namespace cimhost
