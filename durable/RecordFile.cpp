#include "RecordFile.h"

#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <charconv>
#include <cstdint>
#include <ctime>
#include <iterator>
#include <stdexcept>
#include <system_error>

#include "Files.h"
#include "cim/DateTime.h"

namespace durable {

namespace {

struct Format {
    const char* fileName;
    const char* afterDate;  ///< the lines after the date in a record without values
};

constexpr Format formats[recordFileCount] = {
    {"Lease.dat", "0\n0\n0\n0\n0\n*\n*\n*\n*\n0\n"},
    {"Warranty.dat", "0\n"},
};

RecordFile fileOf(const std::string& directory, const Format& format) {
    return {directory, format.fileName, "\n*\n" + std::string(cim::noDate) + "\n" + format.afterDate};
}

/** The content without the white space at its beginning, which the provider skips. */
std::string_view withoutLeadingSpace(std::string_view content) {
    return content.substr(std::min(content.find_first_not_of(" \t\n\v\f\r"), content.size()));
}

/** The number of lines that end with a line feed. */
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

RecordFile::RecordFile(const std::string& directory, const char* fileName, const std::string& newRecord)
    : name(fileName),
      file(resolvedPath(directory + name)),
      damaged(file + ".damaged"),
      copies(file),
      endOfNewRecord(newRecord),
      lines(endedLinesIn(newRecord)) {}

std::optional<std::string> RecordFile::content() const {
    const auto found = readFile(file);
    return found ? std::optional<std::string>(copies.withoutLastLine(*found)) : std::nullopt;
}

std::optional<std::size_t> RecordFile::declaredIn(std::string_view content) {
    std::string_view number = withoutLeadingSpace(content);
    number.remove_prefix(number.substr(0, 1) == "+" ? 1 : 0);
    std::uint32_t count = 0;
    const auto error = std::from_chars(number.data(), number.data() + number.size(), count).ec;
    return error == std::errc() ? std::optional<std::size_t>(count) : std::nullopt;
}

std::size_t RecordFile::presentIn(std::string_view content) const {
    const std::size_t ended = endedLinesIn(withoutLeadingSpace(content));
    return std::min(declaredIn(content).value_or(0), ended == 0 ? 0 : (ended - 1) / lines);
}

bool RecordFile::isComplete(std::string_view content) const {
    const auto declared = declaredIn(content);
    const bool hasHoles = content.find('\0') != std::string_view::npos;  // left by a power failure
    const bool hasEnd = declared == 0U || endsWith(content, "\n");
    return declared && !hasHoles && hasEnd && presentIn(content) == *declared;
}

bool RecordFile::addsNewRecord(std::string_view content, std::string_view former) const {
    return !former.empty() && declaredIn(content) == declaredIn(former).value_or(0) + 1 &&
           endsWith(content, endOfNewRecord);
}

SavedCopies::Copy RecordFile::savedCopy() const {
    SavedCopies::Copy copy = copies.latest();
    copy.content.resize(isComplete(copy.content) ? copy.content.size() : 0);
    return copy;
}

std::string RecordFile::prepare(const std::string& current) const {
    return save(current, true);
}

std::string RecordFile::save(const std::string& current, bool isInUse) const {
    const SavedCopies::Copy copy = savedCopy();
    const bool isNew = current.empty() && copy.content.empty();
    std::string records = isComplete(current) ? current : isNew ? "0\n" : copy.content;
    if (isNew) {
        createFile(file, 0666);
    }
    if (!records.empty() && (records != copy.content || isInUse != copy.isInUse)) {
        copies.save(records, isInUse);
    }
    return records;
}

void RecordFile::commit(std::string_view written) const {
    syncFile(file);
    copies.save(written, true);
}

void RecordFile::restore(const std::string& before) const {
    if (savedCopy().content != before) {
        copies.save(before, true);
    }
    if (content() != before) {
        copies.restoreLatest();
    }
}

void RecordFile::finish() const {
    const SavedCopies::Copy copy = savedCopy();
    if (copy.isInUse && content() == copy.content) {
        copies.save(copy.content, false);
    }
}

std::string RecordFile::defect() const {
    const auto found = readFile(file);
    if (!found) {
        return name + " was missing.";
    }
    const std::string current = copies.withoutLastLine(*found);
    if (!isComplete(current)) {
        return name + countsOf(current);
    }
    const SavedCopies::Copy copy = savedCopy();
    const bool isRestored = current.size() != found->size();
    const bool isUnfinished = !isRestored && copy.isInUse && addsNewRecord(current, copy.content);
    return isUnfinished ? name + " held an unfinished change." : "";
}

bool RecordFile::isStored() const {
    struct stat status {};
    const bool hasContent = stat(file.c_str(), &status) == 0 ? status.st_size != 0 : errno != ENOENT;
    return hasContent || !savedCopy().content.empty();
}

bool RecordFile::needsRecovery() const {
    return !savedCopy().content.empty() && !defect().empty();
}

std::string RecordFile::restoreSaved() const {
    const SavedCopies::Copy copy = savedCopy();
    if (copy.content.empty()) {
        return {};
    }
    if (!content().value_or(std::string()).empty()) {
        renameFile(file, damaged);
    }
    const std::string time = timeOf(copy.path);
    copies.restoreLatest();
    return "It was restored from the saved copy of " + time + ".";
}

std::string RecordFile::recover() const {
    const std::string state = defect();
    if (state.empty()) {
        if (const SavedCopies::Copy copy = savedCopy(); !copy.content.empty()) {
            syncFile(copy.path);  // the process that wrote it may have ended before it synced it
        }
        copies.finishRestoring();
        return {};
    }
    const std::string restored = restoreSaved();
    if (!restored.empty()) {
        return state + " " + restored;
    }
    const std::optional<std::string> current = content();
    if (!current || isComplete(*current)) {
        return {};
    }
    const bool isKept = !current->empty() && access(file.substr(0, file.rfind('/') + 1).c_str(), W_OK) == 0;
    if (isKept) {
        replaceFile(damaged, *current, file);
    }
    return state + " There is no saved copy." + (isKept ? " A copy of it is kept as " + damaged + "." : "");
}

void RecordFile::replace(std::string_view records) const {
    save(content().value_or(std::string()), false);
    replaceFile(file, records, file);
    syncDirectoryOf(file);
}

std::string RecordFile::countsOf(std::string_view content) const {
    const auto declared = declaredIn(content);
    return declared ? " was incomplete (records declared: " + std::to_string(*declared) +
                          ", present: " + std::to_string(presentIn(content)) + ")."
                    : " had no count of records.";
}

std::vector<RecordFile> recordFilesIn(const std::string& directory) {
    std::vector<RecordFile> files;
    for (const Format& each : formats) {
        files.push_back(fileOf(directory, each));
    }
    return files;
}

RecordFile recordFileIn(const std::string& directory, std::string_view fileName) {
    const auto* found = std::find_if(std::begin(formats), std::end(formats),
                                     [&](const Format& each) { return fileName == each.fileName; });
    if (found == std::end(formats)) {
        throw std::invalid_argument(std::string(fileName));
    }
    return fileOf(directory, *found);
}

}  // namespace durable
