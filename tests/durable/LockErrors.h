#pragma once

namespace durable {

/** Lets the next attempts to lock a file fail during its lifetime. */
struct LockErrors {
    static inline int error = 0;
    static inline int count = 0;

    LockErrors(int itsError, int itsCount) {
        error = itsError;
        count = itsCount;
    }
    ~LockErrors() { count = 0; }
    LockErrors(const LockErrors&) = delete;
    LockErrors& operator=(const LockErrors&) = delete;
};

}  // namespace durable
