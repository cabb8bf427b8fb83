#pragma once

#include "RoundTrip.h"

// The effects of a change of values on the instance, the provider and the data file.

namespace gate {

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
Values valuesToSend(const Class& owner, const CMPIInstance* current, const Values& changes);

/**
 * The values that reverse the changes, from the instance before them. For a property file these are all of its values:
 * a change that cannot read the file empties the others.
 */
Values rollbackValues(const Class& owner, const DataFile& file, const Values& changes, const CMPIInstance* current);

/** Whether the instances have equal values of these properties. The clock does not count. */
bool equalOn(const Values& properties, const CMPIInstance* left, const CMPIInstance* right);

/** Whether the changes are certain to alter the content of a record file. */
bool altersFile(const DataFile& file, const CMPIInstance* current, const Values& changes);

/** Fails unless the instance, read again after a change, has the changes and has lost no other value. */
void requireChanged(const Class& owner, const DataFile& file, const CMPIInstance* before, const CMPIInstance* after,
                    const Values& changes);

}  // namespace gate
