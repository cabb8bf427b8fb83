#pragma once

#include <string>

namespace KO {

/**
 * Replaces a file's content as a whole: a temporary file in the same directory is written, forced to
 * the disk and renamed, so that a reader or a crash at any moment finds the old content or the new.
 * Mode, owner and group stay where the process may set them. Where it may not set the owner, the file becomes its own;
 * where it may not set the group, the new group is given no rights, and everybody at most those that the old one had.
 * A file that is not there gets mode 0600. A symbolic link stays one.
 * @throws FrameworkException when that fails; the old content then stands
 */
void replaceFile(const std::string& path, const std::string& content);

}  // namespace KO
