#pragma once

#include <string>

#include "GateFixture.h"
#include "model/Response.h"

// Short formats of responses, paths and data files for tables of expectations.

namespace gatetest {

/** Formats the class without prefix and the values of the keys: "Lease[A]". */
std::string formatted(const ObjectPath& path);

/**
 * Formats a client's response: the paths of the results, separated by spaces; "error 6" for an error of the provider,
 * "manager's error 6" if the object manager replaced the provider's success, "died" if its process would have crashed.
 */
std::string formatted(const cimhost::Response& response);

/** The agent's data files, for comparison with later contents. */
class DataFiles {
public:
    /** Reads the files. */
    DataFiles();

    /**
     * Describes the changes since construction: empty if there are none; for each changed record file "; Lease.dat: A
     * B(ACME)" with the identifiers and, if set, the first string of each record; only "; asset.dat" for asset data.
     */
    std::string changes() const;

private:
    std::vector<std::pair<std::string, std::string>> contents;
};

/** Writes record files with these identifiers and initial values. */
void writeRecords(const std::vector<std::string>& identifiers);

}  // namespace gatetest
