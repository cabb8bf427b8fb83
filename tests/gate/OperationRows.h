#pragma once

#include <string>
#include <vector>

#include "GateFixture.h"
#include "lab/emulation/ManagerEmulation.h"
#include "model/Request.h"

// Every operation of every class: requests, and what is answered to them.

namespace gatetest {

/** What the provider's own answer to a request becomes under each object manager. */
struct Bare {
    std::string standard;
    std::string sfcb;
    std::string pegasus;
    std::string emptyKey;  ///< under the manager whose new instances have an empty key in their path

    const std::string& under(cimhost::lab::Manager manager) const;
};

/**
 * A request, and what is answered to it where the records firstPlace, "L" and secondPlace are there, leases as well as
 * warranties. Answers are texts as in Shown.h, with the changes of the data files.
 */
struct Row {
    std::string name;
    cimhost::Request request;
    std::string gate;  ///< whatever the object manager
    Bare bare;
};

/** Identifiers of the records that the rows expect. */
std::vector<std::string> recordsOfRows();

/** All rows. */
std::vector<Row> operationRows();

}  // namespace gatetest
