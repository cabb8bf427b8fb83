#pragma once

#include "OwnObjects.h"

#include <cmpift.h>

#include <string>

// Object paths and instances: made through the object manager's broker, which frees them when the request ends.

namespace gate {

std::string classNameOf(const CMPIObjectPath* path);
std::string nameSpaceOf(const CMPIObjectPath* path);
CMPICount keyCountOf(const CMPIObjectPath* path);

/** A path of a class without keys. Fails when it cannot be made, as the others here do. */
CMPIObjectPath* makePath(const CMPIBroker* broker, const std::string& nameSpace, const char* className);

/** An instance without properties. */
CMPIInstance* makeInstance(const CMPIBroker* broker, const CMPIObjectPath* path);

/**
 * The path as the provider is given it: of the class as the MOF writes it, with the class's keys and no others.
 * CMPI_RC_ERR_INVALID_PARAMETER when one of them is not there: such a path names no instance.
 */
OwnPath namingPath(const CMPIObjectPath* path, const Class& named);

/** The path of an instance. */
const CMPIObjectPath* pathOf(const CMPIInstance* instance);

/** Whether two paths name the same instance, which takes keys; of host and namespace only what both say counts. */
bool samePath(const CMPIObjectPath* left, const CMPIObjectPath* right);

}  // namespace gate
