#pragma once

#include <string>

#include "model/Status.h"

namespace cimhost {

/** Name of a CMPI status code, such as CMPI_RC_ERR_NOT_FOUND; "unknown code" for a number without a name. */
std::string codeName(int code);

/** The status on one line: "error 6 (CMPI_RC_ERR_NOT_FOUND)", followed by a colon and the message if it has one. */
std::string errorText(const Status& status);

}  // namespace cimhost
