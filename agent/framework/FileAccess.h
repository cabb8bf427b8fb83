#pragma once

#include <string>

#include "configuration/FileContent.h"

namespace KO {

/**
 * Opens a regular file in a FileMode.
 * @throws FrameworkException if it cannot be opened or is not a regular file
 */
Agent::FileDescriptor openFile(const std::wstring& path, unsigned long mode);

/** Throws the FrameworkException for a failure with an errno value. */
[[noreturn]] void throwFileError(const char* failure, const std::string& path, int error);

/**
 * Replaces a file atomically: writes a temporary file in the same directory, forces it to the disk and renames it, so
 * that readers find the old content or the new, also after a crash. Keeps mode, owner and group if the process may set
 * them. If it may not set the owner, the process becomes the owner; if it may not set the group, the new group has no
 * permissions, and others have at most those of the old group. A new file has mode 0600. A symbolic link is kept.
 * @throws FrameworkException on failure; the file then has its old content
 */
void replaceFile(const std::string& path, const std::string& content);

}  // namespace KO
