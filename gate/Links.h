#pragma once

#include "Provider.h"
#include "Request.h"

#include <vector>

namespace gate {

/** An association of a computer. */
struct Link {
    const CMPIObjectPath* computerPath;
    const CMPIInstance* computer;
    const CMPIObjectPath* element;  ///< what belongs to the computer
};

/** A computer that the object manager knows. */
struct Computer {
    const CMPIObjectPath* path;
    const CMPIInstance* instance;
};

/**
 * Asks the object manager for the computers in the request's namespace, each once. Others may have the turn while
 * the object manager asks another provider: that one may ask this one.
 */
std::vector<Computer> knownComputers(const Request& request, const Provider& provider);

/** What belongs to the computers by an association, in their order. */
std::vector<Link> linksOf(const Provider& provider, const std::vector<Computer>& computers, const Class& association);

}  // namespace gate
