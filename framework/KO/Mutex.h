#pragma once

#include <memory>

#include "Export.h"

namespace KO {

/** A mutex for the threads of a process. Not recursive. */
class KO_EXPORT Mutex {
public:
    Mutex();
    ~Mutex();
    Mutex(const Mutex&) = delete;
    Mutex& operator=(const Mutex&) = delete;

    /**
     * Acquires the lock.
     * @param timeout maximum wait in milliseconds; 0xFFFFFFFF waits without limit
     * @throws FrameworkException on timeout, if this thread already holds the lock, or if the constructor was out of
     *         memory
     */
    void lock(unsigned long timeout);

    /** Releases the lock. Does nothing if the calling thread does not hold it. */
    void unlock();

private:
    struct Implementation;
    std::unique_ptr<Implementation> implementation;
};

}  // namespace KO
