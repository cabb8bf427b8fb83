#pragma once

#include <array>
#include <cstdint>
#include <string>
#include <string_view>

namespace durable {

/**
 * Two copies of the content of a file. Each new copy overwrites the older one, so that the other one is complete
 * meanwhile. This takes one sync, since the names on the disk stay the same.
 *
 * A copy ends with a line that has its number and the file's name; a copy that was cut lacks it. All functions throw
 * std::system_error if a file cannot be read or written.
 */
class SavedCopies {
public:
    struct Copy {
        std::string path{};
        std::string content{};     ///< without the last line; empty if there is no complete copy
        std::uint64_t number = 0;  ///< one more than that of the preceding copy
        bool isInUse = false;      ///< whether a process may have begun another change since
    };

    explicit SavedCopies(const std::string& itsFile)
        : file(itsFile), name(file.substr(file.rfind('/') + 1)), paths{file + ".saved1", file + ".saved2"} {}

    Copy latest() const { return byAge()[1]; }

    /** The content without the last line of a copy, which a restored file may still have. */
    std::string withoutLastLine(const std::string& content) const;

    /** Writes a copy to the disk. It has the mode, owner and group of the file. */
    void save(std::string_view content, bool isInUse) const;

    /** Makes the latest copy the file, which needs no disk space. Removes the other one if possible. */
    void restoreLatest() const;

    /** Removes the copies and then the last line of the file, if it has one: restoreLatest() was not finished. */
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
