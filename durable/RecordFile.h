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
 * file in place, so a process or machine that ends meanwhile leaves an incomplete one.
 *
 * | File | Content |
 * |---|---|
 * | NAME.saved1, NAME.saved2 | copies; the newer one has the records after the last answered change |
 * | NAME.damaged | the last content of NAME that the saved copy replaced, or that could not be restored |
 *
 * A change is prepare(), the provider's writing, and commit() or restore(). Functions throw std::system_error if a file
 * cannot be read or written. Only the owner of the directory may call those that write.
 */
class RecordFile {
public:
    /** @param newRecord the lines of a record without values, from the end of its identifier */
    RecordFile(const std::string& directory, const char* fileName, const std::string& newRecord);

    /** The path of the file, or of its target if it is a symbolic link. */
    const std::string& path() const { return file; }

    /** The content, without the last line of a copy that was restored; none if there is no file. */
    std::optional<std::string> content() const;

    /** The number of records that the first line promises; none if it is not an unsigned 32-bit number. */
    static std::optional<std::size_t> declaredIn(std::string_view content);

    /** The number of records whose lines are all there. */
    std::size_t presentIn(std::string_view content) const;

    /** Whether the content has the declared records and its last line ends. Later lines do not matter. */
    bool isComplete(std::string_view content) const;

    /**
     * Ensures that the latest copy has the current records: those of the file or, if that is incomplete, of the
     * existing copy. A missing or empty file without a copy has none, and is created. From then until finish(), the
     * copies are in use: recover() discards a record without values that was added since, because the provider writes
     * such a record before its values.
     * @param current the content of the file; empty if there is none
     * @return what restore() needs; empty for an incomplete file without a copy
     */
    std::string prepare(const std::string& current) const;

    /**
     * Writes the file to the disk, then its records to a copy. After that the change may be answered.
     * @param written the content, which is complete
     */
    void commit(std::string_view written) const;

    /** Restores the file after a change. @param before the result of prepare(), not empty */
    void restore(const std::string& before) const;

    /** Marks the copies as no longer in use, if they have the records of the file. */
    void finish() const;

    /** A sentence about a file that is missing, incomplete or has an intermediate state; empty for another one. */
    std::string defect() const;

    /** Whether the file or a copy has content. Otherwise the provider's records, if any, are only in memory. */
    bool isStored() const;

    /** Whether the file has a defect, and there is a copy. */
    bool needsRecovery() const;

    /** The newer copy. Without a complete one, its content is empty. */
    SavedCopies::Copy savedCopy() const;

    /**
     * Replaces the file, complete or not, by the saved copy, and keeps it as NAME.damaged.
     * @return a message with the time of the copy; empty, and nothing is changed, if there is no complete copy
     */
    std::string restoreSaved() const;

    /**
     * Restores a file that needsRecovery() from the saved copy. Without a saved copy, keeps a copy of an incomplete
     * file that is not empty. Ends a restoration and the writing of a copy that an earlier process has not ended. Call
     * it before the provider is loaded and reads its files.
     * @return a message for the log; empty if the file was complete
     */
    std::string recover() const;

    /**
     * Replaces the content of a file without defect: at any time, it has the old or the new records. Until the next
     * change, the saved copy has the old ones, and is not in use.
     */
    void replace(std::string_view records) const;

private:
    /** The same as prepare(). @param isInUse whether changes follow */
    std::string save(const std::string& current, bool isInUse) const;

    /** Whether a content has one more record than another one, without values at its end. */
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
