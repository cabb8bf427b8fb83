#pragma once

#include <string>
#include <vector>

#include "operations/Request.h"

// What a provider's raw answer means to who asked.

namespace cimhost {

/**
 * Why the provider process of the object manager that asked would have ended, as a sentence; empty when it lives on.
 * This host reports it instead.
 */
std::string fatality(const RawAnswer& answer, Operation operation);

/** The status of an operation: OK, or the code that the provider answered, always with a text. */
Status statusOf(const RawAnswer& answer, Operation operation);

/** The status of an operation that several providers were asked for; see ObjectManager. */
Status statusOf(const std::vector<RawAnswer>& answers, Operation operation);

/** The same, unless no provider could be asked: then the status says why. */
Status statusOf(const Answer<std::vector<RawAnswer>>& answers, Operation operation);

/**
 * All results of one kind, in order; CMPI_RC_ERR_FAILED when a provider that succeeds returns another kind.
 * @tparam Kind Instance or ObjectPath
 */
template <class Kind>
Answer<std::vector<Kind>> resultsOf(const Answer<std::vector<RawAnswer>>& answers, Operation operation);

/** The first instance; CMPI_RC_ERR_NOT_FOUND when the provider succeeds without any. */
Answer<Instance> oneInstance(const Answer<std::vector<RawAnswer>>& answers, const ObjectPath& path);

/** The path of what was created: returned as such or in an instance; CMPI_RC_ERR_FAILED when nothing was returned. */
Answer<ObjectPath> createdPath(const Answer<std::vector<RawAnswer>>& answers);

}  // namespace cimhost
