#pragma once

#include <string>
#include <vector>

#include "GateFixture.h"
#include "lab/emulation/ManagerEmulation.h"
#include "model/Request.h"

// Requests for every operation of every class, with their expected responses.

namespace gatetest {

/** The response of the bare provider that a client receives, per object manager. */
struct BareResponse {
    std::string standard;
    std::string sfcb;
    std::string pegasus;
    std::string emptyKey;  ///< for the manager that passes new instances with an empty key in their path

    const std::string& under(cimhost::lab::Manager manager) const;
};

/**
 * A request and its expected responses. The records firstNode, "L" and secondNode exist, as leases and as warranties.
 * Responses have the format of Formatting.h, with the changes to the data files.
 */
struct Row {
    std::string name;
    cimhost::Request request;
    std::string gate;  ///< under every object manager
    BareResponse bare;
};

/** Returns the identifiers of the records that the rows require. */
std::vector<std::string> recordsOfRows();

/** Returns all rows. */
std::vector<Row> operationRows();

}  // namespace gatetest
