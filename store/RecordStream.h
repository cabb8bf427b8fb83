#pragma once

#include "RecordFields.h"

#include <istream>
#include <ostream>
#include <string>

namespace KO::LeaseWarrantyProvider {

/** @name Reading a field
 * Answers whether the field was there. Where it was not, the stream fails and the value stays as it was.
 */
///@{
bool extract(std::istream& stream, unsigned int& number);  ///< decimal, also as in "036" or "+36"; no minus sign
bool extract(std::istream& stream, bool& flag);            ///< the number 0 or 1, also as in "01" or "+1"
bool extract(std::istream& stream, std::string& word);     ///< up to the next white space
///@}

/**
 * Writes what a line of a record file holds for a text. Allocates nothing: a file that is being rewritten is not given
 * up for lack of memory.
 */
void writeEscaped(std::ostream& stream, const std::string& text, TextForm form);

/** The text for which a line of a record file stands. */
std::string unescaped(const std::string& line, TextForm form);

/** Ends a line and hands it to the operating system: a record file is flushed line by line. */
void endLine(std::ostream& stream);

/** Reads a record's fields in the table's order, undoing the escapes of texts. A missing field stays as it was. */
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

/** Bytes of memory that a record's texts take, but for those short ones that stand in the record itself. */
template <class Unit, class Fields>
std::size_t bytesOfTexts(const Unit& unit, const Fields& fields) {
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

/** Writes the fields of a record, one a line, in the table's order. */
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
