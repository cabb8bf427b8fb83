#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace durable {

/**
 * A record file of the provider, and the files beside it that protect it. The provider truncates and rewrites a record
 * file in place, so a process or machine that ends meanwhile leaves an incomplete one.
 *
 * | File | Content |
 * |---|---|
 * | NAME.saved | the records of the last change that was answered, and a line with the file's name; always complete |
 * | NAME.unfinished | empty; exists while complete states of NAME are not those of an answered change |
 * | NAME.damaged | what recover() found in NAME and replaced |
 *
 * A change is prepare(), the provider's writing, and commit() or restore(). Functions throw std::system_error if a file
 * cannot be read or written. Only the owner of the directory may call those that write.
 */
class RecordFile {
public:
    /** @param linesPerRecord after the first line, which is the number of records */
    RecordFile(const std::string& directory, const char* fileName, std::size_t linesPerRecord);

    const std::string& path() const { return file; }

    /** The content; none if there is no file. */
    std::optional<std::string> content() const;

    /** The number of records that the first line promises; none if it is not an unsigned 32-bit number. */
    static std::optional<std::size_t> promisedIn(std::string_view content);

    /** The number of records whose lines are all there. */
    std::size_t presentIn(std::string_view content) const;

    /** Whether the content has the promised records and its last line ends. Later lines do not matter. */
    bool isComplete(std::string_view content) const;

    /**
     * Ensures that the saved copy has the current records. For a file that is not complete, those are the records of
     * the copy that exists; a missing or empty file has none.
     * @return what restore() needs; empty for an incomplete file without a copy
     */
    std::string prepare() const;

    /** Marks a change that writes the file more than once, so that no state between is taken for the last one. */
    void markUnfinished() const;

    /**
     * Writes the file to the disk, then its records to the saved copy. After that the change may be answered.
     * @param written the content, which is complete
     */
    void commit(std::string_view written) const;

    /** Makes the file what it was before a change. @param before the result of prepare(), not empty */
    void restore(const std::string& before) const;

    /** Whether the file is incomplete or unfinished, and recover() can restore it. */
    bool needsRecovery() const;

    /**
     * Restores an incomplete or unfinished file from the saved copy. Without a saved copy, keeps a copy of it.
     * Call it before the provider is loaded, which reads its files then.
     * @return what was wrong and what was done, for the log; empty if nothing was wrong
     */
    std::string recover() const;

private:
    std::string savedContent() const;
    void save(std::string_view records) const;
    void useSaved(std::size_t size) const;
    std::string countsOf(std::string_view content) const;

    std::string name;
    std::string file;
    std::string saved;
    std::string unfinished;
    std::string damaged;
    std::string lastLine;  ///< of the saved copy, which shows whose it is and that it is complete
    std::size_t lines;     ///< per record
};

/** The record files of a data directory, whose name ends with a separator. */
std::vector<RecordFile> recordFilesIn(const std::string& directory);

/** One of them, by its name. */
RecordFile recordFileIn(const std::string& directory, std::string_view fileName);

}  // namespace durable
