#include "DataFile.h"

#include "Failure.h"
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

[[noreturn]] void failFor(const std::string& path, const std::string& reason) {
    fail(CMPI_RC_ERR_FAILED, "The change cannot be stored in " + path + ": " + reason + ".");
}

std::string reasonOf(int error) {
    return std::generic_category().message(error);
}

class Descriptor {
public:
    explicit Descriptor(const std::string& path) : number(open(path.c_str(), O_RDWR | O_CLOEXEC | O_NONBLOCK)) {}
    ~Descriptor() {
        if (isOpen()) {
            close(number);
        }
    }
    Descriptor(const Descriptor&) = delete;
    Descriptor& operator=(const Descriptor&) = delete;

    bool isOpen() const { return number >= 0; }

    bool isRegular() const {
        struct stat status {};
        return fstat(number, &status) == 0 && S_ISREG(status.st_mode);
    }

private:
    int number;
};

/** Whether a file system has room for a file's growth, and for the part of a block that it leaves empty. */
bool hasRoom(const std::string& directory, std::size_t growth) {
    constexpr std::size_t block = 4096;
    struct statvfs system {};
    const bool isKnown = statvfs(directory.c_str(), &system) == 0 && system.f_blocks != 0 && system.f_frsize != 0;
    if (growth == 0 || !isKnown) {
        return true;  // what cannot be known is seen afterwards
    }
    const auto blocks = geteuid() == 0 ? system.f_bfree : system.f_bavail;  // the last ones are kept for root
    return blocks > (growth + block) / system.f_frsize;
}

bool isEndedOnce(std::string_view text) {
    const bool isEnded = !text.empty() && text.back() == '\n';
    return isEnded && (text.size() < 2 || text[text.size() - 2] != '\n');
}

std::size_t linesIn(std::string_view text) {
    const auto ends = static_cast<std::size_t>(std::count(text.begin(), text.end(), '\n'));
    return ends + (text.empty() || text.back() == '\n' ? 0U : 1U);
}

/** The number of records that the file's head tells. */
std::size_t declaredIn(std::string_view text) {
    std::size_t number = 0;
    std::from_chars(text.data(), text.data() + text.size(), number);
    return number;
}

/** How many lines of a text are that one, of those that stand first in a step. The head is none of them. */
std::size_t countLines(std::string_view text, std::string_view wanted, std::size_t step) {
    std::size_t found = 0;
    std::size_t number = 0;
    for (std::size_t begin = 0; begin < text.size(); ++number) {
        const std::size_t end = std::min(text.find('\n', begin), text.size());
        const bool isFirst = number > 0 && (number - 1) % step == 0;
        found += isFirst && text.substr(begin, end - begin) == wanted ? 1U : 0U;
        begin = end + 1;
    }
    return found;
}

}  // namespace

void DataFile::requireWritable(std::size_t growth) const {
    const std::string path = pathOf(*this);
    const std::string directory = KO::PlatformUtilities::getKelsaDataDir();
    const Descriptor descriptor(path);
    if (!descriptor.isOpen() && errno != ENOENT) {
        failFor(path, reasonOf(errno));
    }
    if (descriptor.isOpen() && !descriptor.isRegular()) {
        failFor(path, "it is no regular file");
    }
    // A property file is replaced by a new one, so the directory counts even where the file is there.
    const bool needsDirectory = !descriptor.isOpen() || !keepsRecords();
    if (needsDirectory && access(directory.c_str(), W_OK | X_OK) != 0) {
        failFor(path, "the data directory " + directory + ": " + reasonOf(errno));
    }
    if (!hasRoom(directory, growth)) {
        failFor(path, reasonOf(ENOSPC));
    }
}

FileState DataFile::state() const {
    if (!keepsRecords()) {
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
    stream.read(state.text.data(), status.st_size);  // throws nothing, whatever the file does
    state.text.resize(static_cast<std::size_t>(stream.gcount()));
    return state;
}

bool DataFile::isWhole(std::string_view text) const {
    const std::size_t records = declaredIn(text);
    return linesIn(text) >= 1 + records * linesPerRecord && (records == 0 || isEndedOnce(text));
}

std::size_t DataFile::recordsIn(std::string_view text, const std::string& identifier) const {
    if (!keepsRecords()) {
        return 0;
    }
    if (!isWhole(text)) {
        failFor(pathOf(*this), "it does not hold all records; the disk may be full");
    }
    std::string stored = identifier;
    std::replace(stored.begin(), stored.end(), ' ', '_');
    // Values with line breaks, stored while such were not refused, leave no telling where a record begins.
    const bool isPlain = linesIn(text) == 1 + declaredIn(text) * linesPerRecord;
    return countLines(text, stored, isPlain ? linesPerRecord : 1);
}

std::optional<std::size_t> DataFile::recordsIfWhole(const std::string& identifier) const {
    try {
        return recordsIn(state().text, identifier);
    } catch (const Failure&) {
        return std::nullopt;
    }
}

const DataFile* dataFileOf(const Class& kept) {
    const auto found = std::find_if(std::begin(dataFiles), std::end(dataFiles),
                                    [&](const DataFile& file) { return sameName(file.className, kept.name); });
    return found == std::end(dataFiles) ? nullptr : found;
}

}  // namespace gate
