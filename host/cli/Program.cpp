#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstring>
#include <string>

#include "cli/Commands.h"
#include "operations/StatusText.h"
#include "schema/Errors.h"

namespace cimhost {
namespace {

/** Standard output and standard error of the program. */
class Console {
public:
    Console(std::string itsProgram, text::Style itsStyle) : program(std::move(itsProgram)), style(itsStyle) {}

    void printError(const std::string& message) const {
        std::fprintf(stderr, "%s %s\n", text::painted(program + ":", text::Role::alarm, style).c_str(),
                     message.c_str());
    }

    /** Writes to standard output. @return false after an error, which it reports */
    bool write(const std::string& output) const {
        const bool isWritten =
            std::fwrite(output.data(), 1, output.size(), stdout) == output.size() && std::fflush(stdout) == 0;
        if (!isWritten) {
            printError(std::string("the output cannot be written: ") + std::strerror(errno));
        }
        return isWritten;
    }

private:
    std::string program;
    text::Style style;  ///< of standard error
};

int run(const Arguments& arguments, CommandExtension& extension, const Console& console) {
    const CommandResult result = runCommand(arguments, extension);
    if (!console.write(result.output)) {
        return exitOutput;
    }
    if (!result.status.ok()) {
        console.printError(errorText(result.status));
        if (!result.hint.empty()) {
            std::fprintf(stderr, "%s\n", result.hint.c_str());
        }
        return exitCimError;
    }
    if (!result.failure.empty()) {
        console.printError(result.failure);
        return exitCimError;
    }
    return exitSuccess;
}

int runGuarded(const Arguments& arguments, CommandExtension& extension, const Console& console) {
    try {
        return run(arguments, extension, console);
    } catch (const LoadError& error) {
        console.printError(error.what());
        return exitLoad;
    } catch (const LibraryNotFound& error) {
        console.printError(std::string(error.what()) +
                           " (set --library-path or CIMHOST_LIBRARY_PATH to its directory)");
        return exitLoad;
    } catch (const LibraryError& error) {
        console.printError(error.what());
        return exitLoad;
    } catch (const UsageError& error) {
        console.printError(error.what());
    } catch (const PathError& error) {
        console.printError(error.what());
    } catch (const ValueError& error) {
        console.printError(error.what());
    } catch (const std::exception& error) {
        console.printError(error.what());
        return exitCimError;
    }
    return exitUsage;
}

}  // namespace

int runProgram(int count, const char* const* values, CommandExtension& extension) {
    std::signal(SIGPIPE, SIG_IGN);  // report a closed pipe as an error
    ParsedArguments parsed = parseArguments(count, values, extension);
    const Console console(extension.program, text::styleFor(STDERR_FILENO, parsed.arguments.colours));
    parsed.arguments.style = text::styleFor(STDOUT_FILENO, parsed.arguments.colours);
    if (!parsed.ended) {
        return runGuarded(parsed.arguments, extension, console);
    }
    if (!parsed.error.empty()) {
        console.printError(parsed.error);
    }
    return console.write(parsed.output) ? parsed.exitStatus : static_cast<int>(exitOutput);
}

}  // namespace cimhost
