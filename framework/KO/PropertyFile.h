#pragma once

#include "Export.h"
#include "KO/File.h"

#include <memory>

namespace KO {

class PropertyFileAccess;

/**
 * A file of named text values. Its entries are read and written with the operations of KO::Utils.
 *
 * Entries keep their order, and those that nobody writes are kept as they are. A file opened for
 * writing is replaced as a whole, and only by close() after something was written: whoever reads
 * meanwhile, or after a crash, finds the old content or the new, never a mixture.
 */
class KO_EXPORT PropertyFile {
public:
    /** Names a property file; nothing is opened. */
    explicit PropertyFile(const File::Path& path);

    /** Drops what was written since open() unless close() committed it. */
    ~PropertyFile();
    PropertyFile(const PropertyFile&) = delete;
    PropertyFile& operator=(const PropertyFile&) = delete;

    /**
     * Reads the whole file. FILE_MODE_READ wants it to exist; FILE_MODE_WRITE creates it, empty, if
     * it is absent. What was written since an earlier open() without close() is dropped.
     * @throws FrameworkException when it cannot be opened or read
     */
    void open(unsigned long mode);

    /**
     * Commits what was written and closes the file; without an open file nothing happens.
     * @throws FrameworkException when the new content cannot be stored; the old one then stands, and
     *         the file is closed all the same
     */
    void close();

private:
    friend class PropertyFileAccess;
    struct Implementation;
    std::unique_ptr<Implementation> implementation;
};

}  // namespace KO
