#pragma once

#include "Export.h"

#include <cmpidt.h>
#include <cmpift.h>

/**
 * The library's two factories, which the object manager finds by name. Each remembers the broker,
 * which all requests use from then on, and returns the library's one interface object of its kind.
 * They may be called repeatedly. The context is not used, and rc is not written.
 */
extern "C" {

KO_EXPORT CMPIInstanceMI* LeaseAndWarrantyProvider_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext* ctx,
                                                                     CMPIStatus* rc);

KO_EXPORT CMPIAssociationMI* LeaseAndWarrantyProvider_Create_AssociationMI(const CMPIBroker* broker,
                                                                           const CMPIContext* ctx, CMPIStatus* rc);
}
