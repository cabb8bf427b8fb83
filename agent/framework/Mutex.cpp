#include "KO/Mutex.h"

#include <pthread.h>

#include <cerrno>
#include <ctime>
#include <new>

#include "KO/Exceptions.h"
#include "configuration/FileContent.h"

namespace KO {

namespace {

constexpr unsigned long withoutLimit = 0xFFFFFFFF;

timespec afterMilliseconds(unsigned long milliseconds) {
    constexpr long nanosecondsOfSecond = 1000000000;
    timespec time{};
    ::clock_gettime(CLOCK_MONOTONIC, &time);
    time.tv_sec += static_cast<time_t>(milliseconds / 1000);
    time.tv_nsec += static_cast<long>(milliseconds % 1000) * 1000000;
    if (time.tv_nsec >= nanosecondsOfSecond) {
        time.tv_nsec -= nanosecondsOfSecond;
        ++time.tv_sec;
    }
    return time;
}

}  // namespace

/** An error-checking mutex: a second lock by the same thread fails instead of deadlocking. */
struct Mutex::Implementation {
    pthread_mutex_t mutex{};

    Implementation() {
        pthread_mutexattr_t attributes;
        ::pthread_mutexattr_init(&attributes);
        ::pthread_mutexattr_settype(&attributes, PTHREAD_MUTEX_ERRORCHECK);
        ::pthread_mutex_init(&mutex, &attributes);
        ::pthread_mutexattr_destroy(&attributes);
    }
    ~Implementation() { ::pthread_mutex_destroy(&mutex); }
    Implementation(const Implementation&) = delete;
    Implementation& operator=(const Implementation&) = delete;
};

// Mutexes are static objects. When out of memory, a library with a mutex can still be loaded, but lock() fails.
Mutex::Mutex() : implementation(new (std::nothrow) Implementation) {}
Mutex::~Mutex() = default;

void Mutex::lock(unsigned long timeout) {
    int error = 0;
    if (implementation == nullptr) {
        error = ENOMEM;
    } else if (timeout >= withoutLimit) {
        error = ::pthread_mutex_lock(&implementation->mutex);
    } else {
        const timespec end = afterMilliseconds(timeout);
        error = ::pthread_mutex_clocklock(&implementation->mutex, CLOCK_MONOTONIC, &end);
    }
    if (error != 0) {
        throw FrameworkException(("Mutex cannot be locked: " + Agent::errorText(error)).c_str());
    }
}

void Mutex::unlock() {
    if (implementation != nullptr) {
        ::pthread_mutex_unlock(&implementation->mutex);
    }
}

}  // namespace KO
