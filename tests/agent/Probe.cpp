#include "agent/Probe.h"

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstring>
#include <utility>

#include "support/TemporaryDirectory.h"

namespace agent_test {

namespace {

/** Returns this process's environment with one variable set or removed. */
std::vector<std::string> environmentWith(const std::string& configuration) {
    std::vector<std::string> variables;
    for (char** variable = environ; *variable != nullptr; ++variable) {
        if (std::strncmp(*variable, "OSTREL_CONFIG=", 14) != 0) {
            variables.emplace_back(*variable);
        }
    }
    if (!configuration.empty()) {
        variables.push_back("OSTREL_CONFIG=" + configuration);
    }
    return variables;
}

std::vector<char*> pointersTo(std::vector<std::string>& strings) {
    std::vector<char*> pointers;
    for (std::string& text : strings) {
        pointers.push_back(text.data());
    }
    pointers.push_back(nullptr);
    return pointers;
}

}  // namespace

ProbeResult runProbe(const std::string& configuration, std::vector<std::string> arguments) {
    return runProgram(AGENT_PROBE, configuration, std::move(arguments));
}

ProbeResult runProgram(const std::string& program, const std::string& configuration,
                       std::vector<std::string> arguments) {
    const testsupport::TemporaryDirectory directory;
    arguments.insert(arguments.begin(), program);
    std::vector<std::string> variables = environmentWith(configuration);
    posix_spawn_file_actions_t actions;
    ::posix_spawn_file_actions_init(&actions);
    const int flags = O_WRONLY | O_CREAT | O_APPEND;
    ::posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, directory.file("output").c_str(), flags, 0600);
    ::posix_spawn_file_actions_addopen(&actions, STDERR_FILENO, directory.file("errors").c_str(), flags, 0600);
    pid_t child = 0;
    const int error = ::posix_spawn(&child, program.c_str(), &actions, nullptr, pointersTo(arguments).data(),
                                    pointersTo(variables).data());
    ::posix_spawn_file_actions_destroy(&actions);
    EXPECT_EQ(error, 0);
    int status = 0;
    EXPECT_EQ(::waitpid(child, &status, 0), child);
    return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, directory.read("output"), directory.read("errors")};
}

}  // namespace agent_test
