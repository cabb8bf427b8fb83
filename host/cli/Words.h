#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace cimhost {

/** The words with the separator between them. */
inline std::string joined(const std::vector<std::string>& words, std::string_view separator) {
    std::string text;
    for (const std::string& word : words) {
        text += text.empty() ? "" : std::string(separator);
        text += word;
    }
    return text;
}

}  // namespace cimhost
