/*
 * Macros for providers: the functions of the CMPI 2.0 tables under the names of the standard, and stubs that define a
 * provider's tables and factories.
 *
 * A macro calls a function of its first argument (an object, or the broker) and returns the function's result; see
 * cmpift.h and its includes. The first argument is evaluated more than once, so pass a name. A value parameter accepts
 * any pointer to a value, including a pointer to characters for the type CMPI_chars.
 */
#ifndef CMPIMACS_H
#define CMPIMACS_H

#include "cmpi20/stubs.h"
#include "cmpidt.h"
#include "cmpift.h"

/* ---------------------------------------------------------------------------------------------- */
/* Returning from functions                                                                        */
/* ---------------------------------------------------------------------------------------------- */

/** @name Results of a provider's operation
 * Statements that return from a function with the result CMPIStatus: a code alone, or with a message in a CMPIString or
 * in characters, which are converted to a CMPIString.
 */
///@{
#define CMReturn(code)                                     \
    do {                                                   \
        const CMPIStatus cmReturnStatus_ = {(code), NULL}; \
        return cmReturnStatus_;                            \
    } while (0)
#define CMReturnWithString(code, string)                       \
    do {                                                       \
        const CMPIStatus cmReturnStatus_ = {(code), (string)}; \
        return cmReturnStatus_;                                \
    } while (0)
#define CMReturnWithChars(broker, code, characters)                                             \
    do {                                                                                        \
        const CMPIStatus cmReturnStatus_ = {(code), CMNewString((broker), (characters), NULL)}; \
        return cmReturnStatus_;                                                                 \
    } while (0)
///@}

/** @name Setting a status
 * Statements that set both members of a status, given by a pointer that may be null.
 */
///@{
#define CMSetStatusWithString(status, code, string) \
    do {                                            \
        CMPIStatus* const cmSetStatus_ = (status);  \
        if (cmSetStatus_ != NULL) {                 \
            cmSetStatus_->rc = (code);              \
            cmSetStatus_->msg = (string);           \
        }                                           \
    } while (0)
#define CMSetStatus(status, code) CMSetStatusWithString(status, code, NULL)
#define CMSetStatusWithChars(broker, status, code, characters) \
    CMSetStatusWithString(status, code, CMNewString((broker), (characters), NULL))
///@}

/* ---------------------------------------------------------------------------------------------- */
/* Queries about any object or value                                                               */
/* ---------------------------------------------------------------------------------------------- */

/** Whether an object is null or no longer usable. */
#define CMIsNullObject(object) ((object) == NULL || (object)->hdl == NULL)

/** @name Queries about a CMPIData */
///@{
#define CMIsNullValue(data) (((data).state & CMPI_nullValue) != 0)
#define CMIsKeyValue(data) (((data).state & CMPI_keyValue) != 0)
#define CMIsArray(data) (((data).type & CMPI_ARRAY) != 0)
///@}

/** @name Lifetime of any encapsulated object */
///@{
#define CMRelease(object) ((object)->ft->release((object)))
#define CMClone(object, rc) ((object)->ft->clone((object), (rc)))
///@}

/** @name Information about objects */
///@{
#define CDToString(broker, object, rc) ((broker)->eft->toString((broker), (object), (rc)))
#define CDIsOfType(broker, object, type, rc) ((broker)->eft->isOfType((broker), (object), (type), (rc)))
#define CDGetType(broker, object, rc) ((broker)->eft->getType((broker), (object), (rc)))
#define CMClassPathIsA(broker, path, className, rc) ((broker)->eft->classPathIsA((broker), (path), (className), (rc)))
///@}

/* ---------------------------------------------------------------------------------------------- */
/* Creation of objects                                                                             */
/* ---------------------------------------------------------------------------------------------- */

#define CMNewInstance(broker, path, rc) ((broker)->eft->newInstance((broker), (path), (rc)))
#define CMNewObjectPath(broker, nameSpace, className, rc) \
    ((broker)->eft->newObjectPath((broker), (nameSpace), (className), (rc)))
#define CMNewArgs(broker, rc) ((broker)->eft->newArgs((broker), (rc)))
#define CMNewString(broker, characters, rc) ((broker)->eft->newString((broker), (characters), (rc)))
#define CMNewArray(broker, size, type, rc) ((broker)->eft->newArray((broker), (size), (type), (rc)))
#define CMNewDateTime(broker, rc) ((broker)->eft->newDateTime((broker), (rc)))
#define CMNewDateTimeFromBinary(broker, microseconds, interval, rc) \
    ((broker)->eft->newDateTimeFromBinary((broker), (microseconds), (interval), (rc)))
#define CMNewDateTimeFromChars(broker, characters, rc) \
    ((broker)->eft->newDateTimeFromChars((broker), (characters), (rc)))
#define CMNewSelectExp(broker, query, language, projection, rc) \
    ((broker)->eft->newSelectExp((broker), (query), (language), (projection), (rc)))
#define CMNewCMPIError(broker, owner, messageId, message, severity, cause, code, rc) \
    ((broker)->eft->newCMPIError((broker), (owner), (messageId), (message), (severity), (cause), (code), (rc)))

/* ---------------------------------------------------------------------------------------------- */
/* Objects of a request                                                                            */
/* ---------------------------------------------------------------------------------------------- */

/** @name CMPIContext */
///@{
#define CMGetContextEntry(context, name, rc) ((context)->ft->getEntry((context), (name), (rc)))
#define CMGetContextEntryAt(context, index, name, rc) ((context)->ft->getEntryAt((context), (index), (name), (rc)))
#define CMGetContextEntryCount(context, rc) ((context)->ft->getEntryCount((context), (rc)))
#define CMAddContextEntry(context, name, value, type) \
    ((context)->ft->addEntry((context), (name), (const CMPIValue*)(value), (type)))
///@}

/** @name CMPIResult */
///@{
#define CMReturnData(result, value, type) ((result)->ft->returnData((result), (const CMPIValue*)(value), (type)))
#define CMReturnInstance(result, instance) ((result)->ft->returnInstance((result), (instance)))
#define CMReturnObjectPath(result, path) ((result)->ft->returnObjectPath((result), (path)))
#define CMReturnDone(result) ((result)->ft->returnDone((result)))
#define CMReturnError(result, error) ((result)->ft->returnError((result), (error)))
///@}

/* ---------------------------------------------------------------------------------------------- */
/* Instances, object paths and values                                                              */
/* ---------------------------------------------------------------------------------------------- */

/** @name CMPIInstance */
///@{
#define CMGetProperty(instance, name, rc) ((instance)->ft->getProperty((instance), (name), (rc)))
#define CMGetPropertyAt(instance, index, name, rc) ((instance)->ft->getPropertyAt((instance), (index), (name), (rc)))
#define CMGetPropertyCount(instance, rc) ((instance)->ft->getPropertyCount((instance), (rc)))
#define CMSetProperty(instance, name, value, type) \
    ((instance)->ft->setProperty((instance), (name), (const CMPIValue*)(value), (type)))
#define CMSetPropertyWithOrigin(instance, name, value, type, origin) \
    ((instance)->ft->setPropertyWithOrigin((instance), (name), (const CMPIValue*)(value), (type), (origin)))
#define CMSetPropertyFilter(instance, properties, keys) \
    ((instance)->ft->setPropertyFilter((instance), (properties), (keys)))
#define CMGetObjectPath(instance, rc) ((instance)->ft->getObjectPath((instance), (rc)))
#define CMSetObjectPath(instance, path) ((instance)->ft->setObjectPath((instance), (path)))
///@}

/** @name CMPIObjectPath */
///@{
#define CMSetNameSpace(path, nameSpace) ((path)->ft->setNameSpace((path), (nameSpace)))
#define CMGetNameSpace(path, rc) ((path)->ft->getNameSpace((path), (rc)))
#define CMSetHostname(path, host) ((path)->ft->setHostname((path), (host)))
#define CMGetHostname(path, rc) ((path)->ft->getHostname((path), (rc)))
#define CMSetClassName(path, className) ((path)->ft->setClassName((path), (className)))
#define CMGetClassName(path, rc) ((path)->ft->getClassName((path), (rc)))
#define CMAddKey(path, name, value, type) ((path)->ft->addKey((path), (name), (const CMPIValue*)(value), (type)))
#define CMGetKey(path, name, rc) ((path)->ft->getKey((path), (name), (rc)))
#define CMGetKeyAt(path, index, name, rc) ((path)->ft->getKeyAt((path), (index), (name), (rc)))
#define CMGetKeyCount(path, rc) ((path)->ft->getKeyCount((path), (rc)))
#define CMSetNameSpaceFromObjectPath(path, source) ((path)->ft->setNameSpaceFromObjectPath((path), (source)))
#define CMSetHostAndNameSpaceFromObjectPath(path, source) \
    ((path)->ft->setHostAndNameSpaceFromObjectPath((path), (source)))
#define CMObjectPathToString(path, rc) ((path)->ft->toString((path), (rc)))
///@}

/** @name Qualifiers of a CMPIObjectPath's class */
///@{
#define CMGetClassQualifier(path, qualifier, rc) ((path)->ft->getClassQualifier((path), (qualifier), (rc)))
#define CMGetPropertyQualifier(path, property, qualifier, rc) \
    ((path)->ft->getPropertyQualifier((path), (property), (qualifier), (rc)))
#define CMGetMethodQualifier(path, method, qualifier, rc) \
    ((path)->ft->getMethodQualifier((path), (method), (qualifier), (rc)))
#define CMGetParameterQualifier(path, method, parameter, qualifier, rc) \
    ((path)->ft->getParameterQualifier((path), (method), (parameter), (qualifier), (rc)))
///@}

/** @name CMPIArgs */
///@{
#define CMAddArg(args, name, value, type) ((args)->ft->addArg((args), (name), (const CMPIValue*)(value), (type)))
#define CMGetArg(args, name, rc) ((args)->ft->getArg((args), (name), (rc)))
#define CMGetArgAt(args, index, name, rc) ((args)->ft->getArgAt((args), (index), (name), (rc)))
#define CMGetArgCount(args, rc) ((args)->ft->getArgCount((args), (rc)))
///@}

/** @name CMPIString
 * The null-terminated characters; they may be null.
 */
///@{
#define CMGetCharsPtr(string, rc) ((string)->ft->getCharPtr((string), (rc)))
#define CMGetCharPtr(string) CMGetCharsPtr(string, NULL)
///@}

/** @name CMPIArray */
///@{
#define CMGetArrayCount(array, rc) ((array)->ft->getSize((array), (rc)))
#define CMGetArrayType(array, rc) ((array)->ft->getSimpleType((array), (rc)))
#define CMGetArrayElementAt(array, index, rc) ((array)->ft->getElementAt((array), (index), (rc)))
#define CMSetArrayElementAt(array, index, value, type) \
    ((array)->ft->setElementAt((array), (index), (const CMPIValue*)(value), (type)))
///@}

/** @name CMPIEnumeration */
///@{
#define CMGetNext(enumeration, rc) ((enumeration)->ft->getNext((enumeration), (rc)))
#define CMHasNext(enumeration, rc) ((enumeration)->ft->hasNext((enumeration), (rc)))
#define CMToArray(enumeration, rc) ((enumeration)->ft->toArray((enumeration), (rc)))
///@}

/** @name CMPIDateTime */
///@{
#define CMGetBinaryFormat(dateTime, rc) ((dateTime)->ft->getBinaryFormat((dateTime), (rc)))
#define CMGetStringFormat(dateTime, rc) ((dateTime)->ft->getStringFormat((dateTime), (rc)))
#define CMIsInterval(dateTime, rc) ((dateTime)->ft->isInterval((dateTime), (rc)))
///@}

/* ---------------------------------------------------------------------------------------------- */
/* Queries and filters                                                                             */
/* ---------------------------------------------------------------------------------------------- */

/** @name CMPISelectExp */
///@{
#define CMEvaluateSelExp(expression, instance, rc) ((expression)->ft->evaluate((expression), (instance), (rc)))
#define CMEvaluateSelExpUsingAccessor(expression, accessor, parameter, rc) \
    ((expression)->ft->evaluateUsingAccessor((expression), (accessor), (parameter), (rc)))
#define CMGetSelExpString(expression, rc) ((expression)->ft->getString((expression), (rc)))
#define CMGetDoc(expression, rc) ((expression)->ft->getDOC((expression), (rc)))
#define CMGetCod(expression, rc) ((expression)->ft->getCOD((expression), (rc)))
///@}

/** @name Conditions and predicates */
///@{
#define CMGetSubCondCountAndType(condition, type, rc) ((condition)->ft->getCountAndType((condition), (type), (rc)))
#define CMGetSubCondAt(condition, index, rc) ((condition)->ft->getSubCondAt((condition), (index), (rc)))
#define CMGetPredicateCount(subCondition, rc) ((subCondition)->ft->getCount((subCondition), (rc)))
#define CMGetPredicateAt(subCondition, index, rc) ((subCondition)->ft->getPredicateAt((subCondition), (index), (rc)))
#define CMGetPredicate(subCondition, name, rc) ((subCondition)->ft->getPredicate((subCondition), (name), (rc)))
#define CMGetPredicateData(predicate, type, operation, left, right) \
    ((predicate)->ft->getData((predicate), (type), (operation), (left), (right)))
#define CMEvaluatePredicateUsingAccessor(predicate, accessor, parameter, rc) \
    ((predicate)->ft->evaluateUsingAccessor((predicate), (accessor), (parameter), (rc)))
///@}

/* ---------------------------------------------------------------------------------------------- */
/* Services of the broker                                                                          */
/* ---------------------------------------------------------------------------------------------- */

/** @name Log and trace */
///@{
#define CMLogMessage(broker, severity, id, characters, string) \
    ((broker)->eft->logMessage((broker), (severity), (id), (characters), (string)))
#define CMTraceMessage(broker, level, component, characters, string) \
    ((broker)->eft->trace((broker), (level), (component), (characters), (string)))
///@}

/** @name Threads that a provider starts */
///@{
#define CBPrepareAttachThread(broker, context) ((broker)->bft->prepareAttachThread((broker), (context)))
#define CBAttachThread(broker, context) ((broker)->bft->attachThread((broker), (context)))
#define CBDetachThread(broker, context) ((broker)->bft->detachThread((broker), (context)))
///@}

/** @name Indications and methods */
///@{
#define CBDeliverIndication(broker, context, nameSpace, indication) \
    ((broker)->bft->deliverIndication((broker), (context), (nameSpace), (indication)))
#define CBInvokeMethod(broker, context, path, method, in, out, rc) \
    ((broker)->bft->invokeMethod((broker), (context), (path), (method), (in), (out), (rc)))
///@}

/** @name Instances of other providers */
///@{
#define CBEnumInstanceNames(broker, context, path, rc) \
    ((broker)->bft->enumerateInstanceNames((broker), (context), (path), (rc)))
#define CBEnumInstances(broker, context, path, properties, rc) \
    ((broker)->bft->enumerateInstances((broker), (context), (path), (properties), (rc)))
#define CBGetInstance(broker, context, path, properties, rc) \
    ((broker)->bft->getInstance((broker), (context), (path), (properties), (rc)))
#define CBCreateInstance(broker, context, path, instance, rc) \
    ((broker)->bft->createInstance((broker), (context), (path), (instance), (rc)))
#define CBModifyInstance(broker, context, path, instance, properties) \
    ((broker)->bft->modifyInstance((broker), (context), (path), (instance), (properties)))
#define CBDeleteInstance(broker, context, path) ((broker)->bft->deleteInstance((broker), (context), (path)))
#define CBExecQuery(broker, context, path, query, language, rc) \
    ((broker)->bft->execQuery((broker), (context), (path), (query), (language), (rc)))
#define CBGetProperty(broker, context, path, name, rc) \
    ((broker)->bft->getProperty((broker), (context), (path), (name), (rc)))
#define CBSetProperty(broker, context, path, name, value, type) \
    ((broker)->bft->setProperty((broker), (context), (path), (name), (const CMPIValue*)(value), (type)))
///@}

/** @name Associations of other providers */
///@{
#define CBAssociators(broker, context, path, assocClass, resultClass, role, resultRole, properties, rc)         \
    ((broker)->bft->associators((broker), (context), (path), (assocClass), (resultClass), (role), (resultRole), \
                                (properties), (rc)))
#define CBAssociatorNames(broker, context, path, assocClass, resultClass, role, resultRole, rc)                     \
    ((broker)->bft->associatorNames((broker), (context), (path), (assocClass), (resultClass), (role), (resultRole), \
                                    (rc)))
#define CBReferences(broker, context, path, resultClass, role, properties, rc) \
    ((broker)->bft->references((broker), (context), (path), (resultClass), (role), (properties), (rc)))
#define CBReferenceNames(broker, context, path, resultClass, role, rc) \
    ((broker)->bft->referenceNames((broker), (context), (path), (resultClass), (role), (rc)))
///@}

#endif
