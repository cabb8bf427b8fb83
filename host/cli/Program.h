#pragma once

#include "cli/Arguments.h"
#include "cli/Commands.h"

namespace cimhost {

/** Runs a program of cimhost's commands. @return its exit status */
int runProgram(int count, const char* const* values, const CommandLineExtension& commandLine,
               CommandExtension& commands);

}  // namespace cimhost
