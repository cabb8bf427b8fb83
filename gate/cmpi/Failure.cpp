#include "Failure.h"

#include <RZLog/RZLogger.h>

#include <cstring>
#include <exception>

namespace gate {

void logError(const std::string& message, const char* function, const char* file, int line) {
    constexpr const char* logger = "Tarvik.LeaseAndWarrantyGate";
    constexpr int errorLevel = 3000;
    const char* folder = std::strrchr(file, '/');
    const char* name = folder == nullptr ? file : folder + 1;
    try {
        RZLog::RZLogger::logLevelMessage(function, name, line, logger, errorLevel, nullptr, 0, 0, message);
        RZLog::RZLogger::traceLevelMessage(function, name, line, logger, errorLevel, nullptr, 0, 0, message);
    } catch (const std::exception&) {
        // The log is not needed to serve the request.
    }
}

}  // namespace gate
