#include <gmock/gmock.h>
#include <sys/stat.h>

#include <filesystem>
#include <utility>

#include "KO/Exceptions.h"
#include "KO/File.h"
#include "KO/Strings.h"
#include "support/TemporaryDirectory.h"
#include "support/Umask.h"

using KO::File;
using KO::FrameworkException;
using KO::make_wstring;
using testsupport::TemporaryDirectory;

namespace {

/** Returns the message of the exception that opening throws; empty if it throws none. */
std::string failureOfOpening(const std::string& path, unsigned long mode) {
    try {
        File file(make_wstring(path));
        file.open(mode);
        return "";
    } catch (const FrameworkException& failure) {
        return failure.what();
    }
}

}  // namespace

TEST(File, IsCreatedEmptyByOpeningForWriting) {
    const TemporaryDirectory directory;
    const std::wstring path = make_wstring(directory.file("new"));
    EXPECT_FALSE(File::exists(path));
    File file(path);
    EXPECT_FALSE(File::exists(path)) << "naming a file does not create it";
    file.open(KO::FILE_MODE_WRITE);
    file.close();
    ASSERT_TRUE(File::exists(path));
    struct stat status {};
    ASSERT_EQ(::stat(directory.file("new").c_str(), &status), 0);
    EXPECT_EQ(status.st_size, 0);
    EXPECT_EQ(status.st_mode & 07137U, 0U) << "no rights for others, none to execute";
}

TEST(File, HasMode0640LessTheUmask) {
    for (const auto& [mask, mode] :
         {std::pair(mode_t{0}, 0640U), std::pair(mode_t{027}, 0640U), std::pair(mode_t{077}, 0600U)}) {
        const testsupport::Umask umask(mask);
        const TemporaryDirectory directory;
        File file(make_wstring(directory.file("new")));
        file.open(KO::FILE_MODE_WRITE);
        struct stat status {};
        ASSERT_EQ(::stat(directory.file("new").c_str(), &status), 0);
        EXPECT_EQ(status.st_mode & 07777U, mode);
    }
}

TEST(File, IsNotTruncatedByOpeningForWriting) {
    const TemporaryDirectory directory;
    const std::string path = directory.write("file", "content");
    EXPECT_EQ(failureOfOpening(path, 3), "");
    EXPECT_EQ(directory.read("file"), "content");
}

TEST(File, MustExistToBeOpenedForReading) {
    const TemporaryDirectory directory;
    EXPECT_EQ(failureOfOpening(directory.file("none"), 1),
              "Cannot open " + directory.file("none") + ": No such file or directory");
    EXPECT_FALSE(File::exists(make_wstring(directory.file("none"))));
    EXPECT_EQ(failureOfOpening(directory.write("file", ""), 1), "");
}

TEST(File, MustNotBeADirectory) {
    const TemporaryDirectory directory;
    for (const unsigned long mode : {1UL, 3UL}) {
        EXPECT_EQ(failureOfOpening(directory.withSlash(), mode),
                  "Cannot open " + directory.withSlash() + ": Is a directory");
    }
}

TEST(File, MustBeARegularFile) {
    const TemporaryDirectory directory;
    ASSERT_EQ(::mkfifo(directory.file("pipe").c_str(), 0600), 0);
    EXPECT_NE(failureOfOpening(directory.file("pipe"), 1), "");
    EXPECT_NE(failureOfOpening(directory.file("pipe"), 3), "");
}

TEST(File, RejectsInvalidModesAndPaths) {
    const TemporaryDirectory directory;
    const std::string path = directory.write("file", "");
    for (const unsigned long mode : {0UL, 2UL, 4UL, 0xFFFFFFFFUL}) {
        EXPECT_EQ(failureOfOpening(path, mode), "Cannot open " + path + ": Invalid argument");
    }
    EXPECT_NE(failureOfOpening(path + '\0', 1), "");
    EXPECT_FALSE(File::exists(make_wstring(path + '\0')));
    EXPECT_FALSE(File::exists(L""));
}

TEST(File, MayBeClosedAndOpenedAgain) {
    const TemporaryDirectory directory;
    File file(make_wstring(directory.file("file")));
    file.close();
    file.open(3);
    file.open(1);
    file.close();
    file.close();
    EXPECT_NO_THROW(file.open(1));
}

TEST(File, MayHaveANameThatIsNotUtf8) {
    const TemporaryDirectory directory;
    const std::wstring path = make_wstring(directory.file("caf\xE9"));
    File(path).open(3);
    EXPECT_TRUE(File::exists(path));
    EXPECT_TRUE(std::filesystem::exists(directory.file("caf\xE9")));
}

TEST(FilePath, IsTheSameInEveryCopy) {
    const File::Path path(L"/some/file");
    const File::Path copy = path;
    File::Path assigned(L"");
    assigned = copy;
    EXPECT_EQ(path.text(), L"/some/file");
    EXPECT_EQ(copy.text(), L"/some/file");
    EXPECT_EQ(assigned.text(), L"/some/file");
}
