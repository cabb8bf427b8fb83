// A process that uses the agent's libraries with the configuration of its environment and prints their results. The
// first argument is the action.

#include <pthread.h>
#include <sys/resource.h>

#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <iostream>
#include <string>
#include <thread>
#include <vector>

#include "KO/Instrumentation.h"
#include "KO/PlatformUtilities.h"
#include "KO/Product.h"
#include "KO/Strings.h"
#include "RZLog/RZLogger.h"

namespace {

/** probe log LEVEL LOGGER TEXT: logs one record on each channel. */
void log(int level, const std::string& logger, const std::string& text) {
    errno = ENOTTY;
    RZLog::RZLogger::logLevelMessage("getLessor", "Lease.cpp", 42, logger, level, nullptr, 0, 0, text);
    RZLog::RZLogger::traceLevelMessage(nullptr, nullptr, -1, logger, level, nullptr, 0, 0, text);
    if (errno != ENOTTY) {
        std::cout << "errno changed" << std::endl;
    }
}

/** probe admits LEVEL LOGGER: prints whether the log admits such a record, before and after writing one. */
void printWhetherAdmitted(int level, const std::string& logger) {
    const auto say = [&] { std::cout << (RZLog::RZLogger::admits(logger, level) ? "yes" : "no") << std::endl; };
    say();
    log(level, logger, "some text");
    say();
}

/** probe many THREADS RECORDS: numbered records from concurrent threads. */
void logMany(int threadCount, int recordCount) {
    std::vector<std::thread> threads;
    threads.reserve(static_cast<std::size_t>(threadCount));
    for (int number = 0; number < threadCount; ++number) {
        threads.emplace_back([number, recordCount] {
            for (int record = 0; record < recordCount; ++record) {
                const std::string text = "thread " + std::to_string(number) + " record " + std::to_string(record);
                RZLog::RZLogger::logLevelMessage("work", "work.cpp", 1, "Ostrel.Test", 3000, nullptr, 0, 0, text);
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
}

/** probe show: prints the framework's values of the agent and of the managed system. */
void show() {
    std::cout << KO::PlatformUtilities::getKelsaDirectory() << '\n'
              << KO::PlatformUtilities::getKelsaDataDir() << '\n'
              << KO::make_string(KO::Product::getName()) << '\n';
    KO::Instrumentation node;
    for (const auto type : {KO::NodeLexicon::NT_SYSTEM, KO::NodeLexicon::NT_COMPUTER}) {
        for (node.selectNode(type); node; ++node) {
            std::string name = "(none)";
            std::string product = "(none)";
            node.getProperty(KO::NodeLexicon::PROPERTY_NAME, name);
            node.getProperty(KO::NodeLexicon::PROPERTY_PRODUCT_NAME, product);
            std::cout << node.getPathToNode() << ' ' << (name.empty() ? "(empty)" : name) << ' ' << product << '\n';
        }
    }
}

/** probe limited: logs while files are limited to a few bytes, and again without the limit. */
void logToAFullDisk() {
    std::signal(SIGXFSZ, SIG_IGN);
    rlimit limit{};
    ::getrlimit(RLIMIT_FSIZE, &limit);
    const rlim_t before = limit.rlim_cur;
    limit.rlim_cur = 20;
    ::setrlimit(RLIMIT_FSIZE, &limit);
    log(3000, "Ostrel.Test", "lost");
    log(3000, "Ostrel.Test", "lost as well");
    limit.rlim_cur = before;
    ::setrlimit(RLIMIT_FSIZE, &limit);
}

/** probe cancelled: logs from a thread that has been cancelled. */
void logCancelled() {
    std::thread thread([] {
        ::pthread_cancel(::pthread_self());
        log(3000, "Ostrel.Test", "cancelled");
        ::pthread_testcancel();
        std::cout << "not cancelled" << std::endl;
    });
    thread.join();
}

/** Logs when the process's static objects are destroyed, those of the libraries included. */
struct LogAtExit {
    bool enabled = false;
    ~LogAtExit() {
        if (enabled) {
            log(3000, "Ostrel.Test", "at exit");
            std::cout << KO::PlatformUtilities::getKelsaDataDir() << std::endl;
        }
    }
} logAtExit;

}  // namespace

int main(int count, char** arguments) {
    const std::vector<std::string> words(arguments + 1, arguments + count);
    if (words.size() == 4 && words[0] == "log") {
        log(std::stoi(words[1]), words[2], words[3]);
    } else if (words.size() == 3 && words[0] == "admits") {
        printWhetherAdmitted(std::stoi(words[1]), words[2]);
    } else if (words.size() == 3 && words[0] == "many") {
        logMany(std::stoi(words[1]), std::stoi(words[2]));
    } else if (words.size() == 1 && words[0] == "show") {
        show();
    } else if (words.size() == 1 && words[0] == "limited") {
        logToAFullDisk();
    } else if (words.size() == 1 && words[0] == "cancelled") {
        logCancelled();
    } else if (words.size() == 1 && words[0] == "crash") {
        log(3000, "Ostrel.Test", "the last words");
        std::_Exit(0);
    } else if (words.size() == 1 && words[0] == "exit") {
        logAtExit.enabled = true;
    } else {
        return 2;
    }
    return 0;
}
