#pragma once

#include <cstddef>
#include <optional>
#include <string_view>

namespace Agent {

/** Brackets within brackets, and dots in a key, that the configuration may have. */
constexpr int deepestNesting = 16;

/**
 * Finds the first line of a TOML document in which brackets or the parts of a key are nested deeper than that. The
 * TOML parser recurses for each level, and would overflow the stack.
 */
std::optional<std::size_t> lineNestedTooDeep(std::string_view document);

}  // namespace Agent
