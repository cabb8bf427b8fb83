#pragma once

#include <stdexcept>

#include "cli/Arguments.h"
#include "schema/Schema.h"

namespace cimhost {

/** Values are given for a class that the schema does not have. */
class UnknownClass : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/**
 * The request that the command line asks for, with all values typed by the schema.
 * UsageError, ValueError or PathError when a path or a value is wrong or NAME is no property; UnknownClass when
 * values are given for a class that the schema does not have.
 */
Request buildRequest(const Arguments& arguments, const Schema& schema);

}  // namespace cimhost
