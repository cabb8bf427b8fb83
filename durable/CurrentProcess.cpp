#include "CurrentProcess.h"

#include <pthread.h>
#include <unistd.h>

#include <atomic>

namespace durable {
namespace {

std::atomic<pid_t> known{0};

}  // namespace

pid_t currentProcess() noexcept {
    // The C library removes the handler when this library is unloaded.
    static const bool knowsForks = pthread_atfork(nullptr, nullptr, [] { known = getpid(); }) == 0;
    if (known == 0 || !knowsForks) {
        known = getpid();
    }
    return known;
}

}  // namespace durable
