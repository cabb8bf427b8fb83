#pragma once

#include <cstddef>
#include <cstdlib>
#include <memory>
#include <mutex>
#include <unordered_map>

namespace cimhost {

/** Memory that providers allocate through the broker. The destructor frees the remaining blocks. Thread-safe. */
class MemoryBlocks {
public:
    /** Allocates zeroed memory, at least one byte; null if out of memory. */
    void* allocate(std::size_t count, std::size_t size);

    /** Like realloc. Returns null and changes nothing if the pointer is not a block, or if out of memory. */
    void* resize(void* block, std::size_t size);

    /** Frees a block; ignores other pointers. */
    void free(void* block);

private:
    struct Free {
        void operator()(void* block) const { std::free(block); }
    };

    std::mutex mutex;
    std::unordered_map<void*, std::unique_ptr<void, Free>> blocks;
};

}  // namespace cimhost
