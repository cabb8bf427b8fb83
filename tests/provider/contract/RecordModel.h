#pragma once

#include "RecordFixture.h"

#include <string>
#include <vector>

// The rules of the record files, written down a second time and independently of the provider.

namespace contract {

/** How a field stands in a record file. */
enum class Form { identifier, text, date, number, flag };

/** A field of a record, in file order. */
struct ModelField {
    const char* property;  ///< the CIM property that shows it
    Form form;
};

/** A record's values in file order as text: numbers in decimal digits, flags "1" or "0". */
using ModelRecord = std::vector<std::string>;

/** The records in use of one class, as a model of the provider's table and file. */
class RecordModel {
public:
    explicit RecordModel(const RecordClass& kind);

    /** A record as creation makes it. */
    ModelRecord newRecord(const std::string& instanceId) const;

    /** The first record with an identifier; null for none. */
    ModelRecord* find(const std::string& instanceId);

    /** Forgets the first record with an identifier; whether there was one. */
    bool remove(const std::string& instanceId);

    /** The file's content for the records. */
    std::string written() const;

    /** Replaces the records by what a file's content is read as. */
    void read(const std::string& content);

    /** What instances of the records show, as shown() has it, in the order of the file's fields. */
    std::vector<std::vector<std::string>> shownRecords() const;

    /** The same of a real instance. */
    std::vector<std::string> shownFields(const Instance& instance) const;

    std::vector<ModelField> fields;
    std::vector<ModelRecord> records{};
};

}  // namespace contract
