#include <pthread.h>

#include <cerrno>
#include <cstring>
#include <ctime>
#include <memory>
#include <new>
#include <string>
#include <type_traits>

#include "broker/FunctionTables.h"

// CMPIBrokerExtFT: POSIX threads, mutexes and conditions.

namespace cimhost {
namespace {

static_assert(std::is_same_v<pthread_once_t, int>, "a once-object is an int");
static_assert(sizeof(pthread_t) <= sizeof(void*), "a thread handle carries a pthread_t");

void* handleOf(pthread_t thread) {
    return reinterpret_cast<void*>(thread);
}

pthread_t threadOf(void* handle) {
    return reinterpret_cast<pthread_t>(handle);
}

/** @return "lib<name>.so", to be freed with free(); null if the name is null, or if out of memory */
char* resolveFileName(const char* name) {
    if (name == nullptr) {
        return nullptr;
    }
    try {
        return strdup(("lib" + std::string(name) + ".so").c_str());
    } catch (const std::bad_alloc&) {
        return nullptr;
    }
}

void* newThread(void* (*start)(void*), void* parameter, int detached) {
    if (start == nullptr) {
        return nullptr;
    }
    pthread_t thread{};
    pthread_attr_t attributes;
    pthread_attr_init(&attributes);
    pthread_attr_setdetachstate(&attributes, detached != 0 ? PTHREAD_CREATE_DETACHED : PTHREAD_CREATE_JOINABLE);
    const int error = pthread_create(&thread, &attributes, start, parameter);
    pthread_attr_destroy(&attributes);
    return error == 0 ? handleOf(thread) : nullptr;
}

int joinThread(void* thread, void** result) {
    return thread == nullptr ? ESRCH : pthread_join(threadOf(thread), result);
}

int exitThread(void* result) {
    pthread_exit(result);
}

int cancelThread(void* thread) {
    return thread == nullptr ? ESRCH : pthread_cancel(threadOf(thread));
}

int threadSleep(CMPIUint32 milliseconds) {
    timespec left{static_cast<std::time_t>(milliseconds / 1000), static_cast<long>(milliseconds % 1000) * 1'000'000};
    int error = EINTR;
    while (error == EINTR) {
        error = clock_nanosleep(CLOCK_MONOTONIC, 0, &left, &left);
    }
    return error;
}

int threadOnce(int* once, void (*function)()) {
    return once == nullptr || function == nullptr ? EINVAL : pthread_once(once, function);
}

int createThreadKey(unsigned long* key, void (*cleanup)(void*)) {
    if (key == nullptr) {
        return EINVAL;
    }
    pthread_key_t created{};
    const int error = pthread_key_create(&created, cleanup);
    if (error == 0) {
        *key = created;
    }
    return error;
}

int destroyThreadKey(unsigned long key) {
    return pthread_key_delete(static_cast<pthread_key_t>(key));
}

void* getThreadSpecific(unsigned long key) {
    return pthread_getspecific(static_cast<pthread_key_t>(key));
}

int setThreadSpecific(unsigned long key, void* value) {
    return pthread_setspecific(static_cast<pthread_key_t>(key), value);
}

void* newMutex(int) {
    auto mutex = std::unique_ptr<pthread_mutex_t>(new (std::nothrow) pthread_mutex_t);
    pthread_mutexattr_t attributes;
    if (!mutex || pthread_mutexattr_init(&attributes) != 0) {
        return nullptr;
    }
    pthread_mutexattr_settype(&attributes, PTHREAD_MUTEX_RECURSIVE);
    const int error = pthread_mutex_init(mutex.get(), &attributes);
    pthread_mutexattr_destroy(&attributes);
    return error == 0 ? mutex.release() : nullptr;
}

void destroyMutex(void* mutex) {
    if (mutex != nullptr && pthread_mutex_destroy(static_cast<pthread_mutex_t*>(mutex)) == 0) {
        delete static_cast<pthread_mutex_t*>(mutex);
    }
}

void lockMutex(void* mutex) {
    if (mutex != nullptr) {
        pthread_mutex_lock(static_cast<pthread_mutex_t*>(mutex));
    }
}

void unlockMutex(void* mutex) {
    if (mutex != nullptr) {
        pthread_mutex_unlock(static_cast<pthread_mutex_t*>(mutex));
    }
}

void* newCondition(int) {
    auto condition = std::unique_ptr<pthread_cond_t>(new (std::nothrow) pthread_cond_t);
    return condition && pthread_cond_init(condition.get(), nullptr) == 0 ? condition.release() : nullptr;
}

void destroyCondition(void* condition) {
    if (condition != nullptr && pthread_cond_destroy(static_cast<pthread_cond_t*>(condition)) == 0) {
        delete static_cast<pthread_cond_t*>(condition);
    }
}

int condWait(void* condition, void* mutex) {
    if (condition == nullptr || mutex == nullptr) {
        return EINVAL;
    }
    return pthread_cond_wait(static_cast<pthread_cond_t*>(condition), static_cast<pthread_mutex_t*>(mutex));
}

/** @param until point in time, as for pthread_cond_timedwait */
int timedCondWait(void* condition, void* mutex, timespec* until) {
    if (condition == nullptr || mutex == nullptr || until == nullptr) {
        return EINVAL;
    }
    return pthread_cond_timedwait(static_cast<pthread_cond_t*>(condition), static_cast<pthread_mutex_t*>(mutex), until);
}

int signalCondition(void* condition) {
    return condition == nullptr ? EINVAL : pthread_cond_signal(static_cast<pthread_cond_t*>(condition));
}

}  // namespace

const CMPIBrokerExtFT threadTable{
    tableVersion, resolveFileName, newThread,       joinThread,       exitThread,        cancelThread,
    threadSleep,  threadOnce,      createThreadKey, destroyThreadKey, getThreadSpecific, setThreadSpecific,
    newMutex,     destroyMutex,    lockMutex,       unlockMutex,      newCondition,      destroyCondition,
    condWait,     timedCondWait,   signalCondition};

}  // namespace cimhost
