#include <gmock/gmock.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include <filesystem>
#include <optional>
#include <ostream>
#include <vector>

#include "logging/Sinks.h"
#include "support/TemporaryDirectory.h"

using testing::ElementsAre;
using testing::EndsWith;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::MatchesRegex;
using testing::SizeIs;

namespace {

/** The service of a log, which reads only on request. */
class Service {
public:
    explicit Service(const std::string& itsPath)
        : path(itsPath), descriptor(::socket(AF_UNIX, SOCK_DGRAM | SOCK_NONBLOCK | SOCK_CLOEXEC, 0)) {
        sockaddr_un address{};
        address.sun_family = AF_UNIX;
        path.copy(address.sun_path, sizeof address.sun_path - 1);
        EXPECT_EQ(::bind(descriptor, reinterpret_cast<const sockaddr*>(&address), sizeof address), 0);
    }
    ~Service() { ::close(descriptor); }
    Service(const Service&) = delete;
    Service& operator=(const Service&) = delete;

    /** Returns all messages in its queue. */
    std::vector<std::string> readAll() const {
        std::vector<std::string> messages;
        std::string content(2 * RZLog::longestText, ' ');
        for (ssize_t size = 0; (size = ::recv(descriptor, content.data(), content.size(), 0)) >= 0;) {
            messages.push_back(content.substr(0, static_cast<std::size_t>(size)));
        }
        return messages;
    }

private:
    std::string path;
    int descriptor;
};

struct SystemLog {
    const char* name;
    std::unique_ptr<RZLog::Sink> (*open)(const RZLog::LogSettings& settings, const std::string& socketPath);
};

std::ostream& operator<<(std::ostream& stream, const SystemLog& log) {
    return stream << log.name;
}

class SystemLogs : public testing::TestWithParam<SystemLog> {
protected:
    SystemLogs() { start(); }

    void start() {
        ::unlink(path.c_str());
        service.emplace(path);
    }

    std::unique_ptr<RZLog::Sink> open(int ownLevel = 3000) const {
        RZLog::LogSettings settings;
        EXPECT_TRUE(settings.levels.set("Ostrel.Agent", {ownLevel, ownLevel}));
        return GetParam().open(settings, path);
    }

    static void write(RZLog::Sink& sink, const std::string& text, int level = 3000) {
        sink.write({RZLog::Channel::log, level, "Ostrel.Test", "getLessor", "Lease.cpp", 42, text});
    }

    /** Writes more records than fit into the service's queue. @return the number of lost records */
    std::size_t overfill(RZLog::Sink& sink) {
        constexpr std::size_t many = 5000;
        for (std::size_t number = 0; number < many; ++number) {
            write(sink, "record " + std::to_string(number));
        }
        const std::vector<std::string> taken = service->readAll();
        EXPECT_THAT(taken, testing::Not(IsEmpty()));
        EXPECT_LT(taken.size(), many);
        return many - taken.size();
    }

    testsupport::TemporaryDirectory directory;
    std::string path = directory.file("socket");
    std::optional<Service> service;
};

TEST_P(SystemLogs, DropRecordsWhileTheServiceIsBusyAndReportTheirCount) {
    const auto sink = open();
    const std::string lost = std::to_string(overfill(*sink));
    write(*sink, "the next");
    EXPECT_THAT(service->readAll(),
                ElementsAre(HasSubstr(": " + lost + " records were lost: "), HasSubstr("the next")));
    write(*sink, "the last");
    EXPECT_THAT(service->readAll(), ElementsAre(HasSubstr("the last"))) << "it is reported once";
}

TEST_P(SystemLogs, DoNotReportTheCountIfTheOwnLoggerIsSilent) {
    const auto sink = open(0);
    overfill(*sink);
    write(*sink, "the next");
    EXPECT_THAT(service->readAll(), ElementsAre(HasSubstr("the next")));
}

TEST_P(SystemLogs, FindARestartedService) {
    const auto sink = open();
    write(*sink, "one");
    EXPECT_THAT(service->readAll(), SizeIs(1));
    service.reset();
    write(*sink, "no process has the socket open");
    ::unlink(path.c_str());
    write(*sink, "the socket does not exist");
    start();
    write(*sink, "two");
    EXPECT_THAT(service->readAll(), ElementsAre(HasSubstr(": 2 records were lost: "), HasSubstr("two")));
}

TEST_P(SystemLogs, DropRecordsWithoutAService) {
    service.reset();
    ::unlink(path.c_str());
    const auto sink = open();
    EXPECT_NO_THROW(write(*sink, "one"));
    EXPECT_FALSE(std::filesystem::exists(path)) << "no process creates it";
}

TEST_P(SystemLogs, TruncateLongRecordsBetweenCharacters) {
    const auto sink = open();
    for (const char* shift : {"", "x"}) {
        std::string accents = shift;
        while (accents.size() < 3 * RZLog::longestText) {
            accents += "\u00e9";
        }
        write(*sink, accents);
        const std::vector<std::string> messages = service->readAll();
        ASSERT_THAT(messages, SizeIs(1));
        EXPECT_LT(messages[0].size(), RZLog::longestText + 200);
        const std::string last = messages[0].substr(messages[0].rfind("\xc3"));
        EXPECT_EQ(last.substr(0, 2), "\u00e9");
    }
}

INSTANTIATE_TEST_SUITE_P(Both, SystemLogs,
                         testing::Values(SystemLog{"SystemLog", &RZLog::openSystemLog},
                                         SystemLog{"Journal", &RZLog::openJournal}),
                         [](const auto& tested) { return std::string(tested.param.name); });

class SystemLogForm : public testing::Test {
protected:
    /** Returns the message about a record of that level. */
    std::string message(const SystemLog& log, int level) {
        const Service service(directory.file(log.name));
        log.open({}, directory.file(log.name))
            ->write({RZLog::Channel::trace, level, "Ostrel.Test", "getLessor", "Lease.cpp", 42, "some\ntext"});
        ::unlink(directory.file(log.name).c_str());
        const std::vector<std::string> messages = service.readAll();
        return messages.size() == 1 ? messages[0] : "";
    }

    testsupport::TemporaryDirectory directory;
};

TEST_F(SystemLogForm, IsThatOfTheCLibraryForTheSystemLog) {
    const SystemLog log{"log", &RZLog::openSystemLog};
    const std::string rest = "[A-Z][a-z][a-z] [ 1-3][0-9] [0-9:]{8} agent_logging_test: ";
    EXPECT_THAT(message(log, 3000), MatchesRegex("<27>" + rest + ".*"));
    EXPECT_THAT(message(log, 3001), MatchesRegex("<31>" + rest + ".*"));
    EXPECT_THAT(message(log, 3000), EndsWith(": trace 3000 Ostrel.Test getLessor() in Lease.cpp:42: some\\ntext"));
}

TEST_F(SystemLogForm, HasTheJournalsFieldsForTheJournal) {
    const SystemLog log{"log", &RZLog::openJournal};
    EXPECT_EQ(message(log, 3000),
              "MESSAGE=trace 3000 Ostrel.Test getLessor() in Lease.cpp:42: some\\ntext\nPRIORITY=3\n"
              "SYSLOG_IDENTIFIER=ostrel-agent\n");
    EXPECT_THAT(message(log, 3001), HasSubstr("\nPRIORITY=7\n"));
}

}  // namespace
