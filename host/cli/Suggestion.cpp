#include "cli/Suggestion.h"

#include <algorithm>
#include <numeric>

#include "cim/Names.h"

namespace cimhost {
namespace {

/** The Levenshtein distance of two words. */
std::size_t distance(const std::string& one, const std::string& other) {
    std::vector<std::size_t> row(other.size() + 1);
    std::iota(row.begin(), row.end(), std::size_t{0});
    for (std::size_t i = 0; i < one.size(); ++i) {
        std::size_t diagonal = row[0];
        row[0] = i + 1;
        for (std::size_t j = 0; j < other.size(); ++j) {
            const std::size_t replaced = diagonal + (one[i] == other[j] ? 0U : 1U);
            diagonal = row[j + 1];
            row[j + 1] = std::min({replaced, row[j] + 1, row[j + 1] + 1});
        }
    }
    return row.back();
}

}  // namespace

std::string didYouMean(std::string_view word, const std::vector<std::string>& names) {
    std::string found;
    std::size_t least = std::max<std::size_t>(1, word.size() / 4) + 1;
    for (const std::string& name : names) {
        const std::size_t edits = distance(cim::foldedName(word), cim::foldedName(name));
        if (edits < least) {
            least = edits;
            found = name;
        }
    }
    return found.empty() ? "" : "; did you mean " + found + "?";
}

}  // namespace cimhost
