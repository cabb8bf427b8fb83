#pragma once

#include <memory>
#include <string>

#include "cli/Arguments.h"
#include "model/Status.h"
#include "operations/ObjectManager.h"
#include "schema/Schema.h"

namespace cimhost {

/** The result of a command: output for standard output, and the status of its request. */
struct CommandResult {
    std::string output{};
    Status status{};
    std::string failure{};  ///< message for standard error although the request was OK; empty: none
    std::string hint{};     ///< what to try after a failed request; empty: nothing
};

/** How a program runs its commands; cimhost itself uses the defaults. */
class CommandExtension {
public:
    virtual ~CommandExtension() = default;

    /** Null: the standard behaviour. */
    virtual std::shared_ptr<const ManagerBehaviour> behaviour() const { return nullptr; }

    /** Changes a request as the clients of the emulated manager would. */
    virtual void adapt(Request&) const {}

    /** Whether a command was given that the program adds to those of cimhost. */
    virtual bool hasCommand() const { return false; }

    /** Runs that command. */
    virtual CommandResult run(ObjectManager&, const Arguments&, const Schema&) { return {}; }
};

/**
 * Runs the command of a command line: loads schema and registrations, performs the request, unloads the providers.
 * UsageError, ValueError and PathError for a wrong command line, LoadError and LibraryError for what cannot be loaded.
 */
CommandResult runCommand(const Arguments& arguments, CommandExtension& extension);

}  // namespace cimhost
