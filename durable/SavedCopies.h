#pragma once

#include <array>
#include <cstdint>
#include <string>
#include <string_view>

namespace durable {

/**
 * Two copies of the content of a file. Each new copy overwrites the older one, so that the newer one stays complete
 * meanwhile. Overwriting takes only one sync, since the directory does not change.
 *
 * A copy ends with a line that has its number and the file's name; a truncated copy lacks this line. All functions
 * throw std::system_error if a file cannot be read or written.
 */
class SavedCopies {
public:
    struct Copy {
        std::string path{};
        std::string content{};     ///< without the last line; empty if there is no complete copy
        std::uint64_t number = 0;  ///< one more than the number of the preceding copy
        bool isInUse = false;      ///< whether a process may have begun another change since the copy was saved
    };

    explicit SavedCopies(const std::string& itsFile)
        : file(itsFile), name(file.substr(file.rfind('/') + 1)), paths{file + ".saved1", file + ".saved2"} {}

    Copy latest() const { return byAge()[1]; }

    /** The content of the file, without the last line of a copy if it has one: a restored file may still have it. */
    std::string withoutLastLine(const std::string& content) const;

    /** Writes a copy to the disk. It has the mode, owner and group of the file. */
    void save(std::string_view content, bool isInUse) const;

    /** Replaces the file by renaming the latest copy, which needs no disk space. Removes the other copy if possible. */
    void restoreLatest() const;

    /** If the file still has the last line of a copy after restoreLatest(), removes the copies, then the line. */
    void finishRestoring() const;

private:
    Copy parse(const std::string& content) const;
    Copy read(const std::string& path) const;
    std::array<Copy, 2> byAge() const;
    std::string lastLineAfterNumber(bool isInUse) const;

    std::string file;
    std::string name;
    std::array<std::string, 2> paths;
};

}  // namespace durable
