#pragma once

#include "Request.h"

namespace gate {

/** @name The operations on instances. They answer into the request's result, or throw Failure. */
///@{
void enumerateInstanceNames(const Request& request);
void enumerateInstances(const Request& request, const char** properties);
void getInstance(const Request& request, const char** properties);
void createInstance(const Request& request, const CMPIInstance* instance);
void modifyInstance(const Request& request, const CMPIInstance* instance, const char** properties);
void deleteInstance(const Request& request);
///@}

}  // namespace gate
