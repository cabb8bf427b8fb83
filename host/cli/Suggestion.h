#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace cimhost {

/**
 * Returns "; did you mean NAME?" with the name that is most similar to a misspelt word, ignoring letter case. Returns
 * an empty string if no name is similar.
 */
std::string didYouMean(std::string_view word, const std::vector<std::string>& names);

}  // namespace cimhost
