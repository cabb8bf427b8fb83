#pragma once

#include <string>

#include "broker/Object.h"

namespace cimhost {

/** Name of the type of such objects: "CMPIInstance" and so on. */
const char* typeText(ObjectKind kind);

/** An object as text for people; "CMPIInstance (released)" after its release. */
std::string toText(const Object& object);

}  // namespace cimhost
