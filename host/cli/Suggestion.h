#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace cimhost {

/**
 * "; did you mean NAME?" with the name that is most similar to a misspelt word, ignoring letter case; an empty string
 * if none is similar.
 */
std::string didYouMean(std::string_view word, const std::vector<std::string>& names);

}  // namespace cimhost
