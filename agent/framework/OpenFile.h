#pragma once

#include <string>

namespace KO {

/** An open file descriptor, closed at the end of its owner's life. */
class OpenFile {
public:
    OpenFile() = default;
    explicit OpenFile(int fileDescriptor) : descriptor(fileDescriptor) {}
    OpenFile(OpenFile&& other) noexcept;
    OpenFile& operator=(OpenFile&& other) noexcept;
    ~OpenFile();

    /** The descriptor; negative when nothing is open. */
    int get() const { return descriptor; }

private:
    int descriptor = -1;
};

/**
 * Opens an ordinary file in a FileMode.
 * @throws FrameworkException when it cannot be opened or is no ordinary file
 */
OpenFile openFile(const std::wstring& path, unsigned long mode);

/** Throws the FrameworkException for a failure with an errno value. */
[[noreturn]] void throwFileError(const char* failure, const std::string& path, int error);

}  // namespace KO
