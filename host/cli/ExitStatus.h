#pragma once

#include <stdexcept>

namespace cimhost {

/** Exit statuses of the program. */
enum ExitStatus {
    exitSuccess = 0,
    exitCimError = 1,  ///< the request failed
    exitUsage = 2,     ///< the command line is wrong
    exitLoad = 3,      ///< a library, a registration or a schema cannot be loaded
    exitOutput = 4     ///< the output could not be written
};

/** A wrong command line. The message says what to write instead. */
class UsageError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

}  // namespace cimhost
