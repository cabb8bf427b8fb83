#include "DataFile.h"

#include "KO/PlatformUtilities.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/statvfs.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <charconv>
#include <fstream>
#include <iterator>
#include <system_error>

namespace gate {

namespace {

constexpr DataFile dataFiles[] = {
    {"VELKO_Lease", "Lease.dat", 13},
    {"VELKO_Warranty", "Warranty.dat", 4},
    {"VELKO_AssetIDDetails", "asset.dat", 0},
};

std::string pathOf(const DataFile& file) {
    return std::string(KO::PlatformUtilities::getKelsaDataDir()) + file.fileName;
}

[[noreturn]] void failToStore(const std::string& path, const std::string& reason) {
    fail(CMPI_RC_ERR_FAILED, "The change cannot be stored in " + path + ": " + reason + ".");
}

std::string reasonOf(int error) {
    return std::generic_category().message(error);
}

/** Whether the file exists. Fails if it cannot be written or is not a regular file. */
bool existsWritable(const std::string& path) {
    const int descriptor = open(path.c_str(), O_RDWR | O_CLOEXEC | O_NONBLOCK);
    if (descriptor < 0 && errno != ENOENT) {
        failToStore(path, reasonOf(errno));
    }
    if (descriptor < 0) {
        return false;
    }
    struct stat status {};
    const bool isRegular = fstat(descriptor, &status) == 0 && S_ISREG(status.st_mode);
    close(descriptor);
    if (!isRegular) {
        failToStore(path, "it is not a regular file");
    }
    return true;
}

/** Whether the file system has room for the file's growth and for a block that is partly used. */
bool hasRoom(const std::string& directory, std::size_t growth) {
    constexpr std::size_t block = 4096;
    struct statvfs system {};
    const bool isKnown = statvfs(directory.c_str(), &system) == 0 && system.f_blocks != 0 && system.f_frsize != 0;
    if (growth == 0 || !isKnown) {
        return true;  // unknown; the check after the change decides
    }
    const auto blocks = geteuid() == 0 ? system.f_bfree : system.f_bavail;  // the last blocks are reserved for root
    return blocks > (growth + block) / system.f_frsize;
}

bool endsWithOneLineBreak(std::string_view content) {
    const bool hasLineBreak = !content.empty() && content.back() == '\n';
    return hasLineBreak && (content.size() < 2 || content[content.size() - 2] != '\n');
}

std::size_t linesIn(std::string_view content) {
    const auto ends = static_cast<std::size_t>(std::count(content.begin(), content.end(), '\n'));
    return ends + (content.empty() || content.back() == '\n' ? 0U : 1U);
}

/** The number of records, from the head of the file. */
std::size_t declaredIn(std::string_view content) {
    std::size_t number = 0;
    std::from_chars(content.data(), content.data() + content.size(), number);
    return number;
}

/** Counts the lines that equal the wanted one, of those that begin a step. The head is not counted. */
std::size_t countLines(std::string_view content, std::string_view wanted, std::size_t step) {
    std::size_t found = 0;
    std::size_t number = 0;
    for (std::size_t begin = 0; begin < content.size(); ++number) {
        const std::size_t end = std::min(content.find('\n', begin), content.size());
        const bool isFirst = number > 0 && (number - 1) % step == 0;
        found += isFirst && content.substr(begin, end - begin) == wanted ? 1U : 0U;
        begin = end + 1;
    }
    return found;
}

}  // namespace

void DataFile::requireWritable(std::size_t growth) const {
    const std::string path = pathOf(*this);
    const std::string directory = KO::PlatformUtilities::getKelsaDataDir();
    const bool exists = existsWritable(path);
    // A property file is replaced by a new one, which needs access to the directory.
    const bool needsDirectory = !exists || !hasRecords();
    if (needsDirectory && access(directory.c_str(), W_OK | X_OK) != 0) {
        failToStore(path, "the data directory " + directory + ": " + reasonOf(errno));
    }
    if (!hasRoom(directory, growth)) {
        failToStore(path, reasonOf(ENOSPC));
    }
}

FileState DataFile::state() const {
    if (!hasRecords()) {
        return {};
    }
    const std::string path = pathOf(*this);
    struct stat status {};
    if (stat(path.c_str(), &status) != 0) {
        return {};
    }
    FileState state{std::string(static_cast<std::size_t>(status.st_size), '\0'),
                    status.st_mtim.tv_sec * 1000000000LL + status.st_mtim.tv_nsec};
    std::ifstream stream(path, std::ios::binary);
    stream.read(state.content.data(), status.st_size);  // an error sets a flag of the stream and throws nothing
    state.content.resize(static_cast<std::size_t>(stream.gcount()));
    return state;
}

bool DataFile::isComplete(std::string_view content) const {
    const std::size_t records = declaredIn(content);
    return linesIn(content) >= 1 + records * linesPerRecord && (records == 0 || endsWithOneLineBreak(content));
}

std::size_t DataFile::countRecords(std::string_view content, const std::string& identifier) const {
    if (!hasRecords()) {
        return 0;
    }
    if (!isComplete(content)) {
        failToStore(pathOf(*this), "it does not hold all records; the disk may be full");
    }
    std::string stored = identifier;
    std::replace(stored.begin(), stored.end(), ' ', '_');
    // Line breaks in stored values make record boundaries ambiguous; compare every line in that case.
    const bool hasBoundaries = linesIn(content) == 1 + declaredIn(content) * linesPerRecord;
    return countLines(content, stored, hasBoundaries ? linesPerRecord : 1);
}

std::optional<std::size_t> DataFile::countRecordsIfComplete(const std::string& identifier) const {
    try {
        return countRecords(state().content, identifier);
    } catch (const Failure&) {
        return std::nullopt;
    }
}

const DataFile* dataFileOf(const Class& owner) {
    const auto found = std::find_if(std::begin(dataFiles), std::end(dataFiles),
                                    [&](const DataFile& file) { return sameName(file.className, owner.name); });
    return found == std::end(dataFiles) ? nullptr : found;
}

}  // namespace gate
