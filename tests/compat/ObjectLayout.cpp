// Instances, object paths and values.
#include <cmpift.h>

#include "Layout.h"

LAYOUT_OBJECT(CMPIInstance, void*);
LAYOUT_TABLE(CMPIInstanceFT, 11);
LAYOUT_SLOT(CMPIInstanceFT, 1, release, CMPIStatus (*)(CMPIInstance*));
LAYOUT_SLOT(CMPIInstanceFT, 2, clone, CMPIInstance* (*)(const CMPIInstance*, CMPIStatus*));
LAYOUT_SLOT(CMPIInstanceFT, 3, getProperty, CMPIData (*)(const CMPIInstance*, const char*, CMPIStatus*));
LAYOUT_SLOT(CMPIInstanceFT, 4, getPropertyAt, CMPIData (*)(const CMPIInstance*, CMPICount, CMPIString**, CMPIStatus*));
LAYOUT_SLOT(CMPIInstanceFT, 5, getPropertyCount, CMPICount (*)(const CMPIInstance*, CMPIStatus*));
LAYOUT_SLOT(CMPIInstanceFT, 6, setProperty,
            CMPIStatus (*)(const CMPIInstance*, const char*, const CMPIValue*, CMPIType));
LAYOUT_SLOT(CMPIInstanceFT, 7, getObjectPath, CMPIObjectPath* (*)(const CMPIInstance*, CMPIStatus*));
LAYOUT_SLOT(CMPIInstanceFT, 8, setPropertyFilter, CMPIStatus (*)(CMPIInstance*, const char**, const char**));
LAYOUT_SLOT(CMPIInstanceFT, 9, setObjectPath, CMPIStatus (*)(CMPIInstance*, const CMPIObjectPath*));
LAYOUT_SLOT(CMPIInstanceFT, 10, setPropertyWithOrigin,
            CMPIStatus (*)(const CMPIInstance*, const char*, const CMPIValue*, const CMPIType, const char*));

LAYOUT_OBJECT(CMPIObjectPath, void*);
LAYOUT_TABLE(CMPIObjectPathFT, 20);
LAYOUT_SLOT(CMPIObjectPathFT, 1, release, CMPIStatus (*)(CMPIObjectPath*));
LAYOUT_SLOT(CMPIObjectPathFT, 2, clone, CMPIObjectPath* (*)(const CMPIObjectPath*, CMPIStatus*));
LAYOUT_SLOT(CMPIObjectPathFT, 3, setNameSpace, CMPIStatus (*)(CMPIObjectPath*, const char*));
LAYOUT_SLOT(CMPIObjectPathFT, 4, getNameSpace, CMPIString* (*)(const CMPIObjectPath*, CMPIStatus*));
LAYOUT_SLOT(CMPIObjectPathFT, 5, setHostname, CMPIStatus (*)(CMPIObjectPath*, const char*));
LAYOUT_SLOT(CMPIObjectPathFT, 6, getHostname, CMPIString* (*)(const CMPIObjectPath*, CMPIStatus*));
LAYOUT_SLOT(CMPIObjectPathFT, 7, setClassName, CMPIStatus (*)(CMPIObjectPath*, const char*));
LAYOUT_SLOT(CMPIObjectPathFT, 8, getClassName, CMPIString* (*)(const CMPIObjectPath*, CMPIStatus*));
LAYOUT_SLOT(CMPIObjectPathFT, 9, addKey,
            CMPIStatus (*)(CMPIObjectPath*, const char*, const CMPIValue*, const CMPIType));
LAYOUT_SLOT(CMPIObjectPathFT, 10, getKey, CMPIData (*)(const CMPIObjectPath*, const char*, CMPIStatus*));
LAYOUT_SLOT(CMPIObjectPathFT, 11, getKeyAt, CMPIData (*)(const CMPIObjectPath*, CMPICount, CMPIString**, CMPIStatus*));
LAYOUT_SLOT(CMPIObjectPathFT, 12, getKeyCount, CMPICount (*)(const CMPIObjectPath*, CMPIStatus*));
LAYOUT_SLOT(CMPIObjectPathFT, 13, setNameSpaceFromObjectPath, CMPIStatus (*)(CMPIObjectPath*, const CMPIObjectPath*));
LAYOUT_SLOT(CMPIObjectPathFT, 14, setHostAndNameSpaceFromObjectPath,
            CMPIStatus (*)(CMPIObjectPath*, const CMPIObjectPath*));
LAYOUT_SLOT(CMPIObjectPathFT, 15, getClassQualifier, CMPIData (*)(const CMPIObjectPath*, const char*, CMPIStatus*));
LAYOUT_SLOT(CMPIObjectPathFT, 16, getPropertyQualifier,
            CMPIData (*)(const CMPIObjectPath*, const char*, const char*, CMPIStatus*));
LAYOUT_SLOT(CMPIObjectPathFT, 17, getMethodQualifier,
            CMPIData (*)(const CMPIObjectPath*, const char*, const char*, CMPIStatus*));
LAYOUT_SLOT(CMPIObjectPathFT, 18, getParameterQualifier,
            CMPIData (*)(const CMPIObjectPath*, const char*, const char*, const char*, CMPIStatus*));
LAYOUT_SLOT(CMPIObjectPathFT, 19, toString, CMPIString* (*)(const CMPIObjectPath*, CMPIStatus*));

LAYOUT_OBJECT(CMPIArgs, void*);
LAYOUT_TABLE(CMPIArgsFT, 7);
LAYOUT_SLOT(CMPIArgsFT, 1, release, CMPIStatus (*)(CMPIArgs*));
LAYOUT_SLOT(CMPIArgsFT, 2, clone, CMPIArgs* (*)(const CMPIArgs*, CMPIStatus*));
LAYOUT_SLOT(CMPIArgsFT, 3, addArg, CMPIStatus (*)(const CMPIArgs*, const char*, const CMPIValue*, const CMPIType));
LAYOUT_SLOT(CMPIArgsFT, 4, getArg, CMPIData (*)(const CMPIArgs*, const char*, CMPIStatus*));
LAYOUT_SLOT(CMPIArgsFT, 5, getArgAt, CMPIData (*)(const CMPIArgs*, CMPICount, CMPIString**, CMPIStatus*));
LAYOUT_SLOT(CMPIArgsFT, 6, getArgCount, CMPICount (*)(const CMPIArgs*, CMPIStatus*));

LAYOUT_OBJECT(CMPIString, void*);
LAYOUT_TABLE(CMPIStringFT, 4);
LAYOUT_SLOT(CMPIStringFT, 1, release, CMPIStatus (*)(CMPIString*));
LAYOUT_SLOT(CMPIStringFT, 2, clone, CMPIString* (*)(const CMPIString*, CMPIStatus*));
LAYOUT_SLOT(CMPIStringFT, 3, getCharPtr, const char* (*)(const CMPIString*, CMPIStatus*));

LAYOUT_OBJECT(CMPIArray, void*);
LAYOUT_TABLE(CMPIArrayFT, 7);
LAYOUT_SLOT(CMPIArrayFT, 1, release, CMPIStatus (*)(CMPIArray*));
LAYOUT_SLOT(CMPIArrayFT, 2, clone, CMPIArray* (*)(const CMPIArray*, CMPIStatus*));
LAYOUT_SLOT(CMPIArrayFT, 3, getSize, CMPICount (*)(const CMPIArray*, CMPIStatus*));
LAYOUT_SLOT(CMPIArrayFT, 4, getSimpleType, CMPIType (*)(const CMPIArray*, CMPIStatus*));
LAYOUT_SLOT(CMPIArrayFT, 5, getElementAt, CMPIData (*)(const CMPIArray*, CMPICount, CMPIStatus*));
LAYOUT_SLOT(CMPIArrayFT, 6, setElementAt, CMPIStatus (*)(CMPIArray*, CMPICount, const CMPIValue*, CMPIType));

LAYOUT_OBJECT(CMPIEnumeration, void*);
LAYOUT_TABLE(CMPIEnumerationFT, 6);
LAYOUT_SLOT(CMPIEnumerationFT, 1, release, CMPIStatus (*)(CMPIEnumeration*));
LAYOUT_SLOT(CMPIEnumerationFT, 2, clone, CMPIEnumeration* (*)(const CMPIEnumeration*, CMPIStatus*));
LAYOUT_SLOT(CMPIEnumerationFT, 3, getNext, CMPIData (*)(const CMPIEnumeration*, CMPIStatus*));
LAYOUT_SLOT(CMPIEnumerationFT, 4, hasNext, CMPIBoolean (*)(const CMPIEnumeration*, CMPIStatus*));
LAYOUT_SLOT(CMPIEnumerationFT, 5, toArray, CMPIArray* (*)(const CMPIEnumeration*, CMPIStatus*));

LAYOUT_OBJECT(CMPIDateTime, void*);
LAYOUT_TABLE(CMPIDateTimeFT, 6);
LAYOUT_SLOT(CMPIDateTimeFT, 1, release, CMPIStatus (*)(CMPIDateTime*));
LAYOUT_SLOT(CMPIDateTimeFT, 2, clone, CMPIDateTime* (*)(const CMPIDateTime*, CMPIStatus*));
LAYOUT_SLOT(CMPIDateTimeFT, 3, getBinaryFormat, CMPIUint64 (*)(const CMPIDateTime*, CMPIStatus*));
LAYOUT_SLOT(CMPIDateTimeFT, 4, getStringFormat, CMPIString* (*)(const CMPIDateTime*, CMPIStatus*));
LAYOUT_SLOT(CMPIDateTimeFT, 5, isInterval, CMPIBoolean (*)(const CMPIDateTime*, CMPIStatus*));
