#pragma once

#include <sys/stat.h>

namespace testsupport {

/** Sets the process's umask while it exists. */
class Umask {
public:
    explicit Umask(mode_t mask) : before(umask(mask)) {}
    ~Umask() { umask(before); }
    Umask(const Umask&) = delete;
    Umask& operator=(const Umask&) = delete;

private:
    mode_t before;
};

}  // namespace testsupport
