#pragma once

#include <string_view>

namespace KO {

/** Whether two texts are equal but for the case of the letters A to Z, whatever the process's locale. */
inline bool equalIgnoringCase(std::string_view one, std::string_view other) {
    const auto lower = [](char byte) {
        return byte >= 'A' && byte <= 'Z' ? static_cast<char>(byte + ('a' - 'A')) : byte;
    };
    if (one.size() != other.size()) {
        return false;
    }
    for (std::size_t index = 0; index < one.size(); ++index) {
        if (lower(one[index]) != lower(other[index])) {
            return false;
        }
    }
    return true;
}

}  // namespace KO
