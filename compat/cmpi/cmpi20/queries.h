/*
 * Queries and filters, complete or as their parts. Included by cmpift.h, which documents the rules for all tables. The
 * parts of an expression are valid as long as the expression.
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

    /** Returns whether the expression selects an instance. */
    CMPIBoolean (*evaluate)(const CMPISelectExp* expression, const CMPIInstance* instance, CMPIStatus* rc);
    /** Returns the original expression. */
    CMPIString* (*getString)(const CMPISelectExp* expression, CMPIStatus* rc);
    /** Returns its condition as a disjunction of conjunctions; null if it has none. */
    CMPISelectCond* (*getDOC)(const CMPISelectExp* expression, CMPIStatus* rc);
    /** Returns its condition as a conjunction of disjunctions; null if it has none. */
    CMPISelectCond* (*getCOD)(const CMPISelectExp* expression, CMPIStatus* rc);
    /**
     * Returns whether the expression selects the properties that an accessor reads. The accessor receives `parameter`.
     */
    CMPIBoolean (*evaluateUsingAccessor)(const CMPISelectExp* expression, CMPIAccessor* accessor, void* parameter,
                                         CMPIStatus* rc);
};

/** A condition: a disjunction or conjunction of sub-conditions. */
struct _CMPISelectCond {
    void* hdl;
    CMPISelectCondFT* ft;
};

struct _CMPISelectCondFT {
    const int ftVersion;
    CMPIStatus (*release)(CMPISelectCond* condition);
    CMPISelectCond* (*clone)(const CMPISelectCond* condition, CMPIStatus* rc);

    /** Returns the number of sub-conditions; `type`, unless null, receives a CMPISelectCondType. */
    CMPICount (*getCountAndType)(const CMPISelectCond* condition, int* type, CMPIStatus* rc);
    /** Returns the sub-condition at an index. */
    CMPISubCond* (*getSubCondAt)(const CMPISelectCond* condition, CMPICount index, CMPIStatus* rc);
};

/** A sub-condition: a conjunction of predicates in a disjunction, and vice versa. */
struct _CMPISubCond {
    void* hdl;
    CMPISubCondFT* ft;
};

struct _CMPISubCondFT {
    int ftVersion;
    CMPIStatus (*release)(CMPISubCond* subCondition);
    CMPISubCond* (*clone)(const CMPISubCond* subCondition, CMPIStatus* rc);

    /** Returns the number of predicates. */
    CMPICount (*getCount)(const CMPISubCond* subCondition, CMPIStatus* rc);
    /** Returns the predicate at an index. */
    CMPIPredicate* (*getPredicateAt)(const CMPISubCond* subCondition, CMPICount index, CMPIStatus* rc);
    /** Returns the predicate whose left side is the name. */
    CMPIPredicate* (*getPredicate)(const CMPISubCond* subCondition, const char* name, CMPIStatus* rc);
};

/** A predicate: two operands and an operator. */
struct _CMPIPredicate {
    void* hdl;
    CMPIPredicateFT* ft;
};

struct _CMPIPredicateFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIPredicate* predicate);
    CMPIPredicate* (*clone)(const CMPIPredicate* predicate, CMPIStatus* rc);

    /** Returns the parts of a predicate; `type` is the type of the right side. Null pointers are ignored. */
    CMPIStatus (*getData)(const CMPIPredicate* predicate, CMPIType* type, CMPIPredOp* operation, CMPIString** leftSide,
                          CMPIString** rightSide);
    /**
     * Returns whether the predicate is true for the properties that an accessor reads. The accessor receives
     * `parameter`.
     */
    CMPIBoolean (*evaluateUsingAccessor)(const CMPIPredicate* predicate, CMPIAccessor* accessor, void* parameter,
                                         CMPIStatus* rc);
};

#ifdef __cplusplus
}
#endif

#endif
