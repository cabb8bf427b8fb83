#pragma once

#include <memory>

#include "Export.h"
#include "KO/File.h"

namespace KO {

class Utils;

/**
 * A file of named string values. KO::Utils reads and writes its entries.
 *
 * Entries keep their order; unchanged entries keep their values. If an entry was written, close() replaces the file
 * atomically: concurrent readers, and readers after a crash, see either the old or the new content.
 */
class KO_EXPORT PropertyFile {
public:
    /** Sets the path without opening the file. */
    explicit PropertyFile(const File::Path& path);

    /** Discards changes that close() has not written. */
    ~PropertyFile();
    PropertyFile(const PropertyFile&) = delete;
    PropertyFile& operator=(const PropertyFile&) = delete;

    /**
     * Reads the complete file. FILE_MODE_READ requires it to exist; FILE_MODE_WRITE creates an empty file if there is
     * none. Discards changes that close() has not written.
     * @throws FrameworkException if the file cannot be opened or read
     */
    void open(unsigned long mode);

    /**
     * Writes the changes and closes the file. Does nothing if no file is open.
     * @throws FrameworkException if the new content cannot be stored; the file is then unchanged and closed
     */
    void close();

private:
    friend class Utils;
    struct Implementation;
    std::unique_ptr<Implementation> implementation;
};

}  // namespace KO
