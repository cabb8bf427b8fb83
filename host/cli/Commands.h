#pragma once

#include <memory>
#include <string>

#include "cli/Arguments.h"
#include "model/Status.h"
#include "operations/ObjectManager.h"
#include "schema/Schema.h"

namespace CLI {
class App;
}

namespace cimhost {

/** The result of a command. */
struct CommandResult {
    std::string output{};   ///< for standard output
    Status status{};        ///< of the request
    std::string failure{};  ///< message for standard error if the status is OK; empty: none
    std::string hint{};     ///< advice after a failed request; empty: none
};

/** Additions of a program to the command line and the commands of cimhost. */
class CommandExtension {
public:
    virtual ~CommandExtension() = default;

    std::string program = "cimhost";
    std::string introduction{};  ///< first paragraph of the help; empty: that of cimhost
    std::string examples{};      ///< additional example lines, each with a line feed
    std::string notes{};         ///< a paragraph after the examples, with a line feed; empty: none

    /** Adds options and commands to the command line. Their values are stored in this object. */
    virtual void addTo(CLI::App&) {}

    /** The behaviour of the object manager; null: the standard behaviour. */
    virtual std::shared_ptr<const ManagerBehaviour> behaviour() const { return nullptr; }

    /** Changes a request into one that a client of the emulated manager would send. */
    virtual void adapt(Request&) const {}

    /** Whether the command line has a command that the program adds. */
    virtual bool hasCommand() const { return false; }

    /** Runs the command that the program adds. */
    virtual CommandResult run(ObjectManager&, const Arguments&, const Schema&) { return {}; }
};

/**
 * Runs the command of a command line: loads schema and registrations, performs the request and unloads the providers.
 * @throws UsageError, ValueError, PathError for a wrong command line
 * @throws LoadError, LibraryError for files that cannot be loaded
 */
CommandResult runCommand(const Arguments& arguments, CommandExtension& extension);

/** Runs cimhost with these additions. @return the exit status */
int runProgram(int count, const char* const* values, CommandExtension& extension);

}  // namespace cimhost
