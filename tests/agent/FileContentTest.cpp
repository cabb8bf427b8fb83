#include <gtest/gtest.h>
#include <sys/stat.h>

#include <cerrno>

#include "configuration/FileContent.h"
#include "support/TemporaryDirectory.h"

using Agent::FileContent;
using Agent::readFile;
using testsupport::TemporaryDirectory;

TEST(FileContent, ReadsACompleteFile) {
    const TemporaryDirectory directory;
    const std::string text = std::string(100000, 'x') + '\0' + "end";
    const FileContent content = readFile(directory.write("file", text));
    EXPECT_EQ(content.error, 0);
    EXPECT_EQ(content.text, text);
}

TEST(FileContent, DistinguishesAbsentFromUnreadable) {
    const TemporaryDirectory directory;
    EXPECT_TRUE(readFile(directory.file("nothing")).absent());
    EXPECT_TRUE(readFile(directory.write("file", "") + "/below").absent());

    const FileContent ofDirectory = readFile(directory.withSlash());
    EXPECT_EQ(ofDirectory.error, EISDIR);
    EXPECT_FALSE(ofDirectory.absent());
}

TEST(FileContent, DoesNotWaitForTheOtherEndOfAPipe) {
    const TemporaryDirectory directory;
    ASSERT_EQ(::mkfifo(directory.file("pipe").c_str(), 0600), 0);
    EXPECT_EQ(readFile(directory.file("pipe")).text, "");
}

TEST(FileContent, RejectsAFileWithoutEnd) {
    EXPECT_EQ(readFile("/dev/zero").error, EFBIG);
}

TEST(FileContent, RejectsAPathWithANulCharacter) {
    const TemporaryDirectory directory;
    directory.write("file", "content");
    EXPECT_EQ(readFile(directory.file("file") + '\0' + "more").error, EINVAL);
}
