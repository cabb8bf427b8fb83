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

/** The position of the last line of a copy; the end if there is none. */
std::size_t lastLineOf(const std::string& content) {
    constexpr std::size_t maximumSize = 512;
    const std::size_t start = content.size() - std::min(content.size(), maximumSize);
    const std::size_t found = std::string_view(content).substr(start).rfind(beginningOfLastLine);
    return found == std::string_view::npos ? content.size() : start + found;
}

}  // namespace

std::string SavedCopies::lastLine(const Copy& copy) const {
    return std::string(beginningOfLastLine) + std::to_string(copy.number) + " of " + name +
           (copy.isUnfinished ? " before an unfinished change" : "") + "\n";
}

/** The parts of a copy's content, without its path. Empty if it is not complete. */
SavedCopies::Copy SavedCopies::parse(std::string content) const {
    const std::size_t start = lastLineOf(content);
    const char* number = content.data() + std::min(start + beginningOfLastLine.size(), content.size());
    Copy copy;
    std::from_chars(number, content.data() + content.size(), copy.number);
    copy.isUnfinished = content.substr(start) != lastLine(copy);
    const bool hasHoles = content.find('\0') != std::string::npos;  // left by a file system that lost power
    if (hasHoles || content.substr(start) != lastLine(copy)) {
        return {};
    }
    content.resize(start);
    copy.content = std::move(content);
    return copy;
}

SavedCopies::Copy SavedCopies::read(const std::string& path) const {
    Copy copy = parse(readFile(path).value_or(std::string()));
    copy.path = path;
    return copy;
}

std::string SavedCopies::withoutLastLine(std::string content) const {
    const std::size_t start = lastLineOf(content);
    const bool isCopy = start != content.size() && !parse(content).content.empty();
    content.resize(isCopy ? start : content.size());
    return content;
}

/** Both copies, the older one first. */
std::array<SavedCopies::Copy, 2> SavedCopies::byAge() const {
    std::array<Copy, 2> copies{read(paths[0]), read(paths[1])};
    if (copies[0].number > copies[1].number) {
        std::swap(copies[0], copies[1]);
    }
    return copies;
}

void SavedCopies::save(std::string_view content, bool isUnfinished) const {
    const auto [older, last] = byAge();
    if (older.content.empty()) {  // then its name may not be on the disk
        createFile(older.path, 0600);
        syncDirectoryOf(older.path);
    }
    overwriteFile(older.path, std::string(content) + lastLine({{}, {}, last.number + 1, isUnfinished}), file);
}

void SavedCopies::restoreLatest() const {
    const Copy last = latest();
    syncFile(last.path);  // it may be of a process that has ended before
    renameFile(last.path, file);
    syncDirectoryOf(file);
    try {
        finishRestoring();
    } catch (const std::exception&) {
        return;  // the last line does not matter
    }
}

/** The last line is removed after the older copy: until then, it proves that the file is newer. */
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
