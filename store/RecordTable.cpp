#include "RecordTable.h"

#include <unistd.h>

#include <new>

#include "KO/PlatformUtilities.h"
#include "KO/Strings.h"

namespace KO::LeaseWarrantyProvider {

bool memoryCanHold(std::size_t count, std::size_t size) {
    const long pages = sysconf(_SC_PHYS_PAGES);
    const long pageSize = sysconf(_SC_PAGESIZE);
    if (pages <= 0 || pageSize <= 0) {
        return true;
    }
    return count <= static_cast<std::size_t>(pages) * static_cast<std::size_t>(pageSize) / size;
}

void requireMemory(std::size_t count, std::size_t size) {
    if (!memoryCanHold(count, size)) {
        throw std::bad_alloc();
    }
}

std::string dataFilePath(const char* fileName) {
    const std::string path = PlatformUtilities::getKelsaDataDir() + std::string(fileName);
    return make_string(path.c_str());
}

}  // namespace KO::LeaseWarrantyProvider
