#pragma once

#include <string>

#include "broker/Object.h"

namespace cimhost {

/** Name of the type of these objects, such as "CMPIInstance". */
const char* typeNameOf(ObjectKind kind);

/** Describes an object for people; "CMPIInstance (released)" after its release. */
std::string describe(const Object& object);

}  // namespace cimhost
