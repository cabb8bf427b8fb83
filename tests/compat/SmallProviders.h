#pragma once

#include <cmpift.h>

/**
 * Providers written in C with the stub macros: two providers in one file, one that serves all kinds
 * of interfaces and one that serves instances only.
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

/** The broker that the latest factory was given. */
const CMPIBroker* smallProvidersBroker(void);

/** How often the hook of Smaller ran. It refuses, with a status, a factory call without a context. */
int smallerHookRuns(void);

#ifdef __cplusplus
}
#endif
