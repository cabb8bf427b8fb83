#pragma once

#include "Request.h"

namespace gate {

/**
 * What a client asks of associations. Names ignore letter case; null and the empty text mean any.
 * role is the near end's property in the association, resultRole the far end's.
 */
struct AssociationFilter {
    const char* associationClass = nullptr;
    const char* resultClass = nullptr;
    const char* role = nullptr;
    const char* resultRole = nullptr;
};

/**
 * @name The operations on associations
 * They answer into the request's result, or throw Failure. All tell the same: which computers there are is the object
 * manager's to say, which lease or warranty belongs to one is the provider's, asked for the names at the far end.
 */
///@{
void associators(const Request& request, const AssociationFilter& filter, const char** properties);
void associatorNames(const Request& request, const AssociationFilter& filter);
/** resultClass and role of the filter count; the result is the association. */
void references(const Request& request, const AssociationFilter& filter, const char** properties);
void referenceNames(const Request& request, const AssociationFilter& filter);

void enumerateAssociations(const Request& request, const Class& association);
void enumerateAssociationNames(const Request& request, const Class& association);
void getAssociation(const Request& request, const Class& association);
///@}

}  // namespace gate
