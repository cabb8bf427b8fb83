#pragma once

#include <stdexcept>

namespace cimhost {

/** A file cannot be read or has an error. The message begins with the file's name, line and column. */
class LoadError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/** A value does not have the required type. The message contains the value, the type, and the valid values. */
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
