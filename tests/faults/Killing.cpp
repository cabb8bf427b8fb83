#include "Killing.h"

#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <csignal>
#include <cstdlib>
#include <stdexcept>

namespace faults {

namespace {

int linesIn(const std::string& content) {
    return static_cast<int>(std::count(content.begin(), content.end(), '\n'));
}

}  // namespace

FileState stateOf(const std::string& content, int linesOfRecord) {
    if (content.empty()) {
        return FileState::empty;
    }
    const int declared = std::atoi(content.c_str());
    const bool isComplete = content.back() == '\n' && linesIn(content) == 1 + declared * linesOfRecord;
    return isComplete ? FileState::complete : FileState::truncated;
}

int completeRecordsIn(const std::string& content, int linesOfRecord) {
    return std::max(0, linesIn(content) - 1) / linesOfRecord;
}

pid_t startProcess(const std::function<void()>& work) {
    const pid_t child = fork();
    if (child < 0) {
        throw std::runtime_error("no process can be started");
    }
    if (child == 0) {
        try {
            work();
        } catch (...) {
            _exit(1);
        }
        _exit(0);
    }
    return child;
}

bool waitForEnd(pid_t child) {
    int status = 0;
    if (waitpid(child, &status, 0) != child) {
        throw std::runtime_error("there is no such process");
    }
    if (WIFEXITED(status) && WEXITSTATUS(status) == 0) {
        return false;
    }
    if (!WIFSIGNALED(status) || WTERMSIG(status) != SIGKILL) {
        throw std::runtime_error("the process ended with status " + std::to_string(status));
    }
    return true;
}

bool isKilled(const std::function<void()>& work) {
    return waitForEnd(startProcess(work));
}

}  // namespace faults
