#pragma once

// toml++ is compiled once, in Toml.cpp, and without its exceptions: a broken file is an ordinary case.
#define TOML_HEADER_ONLY 0
#define TOML_EXCEPTIONS 0
#define TOML_ENABLE_FORMATTERS 0

#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wconversion"
#pragma GCC diagnostic ignored "-Wshadow"
#include <toml++/toml.h>
#pragma GCC diagnostic pop
