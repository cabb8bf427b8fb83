#pragma once

#include <array>
#include <cstddef>
#include <string>
#include <variant>

namespace KO::LeaseWarrantyProvider {

/** How a text stands on its line of a record file. */
enum class TextForm {
    identifier,  ///< blanks as underscores; an empty text as an empty line
    value,       ///< blanks as underscores; a text of no or one character as "*"
    date,        ///< unchanged; a text too short for a CIM datetime as the default date
};

/** The text of no date in a record file, and the length of any CIM datetime. */
constexpr const char* defaultDate = "00000000000000.000000-000";
constexpr std::size_t dateLength = 25;

/**
 * One field of a record type: the property that names it, the member that holds it and, for texts,
 * how the record file shows it. A record's fields stand in a table in file order; that one table
 * drives reading, writing and typed property access.
 */
template <class Unit, class Property>
struct RecordField {
    using Member = std::variant<std::string Unit::*, unsigned int Unit::*, bool Unit::*>;

    Property property;
    Member member;
    TextForm form = TextForm::value;
};

/** Whether a client may change the field: the identifier stays what it was made with. */
template <class Unit, class Property>
constexpr bool writable(const RecordField<Unit, Property>& field) {
    return !(std::holds_alternative<std::string Unit::*>(field.member) && field.form == TextForm::identifier);
}

}  // namespace KO::LeaseWarrantyProvider
