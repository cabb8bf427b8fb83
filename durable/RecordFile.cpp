#include "RecordFile.h"

#include "Files.h"

#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <cstdint>
#include <ctime>
#include <iterator>
#include <stdexcept>
#include <system_error>

namespace durable {

namespace {

constexpr struct {
    const char* fileName;
    std::size_t linesPerRecord;
} formats[recordFileCount] = {{"Lease.dat", 13}, {"Warranty.dat", 4}};

/** The content without the white space at its beginning, which the provider skips. */
std::string_view withoutLeadingSpace(std::string_view content) {
    return content.substr(std::min(content.find_first_not_of(" \t\n\v\f\r"), content.size()));
}

/** The number of lines that end. */
std::size_t endedLinesIn(std::string_view content) {
    return static_cast<std::size_t>(std::count(content.begin(), content.end(), '\n'));
}

bool endsWith(std::string_view content, std::string_view end) {
    return content.size() >= end.size() && content.substr(content.size() - end.size()) == end;
}

std::string timeOf(const std::string& path) {
    struct stat status {};
    std::tm fields{};
    std::array<char, 32> text{};
    if (stat(path.c_str(), &status) == 0 && gmtime_r(&status.st_mtime, &fields) != nullptr) {
        std::strftime(text.data(), text.size(), "%FT%TZ", &fields);
    }
    return text.data();
}

}  // namespace

RecordFile::RecordFile(const std::string& directory, const char* fileName, std::size_t linesPerRecord)
    : name(fileName),
      file(directory + name),
      saved(file + ".saved"),
      unfinished(file + ".unfinished"),
      damaged(file + ".damaged"),
      lastLine("saved copy of " + name + "\n"),
      lines(linesPerRecord) {}

std::optional<std::string> RecordFile::content() const {
    return readFile(file);
}

std::optional<std::size_t> RecordFile::promisedIn(std::string_view content) {
    std::string_view number = withoutLeadingSpace(content);
    number.remove_prefix(number.substr(0, 1) == "+" ? 1 : 0);
    std::uint32_t count = 0;
    const auto error = std::from_chars(number.data(), number.data() + number.size(), count).ec;
    return error == std::errc() ? std::optional<std::size_t>(count) : std::nullopt;
}

std::size_t RecordFile::presentIn(std::string_view content) const {
    const std::size_t ended = endedLinesIn(withoutLeadingSpace(content));
    return std::min(promisedIn(content).value_or(0), ended == 0 ? 0 : (ended - 1) / lines);
}

bool RecordFile::isComplete(std::string_view content) const {
    const auto promised = promisedIn(content);
    const bool hasHoles = content.find('\0') != std::string_view::npos;  // left by a file system that lost power
    const bool hasEnd = promised == 0U || endsWith(content, "\n");
    return promised && !hasHoles && hasEnd && presentIn(content) == *promised;
}

/** The records of the saved copy; empty if it cannot be used. */
std::string RecordFile::savedContent() const {
    std::string records = readFile(saved).value_or(std::string());
    const bool isCopy = endsWith(records, lastLine);
    records.resize(isCopy ? records.size() - lastLine.size() : 0);
    return isComplete(records) ? records : std::string();
}

void RecordFile::save(std::string_view records) const {
    replaceFile(saved, std::string(records) + lastLine, file);
    syncDirectoryOf(file);
}

std::string RecordFile::prepare() const {
    const std::string current = content().value_or(std::string());
    const std::string copy = savedContent();
    const std::string records = isComplete(current) ? current : !copy.empty() || !current.empty() ? copy : "0\n";
    if (!records.empty() && records != copy) {
        save(records);
    }
    return records;
}

void RecordFile::markUnfinished() const {
    createFile(unfinished);
    syncDirectoryOf(file);
}

void RecordFile::commit(std::string_view written) const {
    syncFile(file);
    save(written);
    removeFile(unfinished);
}

void RecordFile::restore(const std::string& before) const {
    if (content() == before) {
        return removeFile(unfinished);
    }
    if (savedContent() != before) {
        save(before);
    }
    useSaved(before.size());
}

/**
 * Renames the saved copy to the record file, which needs no disk space. The next change makes another copy first. The
 * directory is synced before the file is shortened: until the new name is on the disk, the copy must stay complete.
 */
void RecordFile::useSaved(std::size_t size) const {
    renameFile(saved, file);
    syncDirectoryOf(file);
    removeFile(unfinished);
    const bool isShort = truncate(file.c_str(), static_cast<off_t>(size)) == 0;
    static_cast<void>(isShort);  // the last line of the copy does not matter
}

std::string RecordFile::defect() const {
    const auto current = content();
    if (!current) {
        return name + " was missing.";
    }
    if (!isComplete(*current)) {
        return name + countsOf(*current);
    }
    return readFile(unfinished) ? name + " held an unfinished change." : "";
}

bool RecordFile::needsRecovery() const {
    return !defect().empty() && !savedContent().empty();
}

std::string RecordFile::restoreSaved() const {
    const std::size_t size = savedContent().size();
    if (size == 0) {
        return {};
    }
    const std::string time = timeOf(saved);
    if (!content().value_or(std::string()).empty()) {
        renameFile(file, damaged);
    }
    useSaved(size);
    return "It was restored from the saved copy of " + time + ".";
}

std::string RecordFile::recover() const {
    const std::string state = defect();
    if (state.empty()) {
        return {};
    }
    const std::string restored = restoreSaved();
    if (!restored.empty()) {
        return state + " " + restored;
    }
    removeFile(unfinished);
    const auto current = content();
    if (!current || isComplete(*current)) {
        return {};
    }
    const bool isKept = access(file.substr(0, file.rfind('/') + 1).c_str(), W_OK) == 0;
    if (isKept) {
        replaceFile(damaged, *current, file);
    }
    return state + " There is no saved copy." + (isKept ? " A copy of it is kept as " + damaged + "." : "");
}

void RecordFile::replace(std::string_view records) const {
    prepare();
    replaceFile(file, records, file);
    syncDirectoryOf(file);
}

std::string RecordFile::countsOf(std::string_view content) const {
    const auto promised = promisedIn(content);
    return promised ? " was incomplete (records promised: " + std::to_string(*promised) +
                          ", present: " + std::to_string(presentIn(content)) + ")."
                    : " had no count of records.";
}

std::vector<RecordFile> recordFilesIn(const std::string& directory) {
    std::vector<RecordFile> files;
    for (const auto& each : formats) {
        files.emplace_back(directory, each.fileName, each.linesPerRecord);
    }
    return files;
}

RecordFile recordFileIn(const std::string& directory, std::string_view fileName) {
    const auto* found = std::find_if(std::begin(formats), std::end(formats),
                                     [&](const auto& each) { return fileName == each.fileName; });
    if (found == std::end(formats)) {
        throw std::invalid_argument(std::string(fileName));
    }
    return {directory, found->fileName, found->linesPerRecord};
}

}  // namespace durable
