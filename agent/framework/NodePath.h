#pragma once

#include <string>

namespace KO {

/**
 * The printable form of a node path: every byte but letters, digits and . / : - becomes %NN, with
 * the byte in upper-case hexadecimal digits.
 */
std::string pathToText(const std::string& path);

/** The path of a printable form. A text that pathToText does not give for any path is given back. */
std::string textToPath(const std::string& text);

}  // namespace KO
