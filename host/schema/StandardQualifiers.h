#pragma once

#include <vector>

#include "schema/Schema.h"

namespace cimhost {

/** Declarations of the CIM standard's qualifiers, which MOF files may use without declaring them. */
std::vector<QualifierDeclaration> standardQualifiers();

}  // namespace cimhost
