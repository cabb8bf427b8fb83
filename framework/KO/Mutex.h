#pragma once

#include "Export.h"

#include <memory>

namespace KO {

/** A lock between the threads of a process. Not recursive. */
class KO_EXPORT Mutex {
public:
    Mutex();
    ~Mutex();
    Mutex(const Mutex&) = delete;
    Mutex& operator=(const Mutex&) = delete;

    /**
     * Waits for the lock and takes it.
     * @param timeout milliseconds to wait at most; 0xFFFFFFFF waits without limit
     * @throws FrameworkException when the time is over, when this thread has the lock already, or when memory was
     *         lacking as the mutex was made
     */
    void lock(unsigned long timeout);

    /** Gives the lock back. Only the thread that holds it may; for any other nothing happens. */
    void unlock();

private:
    struct Implementation;
    std::unique_ptr<Implementation> implementation;
};

}  // namespace KO
