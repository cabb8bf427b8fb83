#pragma once

#include <string>

#include "model/Status.h"

namespace cimhost {

/** Name of a CMPI status code, such as CMPI_RC_ERR_NOT_FOUND; "unknown code" for a number that has none. */
std::string codeName(int code);

/** The status as one line: "error 6 (CMPI_RC_ERR_NOT_FOUND)", and the message, if any, after a colon. */
std::string errorText(const Status& status);

}  // namespace cimhost
