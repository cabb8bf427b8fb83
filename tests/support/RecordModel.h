#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

#include "model/Value.h"

// The rules of the record files, written down a second time and independently of the provider.

namespace testsupport {

/** How a field stands in a record file. */
enum class Form { identifier, text, date, number, flag };

/** A field of a record, in file order. */
struct ModelField {
    const char* property;  ///< the CIM property that shows it
    Form form;
};

using ModelFields = std::vector<ModelField>;

const ModelFields& leaseFields();
const ModelFields& warrantyFields();

/** A record's values in file order as text: numbers in decimal digits, flags "1" or "0". */
using ModelRecord = std::vector<std::string>;

/** The records in use of one class, as a model of the provider's table and file. */
class RecordModel {
public:
    explicit RecordModel(const ModelFields& itsFields) : fields(itsFields) {}

    /** A record as creation makes it. */
    ModelRecord newRecord(const std::string& instanceId) const;

    /** The first record with an identifier; null for none. */
    ModelRecord* find(const std::string& instanceId);

    /** Forgets the first record with an identifier; whether there was one. */
    bool remove(const std::string& instanceId);

    /** The file's content for the records. */
    std::string written() const;

    /** The number of records that a file's content announces. */
    static std::size_t announcedIn(std::string_view content);

    /** Replaces the records by what a file's content is read as. */
    void read(std::string_view content);

    /** What an instance of a record shows: "Name=value" as MOF, in the order of the file's fields. */
    std::vector<std::string> shown(const ModelRecord& record) const;

    /** The same of all records. */
    std::vector<std::vector<std::string>> shownRecords() const;

    /** The same of a real instance. */
    std::vector<std::string> shownFields(const cimhost::Instance& instance) const;

    ModelFields fields;
    std::vector<ModelRecord> records{};
};

}  // namespace testsupport
