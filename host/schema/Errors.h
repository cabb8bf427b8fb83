#pragma once

#include <stdexcept>

namespace cimhost {

/** A file is missing, cannot be read or has an error. The message names the line and column only if they are known. */
class LoadError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/** A value is malformed or does not have the required type. */
class ValueError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/** A string is not an object path, or the path does not match its class. */
class PathError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

}  // namespace cimhost
