// Queries, their conditions and predicates.
#include <cmpift.h>

#include "Layout.h"

LAYOUT_OBJECT(CMPISelectExp, void*);
LAYOUT_TABLE(CMPISelectExpFT, 8);
LAYOUT_SLOT(CMPISelectExpFT, 1, release, CMPIStatus (*)(CMPISelectExp*));
LAYOUT_SLOT(CMPISelectExpFT, 2, clone, CMPISelectExp* (*)(const CMPISelectExp*, CMPIStatus*));
LAYOUT_SLOT(CMPISelectExpFT, 3, evaluate, CMPIBoolean (*)(const CMPISelectExp*, const CMPIInstance*, CMPIStatus*));
LAYOUT_SLOT(CMPISelectExpFT, 4, getString, CMPIString* (*)(const CMPISelectExp*, CMPIStatus*));
LAYOUT_SLOT(CMPISelectExpFT, 5, getDOC, CMPISelectCond* (*)(const CMPISelectExp*, CMPIStatus*));
LAYOUT_SLOT(CMPISelectExpFT, 6, getCOD, CMPISelectCond* (*)(const CMPISelectExp*, CMPIStatus*));
LAYOUT_SLOT(CMPISelectExpFT, 7, evaluateUsingAccessor,
            CMPIBoolean (*)(const CMPISelectExp*, CMPIAccessor*, void*, CMPIStatus*));

LAYOUT_OBJECT(CMPISelectCond, void*);
LAYOUT_TABLE(CMPISelectCondFT, 5);
LAYOUT_SLOT(CMPISelectCondFT, 1, release, CMPIStatus (*)(CMPISelectCond*));
LAYOUT_SLOT(CMPISelectCondFT, 2, clone, CMPISelectCond* (*)(const CMPISelectCond*, CMPIStatus*));
LAYOUT_SLOT(CMPISelectCondFT, 3, getCountAndType, CMPICount (*)(const CMPISelectCond*, int*, CMPIStatus*));
LAYOUT_SLOT(CMPISelectCondFT, 4, getSubCondAt, CMPISubCond* (*)(const CMPISelectCond*, CMPICount, CMPIStatus*));

LAYOUT_OBJECT(CMPISubCond, void*);
LAYOUT_TABLE(CMPISubCondFT, 6);
LAYOUT_SLOT(CMPISubCondFT, 1, release, CMPIStatus (*)(CMPISubCond*));
LAYOUT_SLOT(CMPISubCondFT, 2, clone, CMPISubCond* (*)(const CMPISubCond*, CMPIStatus*));
LAYOUT_SLOT(CMPISubCondFT, 3, getCount, CMPICount (*)(const CMPISubCond*, CMPIStatus*));
LAYOUT_SLOT(CMPISubCondFT, 4, getPredicateAt, CMPIPredicate* (*)(const CMPISubCond*, CMPICount, CMPIStatus*));
LAYOUT_SLOT(CMPISubCondFT, 5, getPredicate, CMPIPredicate* (*)(const CMPISubCond*, const char*, CMPIStatus*));

LAYOUT_OBJECT(CMPIPredicate, void*);
LAYOUT_TABLE(CMPIPredicateFT, 5);
LAYOUT_SLOT(CMPIPredicateFT, 1, release, CMPIStatus (*)(CMPIPredicate*));
LAYOUT_SLOT(CMPIPredicateFT, 2, clone, CMPIPredicate* (*)(const CMPIPredicate*, CMPIStatus*));
LAYOUT_SLOT(CMPIPredicateFT, 3, getData,
            CMPIStatus (*)(const CMPIPredicate*, CMPIType*, CMPIPredOp*, CMPIString**, CMPIString**));
LAYOUT_SLOT(CMPIPredicateFT, 4, evaluateUsingAccessor,
            CMPIBoolean (*)(const CMPIPredicate*, CMPIAccessor*, void*, CMPIStatus*));
