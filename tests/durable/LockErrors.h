#pragma once

namespace durable {

/** During the lifetime of this object, the next attempts to lock a file fail. */
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
