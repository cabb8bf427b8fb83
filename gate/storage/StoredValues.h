#pragma once

#include "DataFile.h"

// The effects of a change of values on the instance, the provider and the data file.

namespace gate {

/**
 * Refuses keys and writable values that a client would not read back as it wrote them, also after the object manager is
 * restarted: the data files lose some values (docs/data-files.md), and object managers remove blanks at their ends.
 * Fails with CMPI_RC_ERR_INVALID_PARAMETER, the property and the reason. Accepts all values if the agent's
 * configuration says refuse_lossy_values = false.
 */
void requireRoundTrip(const DataFile& file, const Values& values);

/**
 * The given values that differ from the current instance's. Fails with CMPI_RC_ERR_INVALID_PARAMETER, naming the
 * property, if one of them is read-only. A value is equal also if the object manager has trimmed it on the way.
 * @param areListed whether the client chose the properties, rather than sent back all that it had read
 */
Values diff(const CMPIInstance* current, const Values& given, bool areListed);

/**
 * The values to send to the provider: the changes, plus the current personalized values, which it would otherwise copy
 * from the preceding pair.
 */
Values valuesToSend(const Class& requested, const CMPIInstance* current, const Values& changes);

/** Whether the changes are certain to alter the content of a record file. */
bool altersFile(const DataFile& file, const CMPIInstance* current, const Values& changes);

/** Fails unless the instance, read again after a change, has the changes and has lost no other value. */
void requireChanged(const Class& requested, const DataFile& file, const CMPIInstance* before, const CMPIInstance* after,
                    const Values& changes);

}  // namespace gate
