#pragma once

#include "DataFile.h"

// Values that a client reads back as it wrote them, also after the object manager is restarted. The data files lose
// some values (docs/data-files.md), and object managers remove blanks at the ends of values.

namespace gate {

/**
 * Refuses a value that does not survive the round trip: fails with CMPI_RC_ERR_INVALID_PARAMETER, the property and the
 * reason. Accepts all values if the agent's configuration says refuse_lossy_values = false.
 */
void requireRoundTrip(const DataFile& file, const Property& property, const std::string& value);

/** The same for each value of a writable property. */
void requireRoundTrip(const DataFile& file, const Values& values);

bool survivesRoundTrip(const DataFile& file, const Property& property, const std::string& value);

/** Whether the provider returns a datetime that was stored. It returns null for one that is not valid. */
bool isRepresentable(const DataFile& file, const std::string& dateTime);

}  // namespace gate
