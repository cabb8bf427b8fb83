#pragma once

#include <string>

#include "cli/Arguments.h"
#include "model/Status.h"

namespace cimhost {

/** What a command has to say: text for standard output, and how its request ended. */
struct Outcome {
    std::string output{};
    Status status{};
    std::string complaint{};  ///< what is wrong although the request itself ended well; empty: nothing
    std::string hint{};       ///< what to try where the request did not end well; empty: nothing
};

/**
 * Does a command line's work: loads schema and registrations, runs the request, unloads the providers.
 * UsageError, ValueError and PathError for a wrong command line, LoadError and LibraryError for what cannot be loaded.
 */
Outcome runCommand(const Arguments& arguments);

}  // namespace cimhost
