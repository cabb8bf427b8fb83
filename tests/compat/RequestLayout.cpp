// Context, result and error.
#include <cmpift.h>

#include "Layout.h"

LAYOUT_OBJECT(CMPIContext, void*);
LAYOUT_TABLE(CMPIContextFT, 7);
LAYOUT_SLOT(CMPIContextFT, 1, release, CMPIStatus (*)(CMPIContext*));
LAYOUT_SLOT(CMPIContextFT, 2, clone, CMPIContext* (*)(const CMPIContext*, CMPIStatus*));
LAYOUT_SLOT(CMPIContextFT, 3, getEntry, CMPIData (*)(const CMPIContext*, const char*, CMPIStatus*));
LAYOUT_SLOT(CMPIContextFT, 4, getEntryAt, CMPIData (*)(const CMPIContext*, CMPICount, CMPIString**, CMPIStatus*));
LAYOUT_SLOT(CMPIContextFT, 5, getEntryCount, CMPICount (*)(const CMPIContext*, CMPIStatus*));
LAYOUT_SLOT(CMPIContextFT, 6, addEntry,
            CMPIStatus (*)(const CMPIContext*, const char*, const CMPIValue*, const CMPIType));

LAYOUT_OBJECT(CMPIResult, void*);
LAYOUT_TABLE(CMPIResultFT, 8);
LAYOUT_SLOT(CMPIResultFT, 1, release, CMPIStatus (*)(CMPIResult*));
LAYOUT_SLOT(CMPIResultFT, 2, clone, CMPIResult* (*)(const CMPIResult*, CMPIStatus*));
LAYOUT_SLOT(CMPIResultFT, 3, returnData, CMPIStatus (*)(const CMPIResult*, const CMPIValue*, const CMPIType));
LAYOUT_SLOT(CMPIResultFT, 4, returnInstance, CMPIStatus (*)(const CMPIResult*, const CMPIInstance*));
LAYOUT_SLOT(CMPIResultFT, 5, returnObjectPath, CMPIStatus (*)(const CMPIResult*, const CMPIObjectPath*));
LAYOUT_SLOT(CMPIResultFT, 6, returnDone, CMPIStatus (*)(const CMPIResult*));
LAYOUT_SLOT(CMPIResultFT, 7, returnError, CMPIStatus (*)(const CMPIResult*, const CMPIError*));

LAYOUT_OBJECT(CMPIError, void*);
LAYOUT_TABLE(CMPIErrorFT, 27);
LAYOUT_SLOT(CMPIErrorFT, 1, release, CMPIStatus (*)(CMPIError*));
LAYOUT_SLOT(CMPIErrorFT, 2, clone, CMPIError* (*)(const CMPIError*, CMPIStatus*));
LAYOUT_SLOT(CMPIErrorFT, 3, getErrorType, CMPIErrorType (*)(const CMPIError*, CMPIStatus*));
LAYOUT_SLOT(CMPIErrorFT, 4, getOtherErrorType, CMPIString* (*)(const CMPIError*, CMPIStatus*));
LAYOUT_SLOT(CMPIErrorFT, 5, getOwningEntity, CMPIString* (*)(const CMPIError*, CMPIStatus*));
LAYOUT_SLOT(CMPIErrorFT, 6, getMessageID, CMPIString* (*)(const CMPIError*, CMPIStatus*));
LAYOUT_SLOT(CMPIErrorFT, 7, getMessage, CMPIString* (*)(const CMPIError*, CMPIStatus*));
LAYOUT_SLOT(CMPIErrorFT, 8, getPerceivedSeverity, CMPIErrorSeverity (*)(const CMPIError*, CMPIStatus*));
LAYOUT_SLOT(CMPIErrorFT, 9, getProbableCause, CMPIErrorProbableCause (*)(const CMPIError*, CMPIStatus*));
LAYOUT_SLOT(CMPIErrorFT, 10, getProbableCauseDescription, CMPIString* (*)(const CMPIError*, CMPIStatus*));
LAYOUT_SLOT(CMPIErrorFT, 11, getRecommendedActions, CMPIArray* (*)(const CMPIError*, CMPIStatus*));
LAYOUT_SLOT(CMPIErrorFT, 12, getErrorSource, CMPIString* (*)(const CMPIError*, CMPIStatus*));
LAYOUT_SLOT(CMPIErrorFT, 13, getErrorSourceFormat, CMPIErrorSrcFormat (*)(const CMPIError*, CMPIStatus*));
LAYOUT_SLOT(CMPIErrorFT, 14, getOtherErrorSourceFormat, CMPIString* (*)(const CMPIError*, CMPIStatus*));
LAYOUT_SLOT(CMPIErrorFT, 15, getCIMStatusCode, CMPIrc (*)(const CMPIError*, CMPIStatus*));
LAYOUT_SLOT(CMPIErrorFT, 16, getCIMStatusCodeDescription, CMPIString* (*)(const CMPIError*, CMPIStatus*));
LAYOUT_SLOT(CMPIErrorFT, 17, getMessageArguments, CMPIArray* (*)(const CMPIError*, CMPIStatus*));
LAYOUT_SLOT(CMPIErrorFT, 18, setErrorType, CMPIStatus (*)(CMPIError*, const CMPIErrorType));
LAYOUT_SLOT(CMPIErrorFT, 19, setOtherErrorType, CMPIStatus (*)(CMPIError*, const char*));
LAYOUT_SLOT(CMPIErrorFT, 20, setProbableCauseDescription, CMPIStatus (*)(CMPIError*, const char*));
LAYOUT_SLOT(CMPIErrorFT, 21, setRecommendedActions, CMPIStatus (*)(CMPIError*, const CMPIArray*));
LAYOUT_SLOT(CMPIErrorFT, 22, setErrorSource, CMPIStatus (*)(CMPIError*, const char*));
LAYOUT_SLOT(CMPIErrorFT, 23, setErrorSourceFormat, CMPIStatus (*)(CMPIError*, const CMPIErrorSrcFormat));
LAYOUT_SLOT(CMPIErrorFT, 24, setOtherErrorSourceFormat, CMPIStatus (*)(CMPIError*, const char*));
LAYOUT_SLOT(CMPIErrorFT, 25, setCIMStatusCodeDescription, CMPIStatus (*)(CMPIError*, const char*));
LAYOUT_SLOT(CMPIErrorFT, 26, setMessageArguments, CMPIStatus (*)(CMPIError*, CMPIArray*));
