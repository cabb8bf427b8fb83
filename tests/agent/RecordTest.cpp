#include <gmock/gmock.h>

#include <ctime>

#include "logging/Record.h"

using RZLog::Channel;
using RZLog::Record;
using testing::MatchesRegex;

namespace {

std::string escaped(std::string_view field) {
    std::string line;
    RZLog::appendEscaped(line, field);
    return line;
}

std::chrono::system_clock::time_point moment(long seconds, long microseconds) {
    return std::chrono::system_clock::time_point(std::chrono::seconds(seconds) +
                                                 std::chrono::microseconds(microseconds));
}

/** Sets the time zone of this process for one test. */
class TimeZone {
public:
    explicit TimeZone(const char* zone) {
        ::setenv("TZ", zone, 1);
        ::tzset();
    }
    ~TimeZone() {
        ::unsetenv("TZ");
        ::tzset();
    }
    TimeZone(const TimeZone&) = delete;
    TimeZone& operator=(const TimeZone&) = delete;
};

const Record sample{Channel::trace, 4000, "Ostrel.Test", "getLessor", "Lease.cpp", 42, "ENTERING: x"};

}  // namespace

TEST(LogRecord, IsALineOfTabSeparatedFields) {
    const TimeZone zone("UTC0");
    EXPECT_EQ(RZLog::fileLine(sample, moment(1700000000, 12)),
              "2023-11-14T22:13:20.000012+00:00\ttrace\t4000\tOstrel.Test\tgetLessor\tLease.cpp\t42\tENTERING: x");
}

TEST(LogRecord, HasLocalTimeWithItsOffset) {
    {
        const TimeZone zone("EAST-05:45");
        EXPECT_EQ(RZLog::fileLine(sample, moment(1700000000, 0)).substr(0, 32), "2023-11-15T03:58:20.000000+05:45");
    }
    const TimeZone zone("WEST03:30");
    EXPECT_EQ(RZLog::fileLine(sample, moment(1700000000, 999999)).substr(0, 32), "2023-11-14T18:43:20.999999-03:30");
}

TEST(LogRecord, EscapesEveryStringField) {
    const Record forged{Channel::log, 3000, "a\tb", "c\nd", "e\rf", 1, "g\nh"};
    EXPECT_THAT(RZLog::fileLine(forged, moment(0, 0)),
                MatchesRegex(R"([^	]+	log	3000	a\\tb	c\\nd	e\\rf	1	g\\nh)"));
}

TEST(LogRecord, ForASystemLogIsOneLineWithoutTime) {
    const Record forged{Channel::log, 3000, "Ostrel.Test", "load", "Lease.cpp", 42, "bad\nline"};
    EXPECT_EQ(RZLog::systemLogLine(forged), "log 3000 Ostrel.Test load() in Lease.cpp:42: bad\\nline");
}

TEST(LogEscaping, KeepsPrintableCharacters) {
    EXPECT_EQ(escaped("Any text ~ \"quoted\""), "Any text ~ \"quoted\"");
    EXPECT_EQ(escaped("Gr\xC3\xBC\xC3\x9F"
                      "e \xE2\x82\xAC \xF0\x9F\x98\x80"),
              "Gr\xC3\xBC\xC3\x9F"
              "e \xE2\x82\xAC \xF0\x9F\x98\x80");
}

TEST(LogEscaping, MakesControlCharactersVisible) {
    EXPECT_EQ(escaped("a\tb\nc\rd"), "a\\tb\\nc\\rd");
    EXPECT_EQ(escaped(std::string_view("\0\x01\x1B\x7f", 4)), "\\x00\\x01\\x1B\\x7F");
    EXPECT_EQ(escaped("\xC2\x85"), "\\xC2\\x85") << "a C1 control character";
}

TEST(LogEscaping, MakesTheEscapeCharacterUnambiguous) {
    EXPECT_EQ(escaped("\\n"), "\\\\n");
    EXPECT_EQ(escaped("\\x41"), "\\\\x41");
}

TEST(LogEscaping, MakesBytesThatAreNotUtf8Visible) {
    EXPECT_EQ(escaped("\xFF\x80 \xC3("), "\\xFF\\x80 \\xC3(");
    EXPECT_EQ(escaped("\xE2\x82"), "\\xE2\\x82");
}
