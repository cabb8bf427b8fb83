#pragma once

#include <string>

#include "configuration/FileContent.h"

namespace KO {

/**
 * Opens a regular file in a FileMode.
 * @throws FrameworkException if it cannot be opened or is not a regular file
 */
Agent::FileDescriptor openFile(const std::wstring& path, unsigned long mode);

/** Throws a FrameworkException with the failure, the path and the message for an errno value. */
[[noreturn]] void throwFileError(const char* failure, const std::string& path, int error);

/**
 * Replaces a file atomically: writes a temporary file in the same directory, forces it to the disk and renames it, so
 * that readers find either the old or the new content, even after a crash. A new file has mode 0600. A symbolic link to
 * an existing file is kept.
 *
 * Keeps mode, owner and group if the process may set them. If it may not set the owner, the file belongs to the user of
 * the process. If it may not set the group, the new group has no permissions, and others keep only those permissions
 * that the old group had.
 * @throws FrameworkException on failure; the file then has its old content
 */
void replaceFile(const std::string& path, const std::string& content);

}  // namespace KO
