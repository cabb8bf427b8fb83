#pragma once

#include "gate/cmpi/Objects.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace gate {

/** The content of a record file and the time of its last change. */
struct FileState {
    std::string content;        ///< empty if the file cannot be read, and for a property file
    std::int64_t modified = 0;  ///< nanoseconds

    bool operator==(const FileState& other) const { return modified == other.modified && content == other.content; }
};

/** A class's data file. The provider writes it and does not report errors, so the gate checks it around each change. */
struct DataFile {
    const char* className;
    const char* fileName;
    std::size_t linesPerRecord;  ///< 0 for a property file

    /** Whether it is a record file, so that instances can be created and deleted. */
    bool hasRecords() const { return linesPerRecord != 0; }

    /**
     * Fails with CMPI_RC_ERR_FAILED and the reason if the file cannot be written now. The provider truncates a record
     * file before it notices that the disk is full.
     * @param growth the most bytes that the change adds
     */
    void requireWritable(std::size_t growth) const;

    FileState state() const;

    /** Whether the content of a record file has as many lines as its count requires. */
    bool isComplete(std::string_view content) const;

    /**
     * The number of records with an identifier; 0 for a property file. Fails with CMPI_RC_ERR_FAILED if the content is
     * not complete.
     */
    std::size_t countRecords(std::string_view content, const std::string& identifier) const;

    /** The number of records in the file as it is now; none if it is not complete. */
    std::optional<std::size_t> countRecordsIfComplete(const std::string& identifier) const;
};

/** The class's file; null for a class whose instances cannot be changed. */
const DataFile* dataFileOf(const Class& owner);

}  // namespace gate
