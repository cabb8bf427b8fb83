#pragma once

#include <new>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include "MemoryFile.h"
#include "RecordTable.h"
#include "Target.h"
#include "support/RecordModel.h"

// Shared by the fuzzers of the two record files.

namespace fuzz {

/** Files with a larger count of records are skipped, because reading them takes long. If the records do not fit into
 * memory, the file must be rejected.
 */
constexpr std::size_t mostRecords = 400;

/** Converts a record of the store to one of the model. */
template <class Store>
testsupport::ModelRecord modelOf(const typename Store::Unit& unit) {
    testsupport::ModelRecord record;
    for (const auto& field : Store::fields) {
        record.push_back(std::visit(
            [&](auto member) -> std::string {
                if constexpr (std::is_same_v<decltype(member), std::string Store::Unit::*>) {
                    return unit.*member;
                } else {
                    return std::to_string(unit.*member);
                }
            },
            field.member));
    }
    return record;
}

/** A record file that the store and the model read. */
template <class Store>
class RecordFile {
public:
    RecordFile(MemoryFile& itsFile, const testsupport::ModelFields& fields) : file(itsFile), model(fields) {}

    /** Reads the file with the store and the model. @throws Violation if their records differ */
    void load() {
        count = 0;
        table.clear();
        KO::LeaseWarrantyProvider::loadRecords(file.path(), count, table, Store::fields);
        model.read(file.content());
        std::vector<testsupport::ModelRecord> found;
        for (const auto& unit : table) {
            found.push_back(modelOf<Store>(unit));
        }
        requireSame<std::size_t>(found.size(), model.records.size(), "number of records read");
        requireSame<std::size_t>(count, found.size(), "count of records");
        for (std::size_t index = 0; index < found.size(); ++index) {
            for (std::size_t field = 0; field < model.fields.size(); ++field) {
                requireSame(found[index][field], model.records[index][field],
                            "record " + std::to_string(index) + ", " + model.fields[field].property);
            }
        }
    }

    /** Writes the file with the store. @return its content  @throws Violation if the model's content differs */
    std::string rewrite() {
        require(KO::LeaseWarrantyProvider::writeRecords(file.path(), count, table), "the file can be written");
        const std::string content = file.content();
        requireSame(content, model.written(), "rewritten file");
        return content;
    }

    bool hasEmptyIdentifier() const {
        for (const auto& record : model.records) {
            if (record.front().empty()) {
                return true;
            }
        }
        return false;
    }

private:
    MemoryFile& file;
    testsupport::RecordModel model;
    unsigned int count = 0;
    std::vector<typename Store::Unit> table{};
};

template <class Store>
void requireNothingIsRead(const MemoryFile& file) {
    unsigned int count = 0;
    std::vector<typename Store::Unit> table;
    bool isRefused = false;
    try {
        KO::LeaseWarrantyProvider::loadRecords(file.path(), count, table, Store::fields);
    } catch (const std::bad_alloc&) {
        isRefused = true;
    }
    require(isRefused && count == 0 && table.empty(), "more records than fit into memory are rejected");
}

/** Checks that the store reads any content as the model does, and that rewriting a written file does not change it. */
template <class Store>
int checkRecordFile(const testsupport::ModelFields& fields, std::string_view input) {
    static MemoryFile file;
    file.fill(input);
    const std::size_t announced = testsupport::RecordModel::announcedIn(input);
    if (announced > mostRecords) {
        if (KO::LeaseWarrantyProvider::memoryCanHold(announced, sizeof(typename Store::Unit))) {
            return -1;
        }
        requireNothingIsRead<Store>(file);
        return 0;
    }
    RecordFile<Store> records(file, fields);
    records.load();
    const std::string first = records.rewrite();
    // An empty identifier is written as an empty line, which readers skip, so that the fields shift.
    const bool isStable = !records.hasEmptyIdentifier();
    records.load();
    const std::string second = records.rewrite();
    require(!isStable || second == first, "a file that was written is stable");
    return 0;
}

}  // namespace fuzz
