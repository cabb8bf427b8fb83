#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "cli/Commands.h"
#include "lab/emulation/ManagerEmulation.h"

namespace cimhost::lab {

/** Arguments of the command load. */
struct LoadArguments {
    bool isGiven = false;  ///< whether the command line has this command
    std::vector<std::string> classes{};
    unsigned clients = 8;
    std::size_t requests = 10'000;
    std::uint64_t seed = 1;
    std::string mix{};     ///< empty: the usual mix
    std::string source{};  ///< object path; empty: none
    std::optional<std::string> associationClass{};
    bool fills = false;
    bool keeps = false;
    bool isTrusting = false;
    std::string shown{};  ///< a number or "all"; empty: depends on the output format
};

/** Adds the command load, whose options are stored in the arguments. */
void addLoadCommand(CLI::App& app, LoadArguments& load);

/**
 * Runs a load and reports it. Wrong responses are the failure of the result.
 * @throws UsageError, PathError if the load is not possible
 */
CommandResult runLoadCommand(ObjectManager& manager, Manager emulated, const LoadArguments& load,
                             const Arguments& arguments, const Schema& schema);

}  // namespace cimhost::lab
