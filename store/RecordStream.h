#pragma once

#include <istream>
#include <ostream>
#include <string>
#include <variant>

namespace KO::LeaseWarrantyProvider {

/** Format of a string in a line of a record file. */
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

/** @name Reading a field
 * Returns whether the field was read. On failure, sets the stream's failbit and keeps the value.
 */
///@{
bool extract(std::istream& stream, unsigned int& number);  ///< decimal; may have a plus sign or leading zeros
bool extract(std::istream& stream, bool& flag);            ///< 0 or 1; may have a plus sign or leading zeros
bool extract(std::istream& stream, std::string& word);     ///< up to the next white space
///@}

/**
 * Writes a string in the format of a record file. Does not allocate memory, so that a rewrite cannot fail halfway for
 * lack of memory.
 */
void writeEscaped(std::ostream& stream, const std::string& text, TextForm form);

/** Returns the string that a line of a record file represents. */
std::string unescaped(const std::string& line, TextForm form);

/** Ends a line and flushes the stream, since a record file is written line by line. */
void endLine(std::ostream& stream);

/** Reads a record's fields in the table's order and unescapes its strings. A missing field keeps its value. */
template <class Unit, class Fields>
void readRecord(std::istream& stream, Unit& unit, const Fields& fields) {
    for (const auto& field : fields) {
        const bool wasThere = std::visit([&](auto member) { return extract(stream, unit.*member); }, field.member);
        const auto* text = std::get_if<std::string Unit::*>(&field.member);
        if (wasThere && text != nullptr) {
            unit.** text = unescaped(unit.**text, field.form);
        }
    }
}

/** Returns the heap memory of a record's strings in bytes. Short strings are stored in the record itself. */
template <class Unit, class Fields>
std::size_t bytesOfStrings(const Unit& unit, const Fields& fields) {
    const std::size_t shortest = std::string().capacity();
    std::size_t bytes = 0;
    for (const auto& field : fields) {
        const auto* text = std::get_if<std::string Unit::*>(&field.member);
        if (text != nullptr && (unit.**text).size() > shortest) {
            bytes += (unit.**text).size() + 1;
        }
    }
    return bytes;
}

/** Writes the fields of a record in the table's order, one per line. */
template <class Unit, class Fields>
void writeRecord(std::ostream& stream, const Unit& unit, const Fields& fields) {
    for (const auto& field : fields) {
        if (const auto* text = std::get_if<std::string Unit::*>(&field.member)) {
            writeEscaped(stream, unit.**text, field.form);
        } else if (const auto* number = std::get_if<unsigned int Unit::*>(&field.member)) {
            stream << unit.**number;
        } else {
            stream << (unit.*std::get<bool Unit::*>(field.member) ? '1' : '0');
        }
        endLine(stream);
    }
}

}  // namespace KO::LeaseWarrantyProvider
