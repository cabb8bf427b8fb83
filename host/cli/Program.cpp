#include "cli/Program.h"

#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstring>
#include <string>

#include "cli/ExitStatus.h"
#include "operations/StatusText.h"
#include "schema/Errors.h"

namespace cimhost {
namespace {

/** Standard output and standard error of the program. */
class Console {
public:
    Console(std::string itsProgram, text::Style itsStyle) : program(std::move(itsProgram)), style(itsStyle) {}

    void complain(const std::string& message) const {
        std::fprintf(stderr, "%s %s\n", text::painted(program + ":", text::Role::alarm, style).c_str(),
                     message.c_str());
    }

    /** Writes to standard output, or reports why that fails. */
    bool write(const std::string& output) const {
        const bool isWritten =
            std::fwrite(output.data(), 1, output.size(), stdout) == output.size() && std::fflush(stdout) == 0;
        if (!isWritten) {
            complain(std::string("the output cannot be written: ") + std::strerror(errno));
        }
        return isWritten;
    }

private:
    std::string program;
    text::Style style;  ///< of standard error
};

int run(const Arguments& arguments, CommandExtension& commands, const Console& console) {
    const CommandResult result = runCommand(arguments, commands);
    if (!console.write(result.output)) {
        return exitOutput;
    }
    if (!result.status.ok()) {
        console.complain(errorText(result.status));
        if (!result.hint.empty()) {
            std::fprintf(stderr, "%s\n", result.hint.c_str());
        }
        return exitCimError;
    }
    if (!result.failure.empty()) {
        console.complain(result.failure);
        return exitCimError;
    }
    return exitSuccess;
}

int runGuarded(const Arguments& arguments, CommandExtension& commands, const Console& console) {
    try {
        return run(arguments, commands, console);
    } catch (const LoadError& error) {
        console.complain(error.what());
        return exitLoad;
    } catch (const LibraryNotFound& error) {
        console.complain(std::string(error.what()) +
                         " (libraries are looked for with --library-path and CIMHOST_LIBRARY_PATH)");
        return exitLoad;
    } catch (const LibraryError& error) {
        console.complain(error.what());
        return exitLoad;
    } catch (const UsageError& error) {
        console.complain(error.what());
    } catch (const PathError& error) {
        console.complain(error.what());
    } catch (const ValueError& error) {
        console.complain(error.what());
    } catch (const std::exception& error) {
        console.complain(error.what());
        return exitCimError;
    }
    return exitUsage;
}

}  // namespace

int runProgram(int count, const char* const* values, const CommandLineExtension& commandLine,
               CommandExtension& commands) {
    std::signal(SIGPIPE, SIG_IGN);  // a closed pipe is an error to report, not a silent end
    ParsedArguments parsed = parseArguments(count, values, commandLine);
    const Console console(commandLine.program, text::styleFor(STDERR_FILENO, parsed.arguments.colours));
    parsed.arguments.style = text::styleFor(STDOUT_FILENO, parsed.arguments.colours);
    if (!parsed.ended) {
        return runGuarded(parsed.arguments, commands, console);
    }
    if (!parsed.error.empty()) {
        console.complain(parsed.error);
    }
    return console.write(parsed.output) ? parsed.exitStatus : static_cast<int>(exitOutput);
}

}  // namespace cimhost
