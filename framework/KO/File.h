#pragma once

#include <memory>
#include <string>

#include "Export.h"

namespace KO {

/** Modes of File::open and PropertyFile::open. */
enum FileMode : unsigned long {
    FILE_MODE_READ = 1,   ///< for reading; the file must exist
    FILE_MODE_WRITE = 3,  ///< for writing; created if it does not exist, never truncated by opening
};

/** A file of the agent, named by a wide path. */
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
     * Opens the file in a FileMode; mode 3 creates an empty file if there is none. Closes the file first if it is open.
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
