#include <gtest/gtest.h>

#include <iomanip>
#include <locale>
#include <memory>
#include <thread>
#include <vector>

#include "RZLog/RZMessageBuffer.h"

using RZLog::RZMessageBuffer;

namespace {

/** Returns the string that a new buffer formats from some values. */
std::string sampleOfFreshBuffer() {
    RZMessageBuffer buffer;
    static_cast<std::ostream&>(buffer) << 1234567 << ' ' << 0.5 << ' ' << true << ' ' << std::setw(4) << 7;
    return buffer.str(buffer);
}

const std::string sample = "1234567 0.5 1    7";

struct Grouping : std::numpunct<char> {
    char do_thousands_sep() const override { return '.'; }
    std::string do_grouping() const override { return "\3"; }
};

}  // namespace

TEST(MessageBuffer, ConcatenatesStringsAndValues) {
    RZMessageBuffer buffer;
    buffer << " key_value=" << std::string("a b") << ' ' << 42;
    EXPECT_EQ(buffer.str(buffer), " key_value=a b 42");
}

TEST(MessageBuffer, ReturnsItsStringForTheStreamToo) {
    RZMessageBuffer buffer;
    EXPECT_EQ(buffer.str(buffer << "text"), "text");
    EXPECT_EQ(buffer.str(buffer << "more" << 1), "more1");
}

TEST(MessageBuffer, IsEmptyAfterTaking) {
    RZMessageBuffer buffer;
    buffer << "first";
    buffer.str(buffer);
    EXPECT_EQ(buffer.str(buffer), "");
    buffer << "second";
    EXPECT_EQ(buffer.str(buffer), "second");
}

TEST(MessageBuffer, TreatsNullAsAnEmptyString) {
    RZMessageBuffer buffer;
    buffer << "a";
    buffer << nullptr;
    buffer << "b";
    EXPECT_EQ(buffer.str(buffer), "ab");
}

TEST(MessageBuffer, KeepsNulCharactersAndLongStrings) {
    RZMessageBuffer buffer;
    const std::string text = std::string(200000, 'x') + '\0' + "end";
    static_cast<std::ostream&>(buffer) << text << '\0';
    EXPECT_EQ(buffer.str(buffer), text + '\0');
    EXPECT_EQ(sampleOfFreshBuffer(), sample);
}

TEST(MessageBuffer, InheritsNoStateFromThePreviousBuffer) {
    for (int round = 0; round < 3; ++round) {
        RZMessageBuffer buffer;
        std::ostream& stream = buffer;
        stream << std::hex << std::boolalpha << std::fixed << std::setprecision(1) << std::setfill('*') << std::setw(9);
        stream.imbue(std::locale(std::locale::classic(), new Grouping));
        stream.setstate(std::ios_base::badbit);
        stream.rdbuf(nullptr);
    }
    EXPECT_EQ(sampleOfFreshBuffer(), sample);
    {
        RZMessageBuffer buffer;
        std::ostream& stream = buffer;
        stream.exceptions(std::ios_base::badbit);
        EXPECT_THROW(stream.setstate(std::ios_base::badbit), std::ios_base::failure);
    }
    EXPECT_EQ(sampleOfFreshBuffer(), sample);
}

TEST(MessageBuffer, ResetsItsStateAfterEachMessage) {
    RZMessageBuffer buffer;
    std::ostream& stream = buffer;
    stream << std::hex << 255;
    stream.setstate(std::ios_base::badbit);
    EXPECT_EQ(buffer.str(buffer), "ff");
    stream << 255;
    EXPECT_EQ(buffer.str(buffer), "255");
}

TEST(MessageBuffer, DoesNotFollowTheGlobalLocale) {
    const std::locale before = std::locale::global(std::locale(std::locale::classic(), new Grouping));
    std::vector<std::unique_ptr<RZMessageBuffer>> buffers;  // more than are kept for reuse
    for (int count = 0; count < 40; ++count) {
        buffers.push_back(std::make_unique<RZMessageBuffer>());
        static_cast<std::ostream&>(*buffers.back()) << 1234567;
        EXPECT_EQ(buffers.back()->str(*buffers.back()), "1234567");
    }
    std::locale::global(before);
}

TEST(MessageBuffer, SharesNothingWithTheOthers) {
    RZMessageBuffer one;
    RZMessageBuffer other;
    one << "one";
    other << "other";
    EXPECT_EQ(one.str(one), "one");
    EXPECT_EQ(other.str(other), "other");
}

TEST(MessageBuffer, CanBeCreatedConcurrently) {
    std::vector<std::thread> threads;
    std::vector<int> failures(4);
    for (std::size_t number = 0; number < failures.size(); ++number) {
        threads.emplace_back([number, &failures] {
            for (int round = 0; round < 2000; ++round) {
                RZMessageBuffer buffer;
                const std::string text = buffer.str(buffer << "thread " << number << ' ' << round);
                failures[number] += text != "thread " + std::to_string(number) + ' ' + std::to_string(round) ? 1 : 0;
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(failures, std::vector<int>(4, 0));
}
