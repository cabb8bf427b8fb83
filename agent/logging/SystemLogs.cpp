#include <sys/socket.h>
#include <sys/un.h>
#include <syslog.h>

#include <cerrno>
#include <cstdio>
#include <ctime>
#include <system_error>

#include "cim/Utf8.h"
#include "configuration/FileContent.h"
#include "logging/Sinks.h"

namespace RZLog {

namespace {

/** A socket that sends datagrams to a path without waiting. */
class DatagramSocket {
public:
    explicit DatagramSocket(const std::string& path)
        : descriptor(::socket(AF_UNIX, SOCK_DGRAM | SOCK_NONBLOCK | SOCK_CLOEXEC, 0)) {
        if (descriptor.get() < 0) {
            throw std::system_error(errno, std::generic_category());
        }
        address.sun_family = AF_UNIX;
        path.copy(address.sun_path, sizeof address.sun_path - 1);
    }

    /** Sends without a connection, so that the service can be restarted. @return whether the datagram was sent */
    bool send(const std::string& content) const {
        return ::sendto(descriptor.get(), content.data(), content.size(), MSG_NOSIGNAL | MSG_DONTWAIT,
                        reinterpret_cast<const sockaddr*>(&address), sizeof address) >= 0;
    }

private:
    Agent::FileDescriptor descriptor;
    sockaddr_un address{};
};

std::string cut(std::string text) {
    if (text.size() > longestText) {
        std::size_t end = longestText;
        while (end > 0 && cim::continuesCharacter(text[end])) {
            --end;
        }
        text.resize(end);
    }
    return text;
}

/** Formats a line as a message to the service, with priority LOG_ERR or LOG_DEBUG. */
using Form = std::string (*)(int priority, const std::string& line);

class DatagramSink : public Sink {
public:
    DatagramSink(const std::string& socketPath, Form itsForm, bool itReports)
        : service(socketPath), form(itsForm), reportsLosses(itReports) {}

    void write(const Record& record) override {
        if (!(reportDropped() && send(record))) {
            ++dropped;
        }
    }

private:
    bool send(const Record& record) {
        return service.send(form(record.level <= errorLevel ? LOG_ERR : LOG_DEBUG, cut(systemLogLine(record))));
    }

    /** Reports the number of dropped records. @return whether nothing is left to report */
    bool reportDropped() {
        if (dropped == 0) {
            return true;
        }
        const std::string text = std::to_string(dropped) + " records were lost: the log's service did not take them";
        if (reportsLosses && !send({Channel::log, errorLevel, ownLogger, "write", "SystemLogs.cpp", __LINE__, text})) {
            return false;
        }
        dropped = 0;
        return true;
    }

    DatagramSocket service;
    Form form;
    bool reportsLosses;
    unsigned long dropped = 0;
};

/** The format of syslog(3), with facility LOG_DAEMON and the program's name. */
std::string systemLogMessage(int priority, const std::string& line) {
    const std::time_t now = std::time(nullptr);
    std::tm fields{};
    ::localtime_r(&now, &fields);
    static constexpr const char* months[] = {"Jan", "Feb", "Mar", "Apr", "May", "Jun",
                                             "Jul", "Aug", "Sep", "Oct", "Nov", "Dec"};
    char time[96];
    std::snprintf(time, sizeof time, "%s %2d %02d:%02d:%02d", months[fields.tm_mon], fields.tm_mday, fields.tm_hour,
                  fields.tm_min, fields.tm_sec);
    return "<" + std::to_string(LOG_DAEMON | priority) + ">" + time + " " + program_invocation_short_name + ": " + line;
}

/** The format of the journal's native protocol. The line contains no line feed, since line feeds are escaped. */
std::string journalMessage(int priority, const std::string& line) {
    return "MESSAGE=" + line + "\nPRIORITY=" + std::to_string(priority) + "\nSYSLOG_IDENTIFIER=ostrel-agent\n";
}

std::unique_ptr<Sink> open(const LogSettings& settings, const std::string& socketPath, Form form) {
    const bool reportsLosses = settings.levels.admit(Channel::log, ownLogger, errorLevel);
    return std::make_unique<DatagramSink>(socketPath, form, reportsLosses);
}

}  // namespace

std::unique_ptr<Sink> openSystemLog(const LogSettings& settings, const std::string& socketPath) {
    return open(settings, socketPath, &systemLogMessage);
}

std::unique_ptr<Sink> openJournal(const LogSettings& settings, const std::string& socketPath) {
    return open(settings, socketPath, &journalMessage);
}

}  // namespace RZLog
