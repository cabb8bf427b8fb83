#pragma once

#include "cli/Arguments.h"

namespace CLI {
class App;
}

namespace cimhost {

/** Adds the command load, whose options go into the arguments. */
void addLoadCommand(CLI::App& app, Arguments& arguments);

}  // namespace cimhost
