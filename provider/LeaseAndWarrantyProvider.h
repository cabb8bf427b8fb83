#pragma once

#include <cmpidt.h>
#include <cmpift.h>

#include "Export.h"

/**
 * The library's two factories, which the object manager looks up by name. Each stores the broker for all later
 * requests. Each always returns the same interface object, so it can be called repeatedly. The factories do not use the
 * context and do not write rc.
 */
extern "C" {

KO_EXPORT CMPIInstanceMI* LeaseAndWarrantyProvider_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext* ctx,
                                                                     CMPIStatus* rc);

KO_EXPORT CMPIAssociationMI* LeaseAndWarrantyProvider_Create_AssociationMI(const CMPIBroker* broker,
                                                                           const CMPIContext* ctx, CMPIStatus* rc);
}
