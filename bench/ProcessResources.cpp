#include "ProcessResources.h"

#include <malloc.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <iterator>

namespace bench {

namespace {

std::size_t residentBytes() {
    std::size_t pages = 0;
    std::ifstream statm("/proc/self/statm");
    statm >> pages >> pages;  // the second number counts the resident pages
    return pages * static_cast<std::size_t>(::sysconf(_SC_PAGESIZE));
}

std::size_t entriesOf(const char* directory) {
    const std::filesystem::directory_iterator entries(directory);
    return static_cast<std::size_t>(std::distance(begin(entries), end(entries)));
}

}  // namespace

ProcessResources processResources() {
    const struct mallinfo2 heap = ::mallinfo2();
    return {heap.uordblks + heap.hblkhd, heap.hblkhd, residentBytes(), entriesOf("/proc/self/fd"),
            entriesOf("/proc/self/task")};
}

}  // namespace bench
