#pragma once

#include <cstddef>

namespace bench {

/** Resources that this process uses. */
struct ProcessResources {
    std::size_t heap = 0;         ///< allocated bytes
    std::size_t mapped = 0;       ///< the part of the heap in blocks that are mapped separately
    std::size_t resident = 0;     ///< bytes of the resident pages
    std::size_t descriptors = 0;  ///< open files
    std::size_t threads = 0;
};

ProcessResources processResources();

}  // namespace bench
