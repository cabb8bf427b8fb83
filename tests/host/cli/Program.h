#pragma once

#include <string>
#include <vector>

namespace cimhost::test {

/** The output and exit status of a run of the program. */
struct ProgramResult {
    int status = -1;  ///< exit status; -1 if a signal ended it
    std::string output{};
    std::string error{};
};

/** Environment variables, "NAME=VALUE". Other variables of cimhost are not set. */
using Environment = std::vector<std::string>;

/** Runs cimhost with these arguments only. @param outputFile receives standard output instead of ProgramResult::output
 */
ProgramResult runBare(const std::vector<std::string>& arguments, const Environment& environment = {},
                      const std::string& outputFile = "");

/** Runs cimhost on a terminal with this number of columns, which receives both streams. */
ProgramResult runOnTerminal(std::vector<std::string> arguments, unsigned short columns,
                            const Environment& environment = {});

/** Runs cimhost with the test classes and their provider. */
ProgramResult run(std::vector<std::string> arguments);

/** A file of the test's data. */
std::string dataFile(const std::string& name);

}  // namespace cimhost::test
