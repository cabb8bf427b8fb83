#pragma once

#include <sys/mman.h>

#include <stdexcept>

namespace gatetest {

/** Returns zero-initialized memory that this process shares with its children. It is never freed. */
template <class Content>
Content& sharedMemory() {
    void* memory = mmap(nullptr, sizeof(Content), PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS, -1, 0);
    if (memory == MAP_FAILED) {
        throw std::runtime_error("no shared memory");
    }
    return *static_cast<Content*>(memory);
}

}  // namespace gatetest
