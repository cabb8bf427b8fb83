#pragma once

#include "RecordFields.h"

#include <istream>
#include <ostream>
#include <string>

namespace KO::LeaseWarrantyProvider {

/**
 * Reads an unsigned decimal number. Where none stands, the stream fails and the number stays as it
 * was; a sign makes it no unsigned number.
 */
void extract(std::istream& stream, unsigned int& number);

/** Reads a flag, "0" or "1". Where none stands, the stream fails and the flag stays as it was. */
void extract(std::istream& stream, bool& flag);

/** Reads a word. Where none stands, the stream fails and the text stays as it was. */
void extract(std::istream& stream, std::string& word);

/** What a line of a record file holds for a text. */
std::string escaped(const std::string& text, TextForm form);

/** The text for which a line of a record file stands. */
std::string unescaped(const std::string& line, TextForm form);

/** Ends a line and hands it to the operating system: a record file is flushed line by line. */
void endLine(std::ostream& stream);

/**
 * Reads the fields of a record in the table's order, then undoes the escapes of its texts. The
 * stream's state is not looked at: a field that cannot be read stays as it was.
 */
template <class Unit, class Fields>
void readRecord(std::istream& stream, Unit& unit, const Fields& fields) {
    for (const auto& field : fields) {
        std::visit([&](auto member) { extract(stream, unit.*member); }, field.member);
    }
    for (const auto& field : fields) {
        if (const auto* text = std::get_if<std::string Unit::*>(&field.member)) {
            unit.** text = unescaped(unit.**text, field.form);
        }
    }
}

/** Writes the fields of a record, one a line, in the table's order. */
template <class Unit, class Fields>
void writeRecord(std::ostream& stream, const Unit& unit, const Fields& fields) {
    for (const auto& field : fields) {
        if (const auto* text = std::get_if<std::string Unit::*>(&field.member)) {
            stream << escaped(unit.**text, field.form);
        } else if (const auto* number = std::get_if<unsigned int Unit::*>(&field.member)) {
            stream << unit.**number;
        } else {
            stream << (unit.*std::get<bool Unit::*>(field.member) ? '1' : '0');
        }
        endLine(stream);
    }
}

}  // namespace KO::LeaseWarrantyProvider
