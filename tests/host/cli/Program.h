#pragma once

#include <string>
#include <vector>

namespace cimhost::test {

/** What a run of the program said, and how it ended. */
struct Ended {
    int status = -1;  ///< exit status; -1 when a signal ended it
    std::string output{};
    std::string error{};
};

/** Variables of the program's environment, "NAME=VALUE"; those of cimhost are otherwise not set. */
using Environment = std::vector<std::string>;

/** Runs cimhost with these arguments only. @param outputFile takes standard output instead of Ended::output */
Ended runBare(const std::vector<std::string>& arguments, const Environment& environment = {},
              const std::string& outputFile = "");

/** The same on a terminal of that many columns, which takes both streams; lines end with a line feed alone. */
Ended runOnTerminal(std::vector<std::string> arguments, unsigned short columns, const Environment& environment = {});

/** Runs cimhost with the test classes and their provider. */
Ended run(std::vector<std::string> arguments);

/** A file of the test's data. */
std::string dataFile(const std::string& name);

}  // namespace cimhost::test
