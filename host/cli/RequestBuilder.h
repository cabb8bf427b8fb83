#pragma once

#include <stdexcept>

#include "cli/Arguments.h"
#include "schema/Schema.h"

namespace cimhost {

/** Reports that the command line has values for a class that the schema does not contain. */
class UnknownClass : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/**
 * Builds the request of a command line. Values have the types that the schema declares.
 * @throws UsageError, ValueError, PathError if a path, a value or a property name is wrong
 * @throws UnknownClass if the types of the values are unknown
 */
Request buildRequest(const Arguments& arguments, const Schema& schema);

}  // namespace cimhost
