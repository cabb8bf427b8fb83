#pragma once

#include <stdexcept>
#include <string>

namespace cimhost {

/** A file that cannot be read or that says something wrong; the text begins with its name, line and column. */
class LoadError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/** A value that its type cannot take; the text says which value, which type and what would do. */
class ValueError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/** A text that is no object path, or a path that its class does not allow. */
class PathError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

}  // namespace cimhost
