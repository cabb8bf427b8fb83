#pragma once

#include "DataFile.h"
#include "Values.h"

namespace gate {

/** Whether the agent's configuration lets such values be refused. Else two values may look the same in a file. */
bool refusesLossyValues();

/**
 * Refuses a value that would not be the same after the object manager is restarted: the data files have their limits
 * (docs/data-files.md), and object managers take blanks off the ends of values. CMPI_RC_ERR_INVALID_PARAMETER with the
 * property and the reason. Refuses nothing where the agent's configuration says refuse_lossy_values = false.
 */
void requireKept(const DataFile& file, const Property& property, const std::string& text);

/** The same for every one of the values that can be written. */
void requireKept(const DataFile& file, const Values& values);

/** Whether a value is the same after the object manager is restarted. */
bool isKept(const DataFile& file, const Property& property, const std::string& text);

/** Whether the provider shows a datetime that it was given: it shows null for what is none. */
bool isShown(const DataFile& file, const std::string& dateTime);

}  // namespace gate
