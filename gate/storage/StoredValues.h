#pragma once

#include "DataFile.h"

// Computes and checks the effects of changed values on the instance, the provider and the data file.

namespace gate {

/**
 * Refuses keys and writable values that a client would not read back unchanged after a restart of the object manager:
 * the data files lose some values (docs/data-files.md), and object managers remove blanks at the ends of values. Fails
 * with CMPI_RC_ERR_INVALID_PARAMETER, the property and the reason. Accepts all values if the agent's configuration has
 * refuse_lossy_values = false.
 */
void requireRoundTrip(const DataFile& file, const Values& values);

/**
 * The given values that differ from those of the current instance. Fails with CMPI_RC_ERR_INVALID_PARAMETER, naming the
 * property, if one of them is read-only. Values that differ only by what object managers trim are equal.
 * @param areListed whether the client sent a property list; without one, it may have sent back all values it had read
 */
Values diff(const CMPIInstance* current, const Values& given, bool areListed);

/**
 * The values to send to the provider: the changes, plus the current personalized values, which the provider would
 * otherwise copy from the preceding pair.
 */
Values valuesToSend(const Class& requested, const CMPIInstance* current, const Values& changes);

/** Whether the changes are certain to alter the content of a record file. */
bool altersFile(const DataFile& file, const CMPIInstance* current, const Values& changes);

/** Fails unless the instance, read again after a change, has the changes and has lost no other value. */
void requireChanged(const Class& requested, const DataFile& file, const CMPIInstance* before, const CMPIInstance* after,
                    const Values& changes);

}  // namespace gate
