#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstring>
#include <string>

#include "cli/Commands.h"
#include "cli/ExitStatus.h"
#include "operations/LibraryError.h"
#include "operations/StatusText.h"
#include "schema/Errors.h"

namespace {

using namespace cimhost;

/** How standard error looks. */
text::Style errorStyle;

void complain(const std::string& text) {
    std::fprintf(stderr, "%s %s\n", text::painted("cimhost:", text::Role::alarm, errorStyle).c_str(), text.c_str());
}

/** Writes all of the text to standard output, or says why that cannot be done. */
bool writeOutput(const std::string& text) {
    const bool written = std::fwrite(text.data(), 1, text.size(), stdout) == text.size() && std::fflush(stdout) == 0;
    if (!written) {
        complain(std::string("the output cannot be written: ") + std::strerror(errno));
    }
    return written;
}

int run(const Arguments& arguments) {
    const Outcome outcome = runCommand(arguments);
    if (!writeOutput(outcome.output)) {
        return exitOutput;
    }
    if (!outcome.status.ok()) {
        complain(errorText(outcome.status));
        if (!outcome.hint.empty()) {
            std::fprintf(stderr, "%s\n", outcome.hint.c_str());
        }
        return exitCimError;
    }
    if (!outcome.complaint.empty()) {
        complain(outcome.complaint);
        return exitCimError;
    }
    return exitSuccess;
}

int runGuarded(const Arguments& arguments) {
    try {
        return run(arguments);
    } catch (const LoadError& error) {
        complain(error.what());
        return exitLoad;
    } catch (const LibraryNotFound& error) {
        complain(std::string(error.what()) +
                 " (libraries are looked for with --library-path and CIMHOST_LIBRARY_PATH)");
        return exitLoad;
    } catch (const LibraryError& error) {
        complain(error.what());
        return exitLoad;
    } catch (const UsageError& error) {
        complain(error.what());
    } catch (const PathError& error) {
        complain(error.what());
    } catch (const ValueError& error) {
        complain(error.what());
    } catch (const std::exception& error) {
        complain(error.what());
        return exitCimError;
    }
    return exitUsage;
}

}  // namespace

int main(int count, char** values) {
    std::signal(SIGPIPE, SIG_IGN);  // a closed pipe is an error to report, not a silent end
    ParsedArguments parsed = parseArguments(count, values);
    errorStyle = text::styleFor(STDERR_FILENO, parsed.arguments.colours);
    parsed.arguments.style = text::styleFor(STDOUT_FILENO, parsed.arguments.colours);
    if (!parsed.ended) {
        return runGuarded(parsed.arguments);
    }
    if (!parsed.error.empty()) {
        complain(parsed.error);
    }
    return writeOutput(parsed.output) ? parsed.exitStatus : static_cast<int>(exitOutput);
}
