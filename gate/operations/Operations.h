#pragma once

#include "PropertyList.h"

// The operations of CIM. Each returns its answers through the request's result, or throws Failure or ManagerGone.
//
// An operation begins its session before it reads a client's keys and values, and returns its answers after the
// session, so that a slow client does not block others. Only a creation returns its path within the session.

namespace gate {

/** @name Reads */
///@{
void enumerateInstanceNames(const Request& request);
void enumerateInstances(const Request& request, const char** properties);
void getInstance(const Request& request, const char** properties);
///@}

/** @name Changes */
///@{
void createInstance(const Request& request, const CMPIInstance* instance);
void modifyInstance(const Request& request, const CMPIInstance* instance, const char** properties);
void deleteInstance(const Request& request);
///@}

/**
 * @name Traversals of associations, from the request's path
 * References have no use for a property list: both properties of an association are keys.
 */
///@{
void associators(const Request& request, const char* associationClass, const char* resultClass, const char* role,
                 const char* resultRole, const char** properties);
void associatorNames(const Request& request, const char* associationClass, const char* resultClass, const char* role,
                     const char* resultRole);
void references(const Request& request, const char* associationClass, const char* role, const char** properties);
void referenceNames(const Request& request, const char* associationClass, const char* role);
///@}

/** @name Reads of an association class */
///@{
void enumerateAssociations(const Request& request, const Class& association);
void enumerateAssociationNames(const Request& request, const Class& association);
void getAssociation(const Request& request, const Class& association);
///@}

}  // namespace gate
