#pragma once

#include "DataFile.h"
#include "PropertyList.h"
#include "Values.h"

namespace gate {

/**
 * The values that a client's instance gives for the listed properties, nulls left out.
 * CMPI_RC_ERR_NO_SUCH_PROPERTY for a property that the class does not have.
 */
Values givenValues(const Class& owner, const CMPIInstance* instance, const PropertyList& list);

/**
 * Those of the given values that are not what the current instance has. CMPI_RC_ERR_INVALID_PARAMETER, with the
 * property's name, when one of them cannot be changed. Values come back as they were also when the object manager has
 * taken off what stood at their ends.
 * @param areListed whether the client has chosen the properties, rather than sent back all that it has read
 */
Values changesTo(const CMPIInstance* current, const Values& given, bool areListed);

/**
 * What the provider is given to make changes: the changes, and of the current instance those values that it would take
 * from somewhere else if they were not sent.
 */
Values changed(const Class& owner, const CMPIInstance* current, const Values& changes);

/**
 * What takes changes back: the values that the current instance, read before them, has in their place. Of a property
 * file also all others, which a change that could not read it has emptied.
 */
Values undoing(const Class& owner, const DataFile& file, const Values& changes, const CMPIInstance* current);

/** Whether two instances have the same of each of these properties, but for the clock. */
bool areSame(const Values& properties, const CMPIInstance* one, const CMPIInstance* other);

/** Whether a file of records cannot be the same after the changes as before. */
bool showIn(const DataFile& file, const CMPIInstance* current, const Values& changes);

/** Fails unless the instance, read again after a change, has the changes, and has lost nothing else. */
void requireChanged(const Class& owner, const DataFile& file, const CMPIInstance* before, const CMPIInstance* after,
                    const Values& changes);

}  // namespace gate
