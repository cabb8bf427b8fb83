#pragma once

#include <vector>

#include "schema/Schema.h"

namespace cimhost {

/** Declarations of the qualifiers that every CIM implementation knows, so that a MOF file may use them undeclared. */
std::vector<QualifierDeclaration> standardQualifiers();

}  // namespace cimhost
