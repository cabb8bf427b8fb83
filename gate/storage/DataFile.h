#pragma once

#include <cstddef>
#include <filesystem>
#include <string>

#include "durable/RecordFile.h"
#include "gate/cmpi/Objects.h"

namespace gate {

/** The content of a data file and the time of its last change, which are compared. */
struct FileState {
    std::string content;  ///< empty if the file does not exist
    std::filesystem::file_time_type modified{};
};

/**
 * A class's data file. The provider writes it and does not report errors, so the gate checks it around each change, and
 * keeps a copy of a record file that is always complete (durable/RecordFile.h).
 *
 * Functions fail with CMPI_RC_ERR_FAILED, the file and the reason, or throw std::system_error with these.
 */
struct DataFile {
    const char* name;  ///< of the class
    const char* fileName;
    bool hasRecords;  ///< false for a property file, whose instances are neither created nor deleted

    /**
     * Fails if the file cannot be written now. The provider truncates a record file before it notices that the disk is
     * full.
     * @param growth the most bytes that the change adds
     */
    void requireWritable(std::size_t growth) const;

    FileState state() const;

    durable::RecordFile records() const;

    /** Whether a record may have the identifier: the record file is incomplete or contains the identifier. */
    bool mayHave(const std::string& content, std::string identifier) const;

    /** @name Storing a change: begin(), the provider's writing, then commit() or rollBack() */
    ///@{
    /** Makes the content restorable. Returns what rollBack() needs; empty for a damaged record file without a copy. */
    std::string begin(const std::string& content) const;

    /**
     * Syncs the file and the saved copy. Fails if the file is incomplete, or must differ from a state but does not.
     * @param identifier of a record that the file must have; null for none
     */
    void commit(const FileState& before, bool mustDiffer, const std::string* identifier = nullptr) const;

    /** Restores the content. @param before the result of begin() */
    void rollBack(const std::string& before) const;
    ///@}
};

/** The class's file; null for a class whose instances cannot be changed. */
const DataFile* dataFileOf(const Class& requested);

}  // namespace gate
