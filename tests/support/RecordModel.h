#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

#include "model/Value.h"

// A model of the record files, independent of the provider.

namespace testsupport {

/** The forms of fields in a record file. */
enum class Form { identifier, text, date, number, flag };

/** A field of a record. */
struct ModelField {
    const char* property;  ///< the CIM property with its value
    Form form;
};

using ModelFields = std::vector<ModelField>;

const ModelFields& leaseFields();
const ModelFields& warrantyFields();

/** The values of a record in file order, as strings: numbers in decimal digits, flags "1" or "0". */
using ModelRecord = std::vector<std::string>;

/** A model of the provider's table and file of one class. */
class RecordModel {
public:
    explicit RecordModel(const ModelFields& itsFields) : fields(itsFields) {}

    /** A new record. */
    ModelRecord newRecord(const std::string& instanceId) const;

    /** The first record with an identifier; null if there is none. */
    ModelRecord* find(const std::string& instanceId);

    /** Removes the first record with an identifier. @return whether there was one */
    bool remove(const std::string& instanceId);

    /** The content of the file. */
    std::string written() const;

    /** The number of records at the beginning of a file's content. */
    static std::size_t announcedIn(std::string_view content);

    /** Replaces the records by those of a file's content. */
    void read(std::string_view content);

    /** The properties of a record as "Name=value" in MOF, in file order. */
    std::vector<std::string> shown(const ModelRecord& record) const;

    /** The properties of all records. */
    std::vector<std::vector<std::string>> shownRecords() const;

    /** The properties of an instance in the same form. */
    std::vector<std::string> shownFields(const cimhost::Instance& instance) const;

    ModelFields fields;
    std::vector<ModelRecord> records{};
};

}  // namespace testsupport
