#pragma once

#include <array>
#include <string>
#include <variant>

namespace KO::LeaseWarrantyProvider {

/** Format of a string in its line of a record file. */
enum class TextForm {
    identifier,  ///< blanks as underscores; an empty string as an empty line
    value,       ///< blanks as underscores; a string of at most one character as "*"
    date,        ///< unchanged; a string shorter than a CIM datetime as cim::noDate
};

/**
 * A field of a record type: its property, its member and, for strings, its format in the record file. A table of the
 * fields in file order defines reading, writing and typed property access.
 */
template <class Unit, class Property>
struct RecordField {
    using Member = std::variant<std::string Unit::*, unsigned int Unit::*, bool Unit::*>;

    Property property;
    Member member;
    TextForm form = TextForm::value;
};

/** Returns whether clients can change the field. The identifier is read-only. */
template <class Unit, class Property>
constexpr bool writable(const RecordField<Unit, Property>& field) {
    return !(std::holds_alternative<std::string Unit::*>(field.member) && field.form == TextForm::identifier);
}

}  // namespace KO::LeaseWarrantyProvider
