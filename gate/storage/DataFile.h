#pragma once

#include <cstddef>
#include <filesystem>
#include <string>

#include "durable/RecordFile.h"
#include "gate/cmpi/Objects.h"

namespace gate {

/** The content and modification time of a data file, to detect whether it was written. */
struct FileState {
    std::string content;  ///< empty if the file does not exist
    std::filesystem::file_time_type modified{};
};

/**
 * A class's data file. The provider writes the file without reporting errors, so the gate checks it before and after
 * each change. Of a record file, the gate also keeps complete copies (durable/RecordFile.h).
 *
 * If a function fails, it throws Failure with CMPI_RC_ERR_FAILED or std::system_error, with the file and the reason.
 */
struct DataFile {
    const char* name;  ///< of the class
    const char* fileName;
    bool hasRecords;  ///< false for a property file, whose instances are neither created nor deleted

    /**
     * Fails if the file cannot be written now. Call it before a change, because the provider truncates a record file
     * even if the disk is full.
     * @param growth an estimate of the bytes that the change adds
     */
    void requireWritable(std::size_t growth) const;

    FileState state() const;

    durable::RecordFile records() const;

    /** Whether a record may have the identifier: the file is incomplete or has the identifier anywhere. */
    bool mayHave(const std::string& content, std::string identifier) const;

    /** @name Storing a change: begin(), then the provider writes, then commit() or rollBack() */
    ///@{
    /** Makes the content restorable. Returns the argument of rollBack(): empty for a damaged file without a copy. */
    std::string begin(const std::string& content) const;

    /**
     * Syncs a record file and a saved copy. Fails if the file is incomplete, or must differ from `before` but does not.
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
