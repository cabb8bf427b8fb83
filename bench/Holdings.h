#pragma once

#include <cstddef>

namespace bench {

/** What this process holds on to. */
struct Holdings {
    std::size_t heap = 0;         ///< bytes that were allocated and not freed
    std::size_t mapped = 0;       ///< those of them in large pieces, which have pages of their own
    std::size_t resident = 0;     ///< bytes of memory in use, to the page
    std::size_t descriptors = 0;  ///< open files
    std::size_t threads = 0;
};

Holdings holdings();

}  // namespace bench
