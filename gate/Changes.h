#pragma once

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
 * property's name, when one of them cannot be changed.
 */
Values changesTo(const CMPIInstance* current, const Values& given);

/**
 * What the provider is given to make changes: every writable value that the current instance has, and the changes over
 * them. A provider that is told only a part of them may take the rest from somewhere else.
 */
Values changed(const Class& owner, const CMPIInstance* current, const Values& changes);

/** What takes changes back: the values that the current instance, read before them, has in their place. */
Values undoing(const Values& changes, const CMPIInstance* current);

/** Fails unless the instance, read again after a change, has the changes. */
void requireChanged(const CMPIInstance* before, const CMPIInstance* after, const Values& changes);

}  // namespace gate
