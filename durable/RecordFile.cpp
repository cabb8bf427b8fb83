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
#include <sstream>
#include <stdexcept>
#include <system_error>

#include "Files.h"

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

/** The words of a file, at which the provider splits it. */
std::vector<std::string> wordsIn(std::string_view content) {
    std::istringstream stream{std::string(content)};
    return {std::istream_iterator<std::string>(stream), std::istream_iterator<std::string>()};
}

std::string withoutLeadingZeros(const std::string& word) {
    const bool isNumber = word.find_first_not_of("0123456789", word[0] == '+' ? 1 : 0) == std::string::npos;
    return isNumber ? word.substr(std::min(word.find_first_not_of("+0"), word.size() - 1)) : word;
}

/** Whether the provider, which has read a word, may write it as another one. */
bool mayBecome(const std::string& read, const std::string& written) {
    constexpr std::string_view noDate = "00000000000000.000000-000";
    return withoutLeadingZeros(read) == withoutLeadingZeros(written) || (read.size() == 1 && written == "*") ||
           (read.size() < noDate.size() && written == noDate);
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
      file(resolvedPath(directory + name)),
      damaged(file + ".damaged"),
      copies(file),
      lines(linesPerRecord) {}

std::optional<std::string> RecordFile::content() const {
    auto found = readFile(file);
    return found ? std::optional<std::string>(copies.withoutLastLine(*std::move(found))) : std::nullopt;
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

bool RecordFile::addsOneRecord(std::string_view content, std::string_view former) const {
    if (former.empty()) {
        return false;
    }
    const std::size_t count = promisedIn(former).value_or(0);
    const std::vector<std::string> before = wordsIn(former);
    const std::vector<std::string> now = wordsIn(content);
    const std::size_t size = std::min({1 + count * lines, before.size(), now.size()});
    const auto end = before.begin() + static_cast<std::ptrdiff_t>(size);
    return promisedIn(content) == count + 1 && std::equal(before.begin() + 1, end, now.begin() + 1, mayBecome);
}

SavedCopies::Copy RecordFile::savedCopy() const {
    SavedCopies::Copy copy = copies.latest();
    copy.content.resize(isComplete(copy.content) ? copy.content.size() : 0);
    return copy;
}

std::string RecordFile::prepare(const std::string& current, bool hasSteps) const {
    const SavedCopies::Copy copy = savedCopy();
    const bool isNew = current.empty() && copy.content.empty();
    const std::string records = isComplete(current) ? current : isNew ? "0\n" : copy.content;
    if (isNew) {
        createFile(file, 0666);
    }
    if (!records.empty() && (records != copy.content || copy.isUnfinished || hasSteps)) {
        copies.save(records, hasSteps);
    }
    return records;
}

void RecordFile::commit(std::string_view written) const {
    syncFile(file);
    copies.save(written, false);
}

void RecordFile::restore(const std::string& before) const {
    const bool isRestored = content() == before;
    const SavedCopies::Copy copy = savedCopy();
    if (copy.content != before || (isRestored && copy.isUnfinished)) {
        copies.save(before, false);
    }
    if (!isRestored) {
        copies.restoreLatest();
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
    const bool isUnfinished = !isRestored && copy.isUnfinished && addsOneRecord(current, copy.content);
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
            syncFile(copy.path);  // it may be of a process that has ended before
        }
        copies.finishRestoring();
        return {};
    }
    const std::string restored = restoreSaved();
    if (!restored.empty()) {
        return state + " " + restored;
    }
    const std::string current = content().value_or(std::string());
    if (current.empty() || isComplete(current)) {
        return {};
    }
    const bool isKept = access(file.substr(0, file.rfind('/') + 1).c_str(), W_OK) == 0;
    if (isKept) {
        replaceFile(damaged, current, file);
    }
    return state + " There is no saved copy." + (isKept ? " A copy of it is kept as " + damaged + "." : "");
}

void RecordFile::replace(std::string_view records) const {
    prepare(content().value_or(std::string()), false);
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
