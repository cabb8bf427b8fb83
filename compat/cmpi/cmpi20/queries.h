/*
 * Queries and filters, whole and taken apart. Included by cmpift.h, which states what holds for all
 * tables. What is taken out of an expression lives as long as the expression does.
 */
#ifndef CMPI20_QUERIES_H
#define CMPI20_QUERIES_H

#include "../cmpidt.h"

#ifdef __cplusplus
extern "C" {
#endif

/** A select expression: a query, or the filter of an indication. */
struct _CMPISelectExp {
    void* hdl;
    CMPISelectExpFT* ft;
};

struct _CMPISelectExpFT {
    int ftVersion;
    CMPIStatus (*release)(CMPISelectExp* expression);
    CMPISelectExp* (*clone)(const CMPISelectExp* expression, CMPIStatus* rc);

    /** Whether the expression selects an instance. */
    CMPIBoolean (*evaluate)(const CMPISelectExp* expression, const CMPIInstance* instance, CMPIStatus* rc);
    /** The expression as it was written. */
    CMPIString* (*getString)(const CMPISelectExp* expression, CMPIStatus* rc);
    /** Its condition as a disjunction of conjunctions; null when it has none. */
    CMPISelectCond* (*getDOC)(const CMPISelectExp* expression, CMPIStatus* rc);
    /** Its condition as a conjunction of disjunctions; null when it has none. */
    CMPISelectCond* (*getCOD)(const CMPISelectExp* expression, CMPIStatus* rc);
    /** Whether the expression selects what an accessor reads; the accessor is given `parameter`. */
    CMPIBoolean (*evaluateUsingAccessor)(const CMPISelectExp* expression, CMPIAccessor* accessor, void* parameter,
                                         CMPIStatus* rc);
};

/** A condition: sub-conditions joined in one way. */
struct _CMPISelectCond {
    void* hdl;
    CMPISelectCondFT* ft;
};

struct _CMPISelectCondFT {
    const int ftVersion;
    CMPIStatus (*release)(CMPISelectCond* condition);
    CMPISelectCond* (*clone)(const CMPISelectCond* condition, CMPIStatus* rc);

    /** How many sub-conditions there are; `type`, unless null, receives a CMPISelectCondType. */
    CMPICount (*getCountAndType)(const CMPISelectCond* condition, int* type, CMPIStatus* rc);
    /** The sub-condition at a position. */
    CMPISubCond* (*getSubCondAt)(const CMPISelectCond* condition, CMPICount index, CMPIStatus* rc);
};

/** A sub-condition: predicates, joined in the way that the condition's sub-conditions are not. */
struct _CMPISubCond {
    void* hdl;
    CMPISubCondFT* ft;
};

struct _CMPISubCondFT {
    int ftVersion;
    CMPIStatus (*release)(CMPISubCond* subCondition);
    CMPISubCond* (*clone)(const CMPISubCond* subCondition, CMPIStatus* rc);

    /** How many predicates there are. */
    CMPICount (*getCount)(const CMPISubCond* subCondition, CMPIStatus* rc);
    /** The predicate at a position. */
    CMPIPredicate* (*getPredicateAt)(const CMPISubCond* subCondition, CMPICount index, CMPIStatus* rc);
    /** The predicate whose left side is that name. */
    CMPIPredicate* (*getPredicate)(const CMPISubCond* subCondition, const char* name, CMPIStatus* rc);
};

/** A predicate: two sides and what compares them. */
struct _CMPIPredicate {
    void* hdl;
    CMPIPredicateFT* ft;
};

struct _CMPIPredicateFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIPredicate* predicate);
    CMPIPredicate* (*clone)(const CMPIPredicate* predicate, CMPIStatus* rc);

    /** Takes a predicate apart; `type` is that of the right side. Whatever is null is not wanted. */
    CMPIStatus (*getData)(const CMPIPredicate* predicate, CMPIType* type, CMPIPredOp* operation, CMPIString** leftSide,
                          CMPIString** rightSide);
    /** Whether the predicate holds for what an accessor reads; the accessor is given `parameter`. */
    CMPIBoolean (*evaluateUsingAccessor)(const CMPIPredicate* predicate, CMPIAccessor* accessor, void* parameter,
                                         CMPIStatus* rc);
};

#ifdef __cplusplus
}
#endif

#endif
