#include <gmock/gmock.h>
#include <unistd.h>

#include <filesystem>
#include <set>
#include <system_error>

#include "logging/Sinks.h"
#include "support/TemporaryDirectory.h"

using RZLog::LogSettings;
using testing::ElementsAre;
using testing::EndsWith;

namespace {

class LogFileTest : public testing::Test {
protected:
    std::unique_ptr<RZLog::Sink> open(const std::string& name) {
        LogSettings settings;
        settings.destination = LogSettings::Destination::file;
        settings.file = directory.file(name);
        settings.rotationSize = 4096;
        settings.rotationCount = 2;
        return RZLog::openLogFile(settings);
    }

    static void write(RZLog::Sink& sink, std::string_view text) {
        sink.write({RZLog::Channel::log, 3000, "Ostrel.Test", "test", "LogFileTest.cpp", 1, text});
    }

    std::set<std::string> files() const {
        std::set<std::string> names;
        for (const auto& entry : std::filesystem::directory_iterator(directory.withSlash())) {
            names.insert(entry.path().filename());
        }
        return names;
    }

    testsupport::TemporaryDirectory directory;
    const std::string large = std::string(3000, 'x');  // two of these exceed the rotation size
};

TEST_F(LogFileTest, NumbersRotatedFilesBeforeTheExtension) {
    const auto sink = open("agent.log");
    for (const char* text : {"first", "second", "third", "fourth"}) {
        write(*sink, large + text);
    }
    EXPECT_THAT(files(), ElementsAre("agent.1.log", "agent.2.log", "agent.log"));
    EXPECT_THAT(directory.read("agent.log"), EndsWith("fourth\n"));
    EXPECT_THAT(directory.read("agent.1.log"), EndsWith("third\n"));
    EXPECT_THAT(directory.read("agent.2.log"), EndsWith("second\n"));
}

TEST_F(LogFileTest, NumbersRotatedFilesWithoutExtensionAtTheEnd) {
    for (const char* name : {"agent", ".hidden"}) {
        const auto sink = open(name);
        write(*sink, large);
        write(*sink, large);
    }
    EXPECT_THAT(files(), ElementsAre(".hidden", ".hidden.1", "agent", "agent.1"));
}

TEST_F(LogFileTest, CountsTheExistingContentWhenItIsOpened) {
    write(*open("agent.log"), large);
    write(*open("agent.log"), large);
    EXPECT_THAT(files(), ElementsAre("agent.1.log", "agent.log"));
}

TEST_F(LogFileTest, WritesARecordThatIsLargerThanTheRotationSizeIntoAnEmptyFile) {
    write(*open("agent.log"), large + large);
    EXPECT_THAT(files(), ElementsAre("agent.log"));
    EXPECT_THAT(directory.read("agent.log"), EndsWith(large + large + "\n"));
}

TEST_F(LogFileTest, IsEmptiedWhenItIsFullAndCannotBeRenamed) {
    std::filesystem::create_directory(directory.file("agent.1.log"));
    std::filesystem::create_directory(directory.file("agent.2.log"));
    directory.write("agent.2.log/file", "prevents that the directory is replaced");
    const auto sink = open("agent.log");
    write(*sink, large + "first");
    write(*sink, large + "second");
    const std::string content = directory.read("agent.log");
    EXPECT_THAT(content, EndsWith("second\n"));
    EXPECT_LE(content.size(), 4096U);
}

TEST_F(LogFileTest, DoesNotFollowASymbolicLink) {
    directory.write("target", "");
    ASSERT_EQ(::symlink(directory.file("target").c_str(), directory.file("agent.log").c_str()), 0);
    EXPECT_THROW(open("agent.log"), std::system_error);
    EXPECT_EQ(directory.read("target"), "");
}

}  // namespace
