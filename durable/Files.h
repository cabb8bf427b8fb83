#pragma once

#include <sys/types.h>

#include <optional>
#include <string>
#include <string_view>

// Files that survive a killed process and a power failure. All functions throw std::system_error, whose what() is the
// path and the reason.

namespace durable {

/** Reads a file. None if it does not exist. */
std::optional<std::string> readFile(const std::string& path);

/**
 * Replaces or creates a file. At any time, it has the old or the new content. The new content is on the disk when the
 * function returns, and has the file's name after syncDirectoryOf().
 * @param model the file whose mode, owner and group the new one gets; if it does not exist, the new one gets owner and
 *     group of the directory, and only the owner has access
 */
void replaceFile(const std::string& path, std::string_view content, const std::string& model);

/**
 * Writes a file in place, without following a link. The new content is on the disk when the function returns; meanwhile
 * the file is incomplete, and if the function fails, it is empty or incomplete.
 * @param model as for replaceFile()
 */
void overwriteFile(const std::string& path, std::string_view content, const std::string& model);

/**
 * Creates an empty file, unless it exists. It gets owner and group of the directory. Its name is on the disk after
 * syncDirectoryOf().
 * @param mode less the umask
 */
void createFile(const std::string& path, mode_t mode);

/** Renames a file. The new name is on the disk after syncDirectoryOf(). */
void renameFile(const std::string& from, const std::string& to);

/** The path without links; the same path if there is no such file. */
std::string resolvedPath(const std::string& path);

/** Writes the data of a file to the disk. */
void syncFile(const std::string& path);

/** Writes the names in the directory of a file to the disk. */
void syncDirectoryOf(const std::string& path);

}  // namespace durable
