#pragma once

#include "Failure.h"
#include "cim/CmpiAccess.h"

#include <cmpift.h>

#include <string>

// Calls of the object manager, and the failures that they end in.

namespace gate {

/** A string's characters; empty when any part of it is missing. */
std::string textOf(const CMPIString* string);

using cim::ask;
using cim::make;
using cim::tell;

/** Whether a status says that a key or property is not there, which is no failure to give it. */
bool saysAbsent(const CMPIStatus& status);

/** What the object manager could not do, with its status and its reason if it gave one. */
std::string failureText(const char* what, const CMPIStatus& status);

/** Fails with what the object manager could not do, unless it could. */
void require(bool couldBeDone, const char* what, const CMPIStatus& status = {CMPI_RC_OK, nullptr});

}  // namespace gate
