#pragma once

#include <stdexcept>

namespace cimhost {

/** A provider that cannot be had: its library is missing or cannot be loaded, or its factory is missing or fails. */
class LibraryError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/** A library that is nowhere where it was looked for. */
class LibraryNotFound : public LibraryError {
public:
    using LibraryError::LibraryError;
};

}  // namespace cimhost
