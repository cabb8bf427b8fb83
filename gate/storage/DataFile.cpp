#include "DataFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <filesystem>
#include <system_error>

#include "KO/PlatformUtilities.h"
#include "durable/Files.h"

namespace gate {

namespace {

constexpr DataFile dataFiles[] = {
    {"VELKO_Lease", "Lease.dat", true},
    {"VELKO_Warranty", "Warranty.dat", true},
    {"VELKO_AssetIDDetails", "asset.dat", false},
};

std::string pathOf(const DataFile& file) {
    return std::string(KO::PlatformUtilities::getKelsaDataDir()) + file.fileName;
}

void failToStoreIf(bool isFailure, const std::string& path, const char* reason) {
    failIf(isFailure, CMPI_RC_ERR_FAILED, "The change cannot be stored in ", path, ": ", reason, ".");
}

/** Fails if the file exists, but cannot be opened for writing or is not a regular file. */
void requireWritableFile(const std::string& path) {
    const int descriptor = open(path.c_str(), O_RDWR | O_CLOEXEC | O_NONBLOCK);
    if (descriptor < 0 && errno == ENOENT) {
        return;
    }
    if (descriptor < 0) {
        throw std::system_error(errno, std::generic_category(), path);
    }
    struct stat status {};
    const bool isRegular = fstat(descriptor, &status) == 0 && S_ISREG(status.st_mode);
    close(descriptor);
    failToStoreIf(!isRegular, path, "it is not a regular file");
}

/** Whether the file system has room for the file's growth and for one more block, which may be used only partly. */
bool hasRoom(const std::string& directory, std::size_t growth) {
    constexpr std::size_t block = 4096;
    std::error_code error;
    const auto space = std::filesystem::space(directory, error);
    const bool isKnown = !error && space.capacity != 0;               // otherwise, the check after the change decides
    const auto room = geteuid() == 0 ? space.free : space.available;  // the last blocks are reserved for root
    return growth == 0 || !isKnown || room > growth + block;
}

/** Whether a line of a record file is the identifier, and the provider does not split the identifier at white space. */
bool hasRecord(const std::string& content, std::string identifier) {
    std::replace(identifier.begin(), identifier.end(), ' ', '_');
    return identifier.find_first_of("\t\n\v\f\r") == std::string::npos &&
           content.find('\n' + identifier + '\n') != std::string::npos;
}

}  // namespace

durable::RecordFile DataFile::records() const {
    return durable::recordFileIn(KO::PlatformUtilities::getKelsaDataDir(), fileName);
}

void DataFile::requireWritable(std::size_t growth) const {
    const std::string path = pathOf(*this);
    const std::string directory = KO::PlatformUtilities::getKelsaDataDir();
    const std::string subject = path + ": " + "the data directory " + directory;
    requireWritableFile(path);
    // A rollback replaces the file, as does the change of a property file: both create a file in the directory.
    if (access(directory.c_str(), W_OK | X_OK) != 0) {
        throw std::system_error(errno, std::generic_category(), subject);
    }
    if (!hasRoom(directory, growth)) {
        throw std::system_error(ENOSPC, std::generic_category(), path);
    }
}

FileState DataFile::state() const {
    const std::string path = pathOf(*this);
    std::error_code ignored;
    const auto modified = std::filesystem::last_write_time(path, ignored);
    const auto content = hasRecords ? records().content() : durable::readFile(path);
    return {content.value_or(std::string()), modified};
}

bool DataFile::mayHave(const std::string& content, std::string identifier) const {
    std::replace(identifier.begin(), identifier.end(), ' ', '_');
    return content.find(identifier) != std::string::npos || !records().isComplete(content);
}

std::string DataFile::begin(const std::string& content) const {
    return hasRecords ? records().prepare(content) : content;
}

void DataFile::commit(const FileState& before, bool mustDiffer, const std::string* identifier) const {
    if (!hasRecords) {
        return;
    }
    const FileState now = state();
    const bool isSame = now.modified == before.modified && now.content == before.content;
    failIf(mustDiffer && isSame, CMPI_RC_ERR_FAILED, fileName, " was not written.");
    const durable::RecordFile file = records();
    failToStoreIf(!file.isComplete(now.content), file.path(), "it does not hold all records; the disk may be full");
    if (identifier != nullptr && !hasRecord(now.content, *identifier)) {
        fail(CMPI_RC_ERR_FAILED, fileName, " does not hold ", *identifier, ".");
    }
    file.commit(now.content);
}

void DataFile::rollBack(const std::string& before) const {
    failToStoreIf(hasRecords && before.empty(), pathOf(*this), "it was damaged before, and there is no saved copy");
    if (hasRecords) {
        records().restore(before);
    } else if (state().content != before) {
        const std::string path = std::filesystem::canonical(pathOf(*this));  // if it is a link, replaces its target
        durable::replaceFile(path, before, path);
        durable::syncDirectoryOf(path);
    }
}

const DataFile* dataFileOf(const Class& requested) {
    return cim::findNamed(dataFiles, requested.name);
}

}  // namespace gate
