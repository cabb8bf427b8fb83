#pragma once

#include <cstddef>
#include <cstdlib>
#include <memory>
#include <mutex>
#include <unordered_map>

namespace cimhost {

/** Memory that providers ask the broker for. Blocks nobody frees are freed with it. Safe to use from several threads.
 */
class MemoryBlocks {
public:
    /** Zeroed memory, at least one byte; null when there is none. */
    void* allocate(std::size_t count, std::size_t size);

    /** Like realloc; null, and nothing changed, for a pointer that is no block or when there is no memory. */
    void* resize(void* block, std::size_t size);

    /** Frees a block; any other pointer is left alone. */
    void free(void* block);

private:
    struct Free {
        void operator()(void* block) const { std::free(block); }
    };

    std::mutex mutex;
    std::unordered_map<void*, std::unique_ptr<void, Free>> blocks;
};

}  // namespace cimhost
