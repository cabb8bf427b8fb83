// The management interfaces.
#include <cmpift.h>

#include "Layout.h"

LAYOUT_INTERFACE(CMPIInstanceMI, const void*, 10);
LAYOUT_SLOT(CMPIInstanceMIFT, 2, cleanup, CMPIStatus (*)(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean));
LAYOUT_SLOT(CMPIInstanceMIFT, 3, enumerateInstanceNames,
            CMPIStatus (*)(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*));
LAYOUT_SLOT(CMPIInstanceMIFT, 4, enumerateInstances,
            CMPIStatus (*)(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                           const char**));
LAYOUT_SLOT(CMPIInstanceMIFT, 5, getInstance,
            CMPIStatus (*)(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                           const char**));
LAYOUT_SLOT(CMPIInstanceMIFT, 6, createInstance,
            CMPIStatus (*)(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                           const CMPIInstance*));
LAYOUT_SLOT(CMPIInstanceMIFT, 7, modifyInstance,
            CMPIStatus (*)(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                           const CMPIInstance*, const char**));
LAYOUT_SLOT(CMPIInstanceMIFT, 8, deleteInstance,
            CMPIStatus (*)(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*));
LAYOUT_SLOT(CMPIInstanceMIFT, 9, execQuery,
            CMPIStatus (*)(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*, const char*,
                           const char*));

LAYOUT_INTERFACE(CMPIAssociationMI, void*, 7);
LAYOUT_SLOT(CMPIAssociationMIFT, 2, cleanup, CMPIStatus (*)(CMPIAssociationMI*, const CMPIContext*, CMPIBoolean));
LAYOUT_SLOT(CMPIAssociationMIFT, 3, associators,
            CMPIStatus (*)(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                           const char*, const char*, const char*, const char*, const char**));
LAYOUT_SLOT(CMPIAssociationMIFT, 4, associatorNames,
            CMPIStatus (*)(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                           const char*, const char*, const char*, const char*));
LAYOUT_SLOT(CMPIAssociationMIFT, 5, references,
            CMPIStatus (*)(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                           const char*, const char*, const char**));
LAYOUT_SLOT(CMPIAssociationMIFT, 6, referenceNames,
            CMPIStatus (*)(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                           const char*, const char*));

LAYOUT_INTERFACE(CMPIMethodMI, void*, 4);
LAYOUT_SLOT(CMPIMethodMIFT, 2, cleanup, CMPIStatus (*)(CMPIMethodMI*, const CMPIContext*, CMPIBoolean));
LAYOUT_SLOT(CMPIMethodMIFT, 3, invokeMethod,
            CMPIStatus (*)(CMPIMethodMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*, const char*,
                           const CMPIArgs*, CMPIArgs*));

LAYOUT_INTERFACE(CMPIPropertyMI, void*, 6);
LAYOUT_SLOT(CMPIPropertyMIFT, 2, cleanup, CMPIStatus (*)(CMPIPropertyMI*, const CMPIContext*, CMPIBoolean));
LAYOUT_SLOT(CMPIPropertyMIFT, 3, setProperty,
            CMPIStatus (*)(CMPIPropertyMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*, const char*,
                           const CMPIData));
LAYOUT_SLOT(CMPIPropertyMIFT, 4, getProperty,
            CMPIStatus (*)(CMPIPropertyMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*, const char*));
LAYOUT_SLOT(CMPIPropertyMIFT, 5, setPropertyWithOrigin,
            CMPIStatus (*)(CMPIPropertyMI*, const CMPIContext*, const CMPIResult*, CMPIObjectPath*, const char*,
                           const CMPIData, const char*));

LAYOUT_INTERFACE(CMPIIndicationMI, void*, 9);
LAYOUT_SLOT(CMPIIndicationMIFT, 2, cleanup, CMPIStatus (*)(CMPIIndicationMI*, const CMPIContext*, CMPIBoolean));
LAYOUT_SLOT(CMPIIndicationMIFT, 3, authorizeFilter,
            CMPIStatus (*)(CMPIIndicationMI*, const CMPIContext*, const CMPISelectExp*, const char*,
                           const CMPIObjectPath*, const char*));
LAYOUT_SLOT(CMPIIndicationMIFT, 4, mustPoll,
            CMPIStatus (*)(CMPIIndicationMI*, const CMPIContext*, const CMPISelectExp*, const char*,
                           const CMPIObjectPath*));
LAYOUT_SLOT(CMPIIndicationMIFT, 5, activateFilter,
            CMPIStatus (*)(CMPIIndicationMI*, const CMPIContext*, const CMPISelectExp*, const char*,
                           const CMPIObjectPath*, CMPIBoolean));
LAYOUT_SLOT(CMPIIndicationMIFT, 6, deActivateFilter,
            CMPIStatus (*)(CMPIIndicationMI*, const CMPIContext*, const CMPISelectExp*, const char*,
                           const CMPIObjectPath*, CMPIBoolean));
LAYOUT_SLOT(CMPIIndicationMIFT, 7, enableIndications, CMPIStatus (*)(CMPIIndicationMI*, const CMPIContext*));
LAYOUT_SLOT(CMPIIndicationMIFT, 8, disableIndications, CMPIStatus (*)(CMPIIndicationMI*, const CMPIContext*));
