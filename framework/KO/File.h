#pragma once

#include <memory>
#include <string>

#include "Export.h"

namespace KO {

/** Modes of File::open and PropertyFile::open. */
enum FileMode : unsigned long {
    FILE_MODE_READ = 1,   ///< for reading; the file must exist
    FILE_MODE_WRITE = 3,  ///< for writing; a missing file is created, an existing file is not truncated
};

/** A file of the agent, identified by a path of wide characters. */
class KO_EXPORT File {
public:
    /** The path of a file. Copies are independent. */
    class KO_EXPORT Path {
    public:
        explicit Path(const std::wstring& path);
        Path(const Path& other);
        Path& operator=(const Path& other);
        ~Path();

        /** Returns the path that was passed to the constructor. */
        std::wstring text() const;

    private:
        struct Implementation;
        std::unique_ptr<Implementation> implementation;
    };

    /** Sets the path without opening the file. */
    explicit File(const std::wstring& path);

    /** Closes the file if it is open. */
    ~File();
    File(const File&) = delete;
    File& operator=(const File&) = delete;

    /**
     * Opens the file in a FileMode. FILE_MODE_WRITE creates an empty file if there is none. If the file is already
     * open, reopens it; if that fails, it stays open in the old mode.
     * @throws FrameworkException with the reason, if the file cannot be opened or is not a regular file
     */
    void open(unsigned long mode);

    /** Closes the file if it is open. */
    void close();

    /** Returns whether a file of any type exists at the path. Follows symbolic links. Returns false on errors. */
    static bool exists(const std::wstring& path);

private:
    struct Implementation;
    std::unique_ptr<Implementation> implementation;
};

}  // namespace KO
