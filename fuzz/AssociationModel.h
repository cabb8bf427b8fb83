#pragma once

#include <cstddef>

#include "GateModel.h"

// A model of the associations: the agent's computer has the lease and the warranty with the path of its node.

namespace fuzz {

/** A request for the associations of the computer, its lease or its warranty, with any filter. */
Call nextTraversal(Bytes& bytes);

/**
 * Checks the response to an association operation, or to an enumeration of associations.
 * @param computers the kind of response to enumerations of computers; see SystemUnderTest
 * @throws Violation
 */
void requireAssociations(const Call& call, const cimhost::ProviderResponse& response, const Snapshot& stored,
                         std::size_t computers);

}  // namespace fuzz
