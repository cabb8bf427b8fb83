#pragma once

#include "configuration/FileDescriptor.h"

#include <string>

namespace KO {

/**
 * Opens an ordinary file in a FileMode.
 * @throws FrameworkException if it cannot be opened or is not an ordinary file
 */
Agent::FileDescriptor openFile(const std::wstring& path, unsigned long mode);

/** Throws the FrameworkException for a failure with an errno value. */
[[noreturn]] void throwFileError(const char* failure, const std::string& path, int error);

}  // namespace KO
