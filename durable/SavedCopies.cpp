#include "SavedCopies.h"

#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <charconv>
#include <exception>
#include <utility>

#include "Files.h"

namespace durable {

namespace {

constexpr std::string_view beginningOfLastLine = "saved copy ";

/** Removes a suffix from a string. Returns false if the string does not have the suffix. */
bool removeEnd(std::string_view& content, std::string_view end) {
    const std::size_t start = content.size() - std::min(content.size(), end.size());
    const bool hasEnd = content.substr(start) == end;
    content.remove_suffix(hasEnd ? end.size() : 0);
    return hasEnd;
}

}  // namespace

std::string SavedCopies::lastLineAfterNumber(bool isInUse) const {
    return " of " + name + (isInUse ? ", in use" : "") + "\n";
}

/** The copy that has this file content; empty if the content is incomplete. Does not set the path. */
SavedCopies::Copy SavedCopies::parse(const std::string& content) const {
    Copy copy;
    std::string_view records = content;
    copy.isInUse = removeEnd(records, lastLineAfterNumber(true));
    const bool hasHoles = content.find('\0') != std::string::npos;  // left by a power failure
    if (hasHoles || (!copy.isInUse && !removeEnd(records, lastLineAfterNumber(false)))) {
        return {};
    }
    const std::string_view number = records.substr(records.find_last_not_of("0123456789") + 1);
    const bool isNumber = std::from_chars(number.begin(), number.end(), copy.number).ec == std::errc();
    records.remove_suffix(number.size());
    if (!isNumber || !removeEnd(records, beginningOfLastLine)) {
        return {};
    }
    copy.content = records;
    return copy;
}

SavedCopies::Copy SavedCopies::read(const std::string& path) const {
    Copy copy = parse(readFile(path).value_or(std::string()));
    copy.path = path;
    return copy;
}

std::string SavedCopies::withoutLastLine(const std::string& content) const {
    const Copy copy = parse(content);
    return copy.content.empty() ? content : copy.content;
}

/** Both copies, the older one first. */
std::array<SavedCopies::Copy, 2> SavedCopies::byAge() const {
    std::array<Copy, 2> copies{read(paths[0]), read(paths[1])};
    if (copies[0].number > copies[1].number) {
        std::swap(copies[0], copies[1]);
    }
    return copies;
}

void SavedCopies::save(std::string_view content, bool isInUse) const {
    const auto [older, last] = byAge();
    if (older.content.empty()) {  // its name may be missing on the disk
        createFile(older.path, 0600);
        syncDirectoryOf(older.path);
    }
    const std::string lastLine =
        std::string(beginningOfLastLine) + std::to_string(last.number + 1) + lastLineAfterNumber(isInUse);
    overwriteFile(older.path, std::string(content) + lastLine, file);
}

void SavedCopies::restoreLatest() const {
    const Copy last = latest();
    syncFile(last.path);  // the process that wrote it may have ended before it synced it
    renameFile(last.path, file);
    syncDirectoryOf(file);
    try {
        finishRestoring();
    } catch (const std::exception&) {
        return;  // readers ignore the last line
    }
}

/** Removes the last line after the older copy: until then, the line shows that the file is newer than the copy. */
void SavedCopies::finishRestoring() const {
    const std::string content = readFile(file).value_or(std::string());
    const std::size_t size = withoutLastLine(content).size();
    if (size == content.size()) {
        return;
    }
    syncFile(file);
    const bool isAlone = std::all_of(paths.begin(), paths.end(), [](const std::string& path) {
        return unlink(path.c_str()) == 0 || errno == ENOENT;
    });
    syncDirectoryOf(file);
    const bool isFinished = isAlone && truncate(file.c_str(), static_cast<off_t>(size)) == 0;
    static_cast<void>(isFinished);
}

}  // namespace durable
