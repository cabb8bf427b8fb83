#pragma once

#include "Export.h"

#include <memory>
#include <string>

namespace KO {

/** How File::open and PropertyFile::open open a file. */
enum FileMode : unsigned long {
    FILE_MODE_READ = 1,   ///< for reading; the file must exist
    FILE_MODE_WRITE = 3,  ///< for writing; created if absent, never truncated by opening
};

/** One file of the agent, named by a wide path. */
class KO_EXPORT File {
public:
    /** A file's path, as a type of its own. Copies are independent. */
    class KO_EXPORT Path {
    public:
        explicit Path(const std::wstring& path);
        Path(const Path& other);
        Path& operator=(const Path& other);
        ~Path();

        /** The path as it was given. */
        std::wstring text() const;

    private:
        struct Implementation;
        std::unique_ptr<Implementation> implementation;
    };

    /** Names a file; nothing is opened. */
    explicit File(const std::wstring& path);

    /** Closes the file if it is open. */
    ~File();
    File(const File&) = delete;
    File& operator=(const File&) = delete;

    /**
     * Opens the file in a FileMode. Mode 3 creates it, empty, if it is absent. A file that is open
     * already is closed first.
     * @throws FrameworkException when it cannot be opened or is no ordinary file, saying why
     */
    void open(unsigned long mode);

    /** Closes the file; without an open file nothing happens. */
    void close();

    /**
     * Whether something of that name exists; a symbolic link exists if what it leads to does. False
     * also when that cannot be found out.
     */
    static bool exists(const std::wstring& path);

private:
    struct Implementation;
    std::unique_ptr<Implementation> implementation;
};

}  // namespace KO
