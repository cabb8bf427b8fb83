#pragma once

#include <cmpift.h>

/**
 * Two providers in one C file, written with the stub macros: one implements all interfaces, the other only the instance
 * interface.
 */
#ifdef __cplusplus
extern "C" {
#endif

CMPIInstanceMI* Small_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext* context, CMPIStatus* rc);
CMPIAssociationMI* Small_Create_AssociationMI(const CMPIBroker* broker, const CMPIContext* context, CMPIStatus* rc);
CMPIMethodMI* Small_Create_MethodMI(const CMPIBroker* broker, const CMPIContext* context, CMPIStatus* rc);
CMPIPropertyMI* Small_Create_PropertyMI(const CMPIBroker* broker, const CMPIContext* context, CMPIStatus* rc);
CMPIIndicationMI* Small_Create_IndicationMI(const CMPIBroker* broker, const CMPIContext* context, CMPIStatus* rc);
CMPIInstanceMI* Smaller_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext* context, CMPIStatus* rc);

/** Returns the broker that the latest factory call received. */
const CMPIBroker* smallProvidersBroker(void);

/**
 * Returns the number of calls of Smaller's hook. The hook sets an error status if the factory is called without a
 * context.
 */
int smallerHookRuns(void);

#ifdef __cplusplus
}
#endif
