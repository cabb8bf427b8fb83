#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace cimhost {

/** The name that is most similar to a misspelt word, ignoring letter case; empty if none is similar. */
std::string nearest(std::string_view word, const std::vector<std::string>& names);

/** "; did you mean NAME?", or an empty string if no name is similar. */
std::string didYouMean(std::string_view word, const std::vector<std::string>& names);

}  // namespace cimhost
