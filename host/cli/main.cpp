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

void complain(const std::string& text) {
    std::fprintf(stderr, "cimhost: %s\n", text.c_str());
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
    } catch (const LibraryError& error) {
        complain(std::string(error.what()) +
                 " (libraries are looked for with --library-path and CIMHOST_LIBRARY_PATH)");
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
    const ParsedArguments parsed = parseArguments(count, values);
    if (!parsed.ended) {
        return runGuarded(parsed.arguments);
    }
    std::fputs(parsed.error.c_str(), stderr);
    return writeOutput(parsed.output) ? parsed.exitStatus : static_cast<int>(exitOutput);
}
