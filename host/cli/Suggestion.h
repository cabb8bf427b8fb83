#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace cimhost {

/** The name that a misspelt word was perhaps meant to be, letter case aside; empty when none is near. */
std::string nearest(std::string_view word, const std::vector<std::string>& names);

/** "; did you mean NAME?", or nothing when no name is near. */
std::string didYouMean(std::string_view word, const std::vector<std::string>& names);

}  // namespace cimhost
