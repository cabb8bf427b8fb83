#pragma once

#include <sys/types.h>

#include <optional>
#include <string>
#include <string_view>

// Operations on files that must survive a killed process and a power failure. If a function fails, it throws
// std::system_error, whose what() has the path and the reason.

namespace durable {

/** The content of a file; none if the file does not exist. */
std::optional<std::string> readFile(const std::string& path);

/**
 * Replaces or creates a file. At any time, the file has either the old or the new content. The new content is on the
 * disk when the function returns, and survives a power failure under the file's name after syncDirectoryOf().
 * @param model the file whose mode, owner and group the new file gets; if the model does not exist, the new file gets
 *     owner and group of the directory, and only the owner has access
 */
void replaceFile(const std::string& path, std::string_view content, const std::string& model);

/**
 * Writes a file in place. Fails if the path is a symbolic link. The new content is on the disk when the function
 * returns. Until then, the file is incomplete. If the function fails, the file is empty or incomplete.
 * @param model as for replaceFile()
 */
void overwriteFile(const std::string& path, std::string_view content, const std::string& model);

/**
 * Creates an empty file, unless the file exists. A new file gets owner and group of the directory. Its name is on the
 * disk after syncDirectoryOf().
 * @param mode the mode, from which the umask is removed
 */
void createFile(const std::string& path, mode_t mode);

/** Renames a file. The new name is on the disk after syncDirectoryOf(). */
void renameFile(const std::string& from, const std::string& to);

/** The path with symbolic links resolved; the same path if there is no such file. */
std::string resolvedPath(const std::string& path);

/** Syncs a file: its content is on the disk when the function returns. */
void syncFile(const std::string& path);

/** Syncs the directory of a file: the names in the directory are on the disk when the function returns. */
void syncDirectoryOf(const std::string& path);

}  // namespace durable
