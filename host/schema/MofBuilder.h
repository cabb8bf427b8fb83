#pragma once

#include <functional>
#include <string>

#include "schema/Errors.h"
#include "schema/Literal.h"
#include "schema/MofGrammar.h"
#include "schema/Schema.h"

namespace cimhost {

/**
 * Adds the classes, qualifier declarations and instances of a parse tree to a schema.
 * @param onInclude called for each #pragma include, in order
 * @throws LoadError with file, line and column of the first error
 */
void buildMof(Schema& schema, const grammar::Node& root, std::function<void(const std::string& file)> onInclude);

/** The literal of a MOF constant. Adjacent strings are joined. An alias results in NULL. */
Literal constantLiteral(const grammar::Node& constant);

/** Returns an error in a MOF file, whose message begins with the file, line and column. */
LoadError errorAt(const tao::pegtl::position& position, const std::string& message);

}  // namespace cimhost
