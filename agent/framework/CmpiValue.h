#pragma once

#include "cim/CmpiAccess.h"

#include <cmpidt.h>

#include <optional>
#include <string>

namespace KO {

/** @name Values read from a broker
 * None when the reading failed, the value is null, or it is of another type.
 */
///@{
std::optional<std::string> textOf(const CMPIData& data, const CMPIStatus& status);          ///< a string
std::optional<std::string> dateTimeTextOf(const CMPIData& data, const CMPIStatus& status);  ///< a datetime's string
std::optional<unsigned int> numberOf(const CMPIData& data, const CMPIStatus& status);       ///< any integer that fits
std::optional<bool> flagOf(const CMPIData& data, const CMPIStatus& status);                 ///< a boolean

/** A string, an integer in decimal digits, or a boolean as "true" or "false". */
std::optional<std::string> keyTextOf(const CMPIData& data, const CMPIStatus& status);

/** A reference; null for none. It belongs to the broker. */
CMPIObjectPath* referenceOf(const CMPIData& data, const CMPIStatus& status);
///@}

}  // namespace KO
