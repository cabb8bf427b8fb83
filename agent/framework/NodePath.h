#pragma once

#include <string>

namespace KO {

/**
 * Encodes a node path: every byte except letters, digits and . / : - becomes %NN, with the byte in upper-case
 * hexadecimal digits.
 */
std::string pathToText(const std::string& path);

/** Decodes a path. Returns strings that are not the encoding of any path unchanged. */
std::string textToPath(const std::string& text);

}  // namespace KO
