#pragma once

#include <string>

#include "cimxml/ObjectWriter.h"
#include "schema/Schema.h"

namespace cimhost::cimxml {

/** The parts of a class to write. */
struct ClassParts {
    bool localOnly = true;  ///< only elements that the class declares or overrides
    bool qualifiers = true;
    bool classOrigin = false;
    PropertyList properties{};  ///< only these; nullopt: all
};

/** Appends CLASS. */
void appendClass(std::string& xml, const Class& declared, const ClassParts& parts, const ObjectWriter& writer);

/** Appends QUALIFIER.DECLARATION. */
void appendQualifierDeclaration(std::string& xml, const QualifierDeclaration& declaration, const ObjectWriter& writer);

}  // namespace cimhost::cimxml
