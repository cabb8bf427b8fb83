#include "host/cli/Program.h"

#include <fcntl.h>
#include <pty.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <fstream>
#include <sstream>

#include "host/schema/Schemas.h"
#include "support/TemporaryDirectory.h"
#include "support/UnderTest.h"

namespace cimhost::test {
namespace {

std::string contentOf(const std::filesystem::path& file) {
    std::ifstream stream(file, std::ios::binary);
    std::ostringstream text;
    text << stream.rdbuf();
    return text.str();
}

/** The array for exec, terminated by a null pointer. */
std::vector<char*> pointersTo(std::vector<std::string>& strings) {
    std::vector<char*> pointers;
    pointers.reserve(strings.size() + 1);
    for (std::string& text : strings) {
        pointers.push_back(text.data());
    }
    pointers.push_back(nullptr);
    return pointers;
}

/** The environment of this process without the variables of cimhost, and with these. */
std::vector<std::string> environmentWith(const Environment& more) {
    std::vector<std::string> variables = more;
    for (char** each = environ; *each != nullptr; ++each) {
        if (std::strncmp(*each, "CIMHOST_", 8) != 0) {
            variables.emplace_back(*each);
        }
    }
    return variables;
}

void redirect(const std::string& file, int descriptor) {
    const int opened = open(file.c_str(), O_WRONLY | O_CREAT, 0600);
    if (opened < 0 || dup2(opened, descriptor) < 0) {
        _exit(125);
    }
}

}  // namespace

ProgramResult runBare(const std::vector<std::string>& arguments, const Environment& environment,
                      const std::string& outputFile) {
    const testsupport::TemporaryDirectory directory;
    const std::string output = outputFile.empty() ? (directory.path() / "output").string() : outputFile;
    const std::string error = directory.path() / "error";
    const std::string program = testsupport::underTest(CIMHOST_PROGRAM);
    std::vector<std::string> words = arguments;
    words.insert(words.begin(), program);
    std::vector<std::string> variables = environmentWith(environment);
    const std::vector<char*> wordPointers = pointersTo(words);
    const std::vector<char*> variablePointers = pointersTo(variables);
    const pid_t child = fork();
    if (child == 0) {
        redirect(output, STDOUT_FILENO);
        redirect(error, STDERR_FILENO);
        execve(program.c_str(), wordPointers.data(), variablePointers.data());
        _exit(126);
    }
    int status = 0;
    waitpid(child, &status, 0);
    return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, outputFile.empty() ? contentOf(output) : "",
            contentOf(error)};
}

namespace {

void addTestClasses(std::vector<std::string>& arguments) {
    arguments.insert(arguments.begin(), {"--schema", dataFile("test.mof"), "--registration", dataFile("test.reg"),
                                         "--library-path", PROVIDER_DIRECTORY});
}

/** Reads the output on the terminal until the program closes it. */
std::string shownOn(int terminal) {
    std::string text;
    char block[4096];
    for (;;) {
        const ssize_t count = read(terminal, block, sizeof block);
        if (count < 0 && errno == EINTR) {
            continue;
        }
        if (count <= 0) {
            text.erase(std::remove(text.begin(), text.end(), '\r'), text.end());
            return text;
        }
        text.append(block, static_cast<std::size_t>(count));
    }
}

}  // namespace

ProgramResult runOnTerminal(std::vector<std::string> arguments, unsigned short columns,
                            const Environment& environment) {
    const std::string program = testsupport::underTest(CIMHOST_PROGRAM);
    addTestClasses(arguments);
    arguments.insert(arguments.begin(), program);
    Environment all = environment;
    all.insert(all.end(), {"TERM=xterm", "NO_COLOR=", "COLUMNS="});  // the first of a name counts
    std::vector<std::string> variables = environmentWith(all);
    const std::vector<char*> wordPointers = pointersTo(arguments);
    const std::vector<char*> variablePointers = pointersTo(variables);
    const winsize size{24, columns, 0, 0};
    int terminal = -1;
    const pid_t child = forkpty(&terminal, nullptr, nullptr, &size);
    if (child == 0) {
        execve(program.c_str(), wordPointers.data(), variablePointers.data());
        _exit(126);
    }
    const std::string shown = shownOn(terminal);
    close(terminal);
    int status = 0;
    waitpid(child, &status, 0);
    return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, shown, ""};
}

ProgramResult run(std::vector<std::string> arguments) {
    addTestClasses(arguments);
    return runBare(arguments);
}

std::string dataFile(const std::string& name) {
    return std::string(DATA_DIRECTORY "/") + name;
}

}  // namespace cimhost::test
