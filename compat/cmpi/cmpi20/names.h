/* Forward declarations of all structures of CMPI 2.0. Included by cmpidt.h. */
#ifndef CMPI20_NAMES_H
#define CMPI20_NAMES_H

#ifdef __cplusplus
extern "C" {
#endif

/** @name Plain data
 * Defined in cmpidt.h; passed by value or filled in place, and never released.
 */
///@{
typedef struct _CMPIValuePtr CMPIValuePtr;
typedef union _CMPIValue CMPIValue;
typedef struct _CMPIData CMPIData;
typedef struct _CMPIStatus CMPIStatus;
///@}

/** @name The broker
 * The object manager and its four function tables.
 */
///@{
typedef struct _CMPIBroker CMPIBroker;
typedef struct _CMPIBrokerFT CMPIBrokerFT;
typedef struct _CMPIBrokerEncFT CMPIBrokerEncFT;
typedef struct _CMPIBrokerExtFT CMPIBrokerExtFT;
typedef struct _CMPIBrokerMemFT CMPIBrokerMemFT;
///@}

/** @name Objects of a request
 * Arguments of every call to a provider, each with its function table.
 */
///@{
typedef struct _CMPIContext CMPIContext;
typedef struct _CMPIContextFT CMPIContextFT;
typedef struct _CMPIResult CMPIResult;
typedef struct _CMPIResultFT CMPIResultFT;
typedef struct _CMPIError CMPIError;
typedef struct _CMPIErrorFT CMPIErrorFT;
///@}

/** @name CIM objects and values
 * Opaque objects of the broker, each with its function table. An object that the broker creates for a provider belongs
 * to the broker and is valid until the request ends. Only clones must be released by the caller.
 */
///@{
typedef struct _CMPIInstance CMPIInstance;
typedef struct _CMPIInstanceFT CMPIInstanceFT;
typedef struct _CMPIObjectPath CMPIObjectPath;
typedef struct _CMPIObjectPathFT CMPIObjectPathFT;
typedef struct _CMPIArgs CMPIArgs;
typedef struct _CMPIArgsFT CMPIArgsFT;
typedef struct _CMPIString CMPIString;
typedef struct _CMPIStringFT CMPIStringFT;
typedef struct _CMPIArray CMPIArray;
typedef struct _CMPIArrayFT CMPIArrayFT;
typedef struct _CMPIEnumeration CMPIEnumeration;
typedef struct _CMPIEnumerationFT CMPIEnumerationFT;
typedef struct _CMPIDateTime CMPIDateTime;
typedef struct _CMPIDateTimeFT CMPIDateTimeFT;
///@}

/** @name Queries and filters
 * A select expression, its conditions (a disjunction or conjunction of sub-conditions) and their
 * predicates, each with its function table.
 */
///@{
typedef struct _CMPISelectExp CMPISelectExp;
typedef struct _CMPISelectExpFT CMPISelectExpFT;
typedef struct _CMPISelectCond CMPISelectCond;
typedef struct _CMPISelectCondFT CMPISelectCondFT;
typedef struct _CMPISubCond CMPISubCond;
typedef struct _CMPISubCondFT CMPISubCondFT;
typedef struct _CMPIPredicate CMPIPredicate;
typedef struct _CMPIPredicateFT CMPIPredicateFT;
///@}

/** @name Management interfaces
 * The interfaces of a provider, one per kind of operation, each with its function table.
 */
///@{
typedef struct _CMPIInstanceMI CMPIInstanceMI;
typedef struct _CMPIInstanceMIFT CMPIInstanceMIFT;
typedef struct _CMPIAssociationMI CMPIAssociationMI;
typedef struct _CMPIAssociationMIFT CMPIAssociationMIFT;
typedef struct _CMPIMethodMI CMPIMethodMI;
typedef struct _CMPIMethodMIFT CMPIMethodMIFT;
typedef struct _CMPIPropertyMI CMPIPropertyMI;
typedef struct _CMPIPropertyMIFT CMPIPropertyMIFT;
typedef struct _CMPIIndicationMI CMPIIndicationMI;
typedef struct _CMPIIndicationMIFT CMPIIndicationMIFT;
///@}

#ifdef __cplusplus
}
#endif

#endif
