#pragma once

#include <string>

namespace gate {

/**
 * Writes a message to the log and trace of the agent, at the level of errors (3000), under the logger
 * "Tarvik.LeaseAndWarrantyGate". Without memory for it, nothing is written.
 */
void logError(const std::string& message, const char* function = __builtin_FUNCTION(),
              const char* file = __builtin_FILE(), int line = __builtin_LINE()) noexcept;

}  // namespace gate
