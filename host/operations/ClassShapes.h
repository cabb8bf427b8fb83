#pragma once

#include "broker/ClassShape.h"
#include "schema/Schema.h"

namespace cimhost {

/** Shapes of the schema's classes for a broker; they do not depend on the schema afterwards. */
ClassShapeLookup classShapes(const Schema& schema);

}  // namespace cimhost
