#pragma once

#include "cli/Arguments.h"
#include "cli/Commands.h"

namespace cimhost {

/** Runs cimhost with these additions. @return the exit status */
int runProgram(int count, const char* const* values, const CommandLineExtension& commandLine,
               CommandExtension& commands);

}  // namespace cimhost
