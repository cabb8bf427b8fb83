#pragma once

#include <string>

#include "GateFixture.h"
#include "model/Response.h"

// Answers, paths and data files in few words, for tables of what is expected.

namespace gatetest {

/** The class and the values of the keys, "Lease[A]"; classes without their prefix. */
std::string shown(const ObjectPath& path);

/**
 * What a client gets: the paths of what was answered, blanks between them; "error 6" where the provider answered it,
 * "manager's error 6" where the object manager made it of a success, "died" where its process would have ended.
 */
std::string shown(const cimhost::Response& response);

/** The data files of the agent as the provider writes them, to be compared with what they are later. */
class DataFiles {
public:
    /** Reads them. */
    DataFiles();

    /**
     * What has become of them: nothing, or for each that has changed a note "; Lease.dat: A B(ACME)" with identifiers
     * and, if there is one, the text behind each. "; asset.dat" says no more.
     */
    std::string changes() const;

private:
    std::vector<std::pair<std::string, std::string>> contents;
};

/** Writes record files with these identifiers, all else as new. */
void writeRecords(const std::vector<std::string>& identifiers);

}  // namespace gatetest
