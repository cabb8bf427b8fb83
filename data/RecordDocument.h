#pragma once

#include <array>
#include <cstddef>
#include <nlohmann/json.hpp>
#include <stdexcept>
#include <string>

// The records of a class as a JSON document, {"class": NAME, "records": [...]}. The properties of a record are in the
// order of the file. A date that is not set is null, and a string that is not UTF-8 is {"bytes": HEXADECIMAL}.

namespace data {

using Document = nlohmann::ordered_json;

/** Reports a document or a record file that cannot be converted without loss. The message names the value. */
class ConversionError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/** A class with a record file. The provider's own functions read and write the records. */
struct RecordClass {
    const char* name;
    const char* fileName;
    std::size_t propertyCount;
    /** Reads a complete file as the provider reads it. Returns the list of records. */
    Document (*read)(const std::string& content);
    /** Returns the file that the provider would write. Throws ConversionError if a property is missing or wrong. */
    std::string (*write)(const Document& document);
};

extern const std::array<RecordClass, 2> recordClasses;

/** Throws ConversionError if there is no such class. */
const RecordClass& recordClassOf(const std::string& name);

/** The content of a complete record file as a document. Throws ConversionError if the provider would lose a value. */
Document documentOf(const RecordClass& owner, const std::string& content);

/**
 * The content of the record file for a document. Throws ConversionError if the document is not valid, or if the
 * provider would read different records from the file.
 */
std::string contentOf(const RecordClass& owner, const Document& document);

/** Throws ConversionError if two records of a document have the same identifier. */
void requireUnique(const Document& document);

}  // namespace data
