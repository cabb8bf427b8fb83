#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "SavedCopies.h"

namespace durable {

/**
 * A record file of the provider, and the files beside it that protect it. The provider truncates and rewrites a record
 * file in place, so a process that is killed meanwhile, or a power failure, leaves an incomplete file.
 *
 * | File | Content |
 * |---|---|
 * | NAME.saved1, NAME.saved2 | copies; the newer one has the records after the last change that was answered OK |
 * | NAME.damaged | the last content of NAME that the saved copy replaced, or that could not be restored |
 *
 * A change consists of prepare(), a write by the provider, and commit() or restore(). Functions throw std::system_error
 * if a file cannot be read or written. Only the owner of the directory may call functions that write.
 */
class RecordFile {
public:
    /** @param newRecord the characters that follow the identifier in a record without values */
    RecordFile(const std::string& directory, const char* fileName, const std::string& newRecord);

    /** The path of the file, or of its target if it is a symbolic link. */
    const std::string& path() const { return file; }

    /** The content; none if there is no file. Omits the last line of a restored copy. */
    std::optional<std::string> content() const;

    /** The number of records that the first line declares; none if it has no unsigned 32-bit number. */
    static std::optional<std::size_t> declaredIn(std::string_view content);

    /** The number of declared records whose lines are all present. */
    std::size_t presentIn(std::string_view content) const;

    /** Whether the content has all declared records, no null bytes and a line feed at its end. Ignores extra lines. */
    bool isComplete(std::string_view content) const;

    /**
     * Ensures that the latest copy has the current records: those of the file or, if the file is incomplete, of the
     * existing copy. If there is neither a content nor a copy, saves a copy without records, and creates a missing
     * file. From then until finish(), the copies are in use: recover() discards a last record without values that the
     * copy lacks, because the provider writes a new record before its values.
     * @param current the content of the file; empty if there is none
     * @return the argument for restore(); empty for an incomplete file without a copy
     */
    std::string prepare(const std::string& current) const;

    /**
     * Syncs the file, then saves a copy. After that, the change can be answered.
     * @param written the content of the file, which is complete
     */
    void commit(std::string_view written) const;

    /** Rolls a change of the file back. @param before the result of prepare(), not empty */
    void restore(const std::string& before) const;

    /** Marks the copies as no longer in use, if the newer one has the records of the file. */
    void finish() const;

    /** A message that the file is missing, is incomplete or has an unfinished change; empty if it has no defect. */
    std::string defect() const;

    /** Whether the file or a copy has content. Otherwise the provider's records, if any, are only in memory. */
    bool isStored() const;

    /** Whether the file has a defect, and there is a copy. */
    bool needsRecovery() const;

    /** The newer copy. Its content is empty if there is no complete copy. */
    SavedCopies::Copy savedCopy() const;

    /**
     * Replaces the file, complete or not, by the saved copy. Keeps the former file as NAME.damaged, unless it is empty.
     * Does nothing if there is no complete copy.
     * @return a message with the time of the copy; empty if there is none
     */
    std::string restoreSaved() const;

    /**
     * Restores a file that needsRecovery() from the saved copy. Without a saved copy, keeps an incomplete file that is
     * not empty also as NAME.damaged. Finishes a restoration and the sync of a copy that an earlier process has left
     * unfinished. Call it before the provider is loaded and reads its files.
     * @return a message for the log; empty if the file was complete, or if there is neither a file nor a copy
     */
    std::string recover() const;

    /**
     * Replaces the records of a file that has no defect. At any time, the file has either the old or the new records.
     * Until the next change, the saved copy has the old records, and is not in use.
     */
    void replace(std::string_view records) const;

private:
    /** Implements prepare(). @param isInUse whether changes follow */
    std::string save(const std::string& current, bool isInUse) const;

    /** Whether the content declares one more record than the former content, and its last record has no values. */
    bool addsNewRecord(std::string_view content, std::string_view former) const;

    std::string countsOf(std::string_view content) const;

    std::string name;
    std::string file;
    std::string damaged;
    SavedCopies copies;
    std::string endOfNewRecord;
    std::size_t lines;  ///< per record
};

/** The number of record files in a data directory. */
constexpr std::size_t recordFileCount = 2;

/** The record files of a data directory, whose name ends with a separator. */
std::vector<RecordFile> recordFilesIn(const std::string& directory);

/** The record file of this name. */
RecordFile recordFileIn(const std::string& directory, std::string_view fileName);

}  // namespace durable
