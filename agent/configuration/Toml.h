#pragma once

// toml++ is compiled once, in Toml.cpp, and with its exceptions: without them, lack of memory ends the process.
#define TOML_HEADER_ONLY 0
#define TOML_EXCEPTIONS 1
#define TOML_ENABLE_FORMATTERS 0
// Values in values: the parser goes as deep, and so does the destruction of what it has made.
#define TOML_MAX_NESTED_VALUES 16

#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wconversion"
#pragma GCC diagnostic ignored "-Wshadow"
#include <toml++/toml.h>
#pragma GCC diagnostic pop
