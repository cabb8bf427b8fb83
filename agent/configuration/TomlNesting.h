#pragma once

#include <cstddef>
#include <optional>
#include <string_view>

namespace Agent {

/** Maximum depth of nested brackets, and maximum number of dots in a key. */
constexpr int deepestNesting = 16;

/**
 * Returns the first line of a TOML document in which brackets or the parts of a key are nested deeper. The TOML
 * parser recurses for each level and would overflow the stack.
 */
std::optional<std::size_t> lineNestedTooDeep(std::string_view document);

}  // namespace Agent
