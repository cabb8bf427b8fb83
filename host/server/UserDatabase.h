#pragma once

#include <cerrno>
#include <cstddef>
#include <vector>

namespace cimhost::server {

/**
 * Reads an entry of the user database with a function such as getgrgid_r(). Enlarges the buffer for an entry that does
 * not fit, since a group can have any number of members.
 * @param read is called with the buffer and its size, and returns an error number
 * @return false if reading fails
 */
template <class Read>
bool readEntry(std::vector<char>& buffer, Read read) {
    constexpr std::size_t firstSize = std::size_t{16} << 10U;
    constexpr std::size_t largestSize = std::size_t{64} << 20U;
    int error = ERANGE;
    for (std::size_t size = firstSize; error == ERANGE && size <= largestSize; size *= 2) {
        if (buffer.size() < size) {
            buffer.resize(size);
        }
        error = read(buffer.data(), buffer.size());
    }
    return error == 0;
}

}  // namespace cimhost::server
