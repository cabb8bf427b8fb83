#include "logging/Sinks.h"

#include "logging/LogFile.h"
#include "logging/SystemLogs.h"

namespace RZLog {

std::unique_ptr<Sink> openSink(const LogSettings& settings) {
    switch (settings.destination) {
        case LogSettings::Destination::file:
            return openLogFile(settings);
        case LogSettings::Destination::syslog:
            return openSystemLog(settings);
        case LogSettings::Destination::journal:
            return openJournal(settings);
        case LogSettings::Destination::none:
            break;
    }
    return nullptr;
}

}  // namespace RZLog
