#include <gmock/gmock.h>
#include <sys/stat.h>

#include "KO/Exceptions.h"
#include "KO/PropertyFile.h"
#include "KO/Strings.h"
#include "KO/Utils.h"
#include "support/TemporaryDirectory.h"

using KO::DateTime;
using KO::FrameworkException;
using KO::PropertyFile;
using KO::Utils;

namespace {

class PropertyFileTest : public testing::Test {
protected:
    static KO::File::Path path(const std::string& text) { return KO::File::Path(KO::make_wstring(text)); }

    /** Returns the inode of the file, which changes when the file is replaced. */
    ino_t identity() const {
        struct stat status {};
        EXPECT_EQ(::stat(directory.file("asset.dat").c_str(), &status), 0);
        return status.st_ino;
    }

    testsupport::TemporaryDirectory directory;
    PropertyFile file{path(directory.file("asset.dat"))};
};

TEST_F(PropertyFileTest, KeepsStringsAndDates) {
    const DateTime date = Utils::convertStringToDateTime("20240229123456.000789-330");
    file.open(3);
    Utils::WriteStringToFile(file, "USER.Name", "Ann\nBea = 1");
    Utils::WriteDateToFile(file, "USER.PurchaseDate", date);
    file.close();

    PropertyFile again(path(directory.file("asset.dat")));
    again.open(1);
    EXPECT_EQ(Utils::ReadStringFromFile(again, "USER.Name"), "Ann\nBea = 1");
    EXPECT_EQ(Utils::convertCIMDateTime(Utils::ReadDateFromFile(again, "USER.PurchaseDate")),
              "20240229123456.000789-330");
    again.close();
    EXPECT_EQ(directory.read("asset.dat"), "USER.Name=Ann\\nBea = 1\nUSER.PurchaseDate=20240229123456.000789-330\n");
}

TEST_F(PropertyFileTest, ReadsAbsentKeysAsEmptyStringsAndNoDate) {
    directory.write("asset.dat", "USER.PurchaseDate=yesterday\n");
    file.open(1);
    EXPECT_EQ(Utils::ReadStringFromFile(file, "USER.Name"), "");
    EXPECT_EQ(Utils::convertCIMDateTime(Utils::ReadDateFromFile(file, "USER.Name")), "00000000000000.000000-000");
    EXPECT_EQ(Utils::convertCIMDateTime(Utils::ReadDateFromFile(file, "USER.PurchaseDate")),
              "00000000000000.000000-000");
}

TEST_F(PropertyFileTest, WritesNoDateAsAnEmptyString) {
    file.open(3);
    Utils::WriteDateToFile(file, "key", DateTime());
    file.close();
    EXPECT_EQ(directory.read("asset.dat"), "key=\n");
}

TEST_F(PropertyFileTest, KeepsEntriesThatAreNotWritten) {
    directory.write("asset.dat", "# by hand\nOTHER.Key = 1\nUSER.Name=old\n");
    file.open(3);
    Utils::WriteStringToFile(file, "USER.Name", "new");
    EXPECT_EQ(Utils::ReadStringFromFile(file, "USER.Name"), "new");
    file.close();
    EXPECT_EQ(directory.read("asset.dat"), "# by hand\nOTHER.Key = 1\nUSER.Name=new\n");
}

TEST_F(PropertyFileTest, IsCreatedEmptyWhenOpenedForWriting) {
    file.open(3);
    struct stat status {};
    ASSERT_EQ(::stat(directory.file("asset.dat").c_str(), &status), 0);
    EXPECT_EQ(status.st_size, 0);
    file.close();
}

TEST_F(PropertyFileTest, IsNotReplacedIfNothingWasWritten) {
    directory.write("asset.dat", "a=1\nno line end");
    const ino_t before = identity();
    file.open(3);
    file.close();
    EXPECT_EQ(identity(), before);
    EXPECT_EQ(directory.read("asset.dat"), "a=1\nno line end");
}

TEST_F(PropertyFileTest, IsReplacedWhenItIsClosed) {
    directory.write("asset.dat", "a=1\n");
    file.open(3);
    Utils::WriteStringToFile(file, "a", "2");
    EXPECT_EQ(directory.read("asset.dat"), "a=1\n");
    file.close();
    EXPECT_EQ(directory.read("asset.dat"), "a=2\n");
}

TEST_F(PropertyFileTest, DiscardsChangesUnlessItIsClosed) {
    directory.write("asset.dat", "a=1\n");
    {
        PropertyFile abandoned(path(directory.file("asset.dat")));
        abandoned.open(3);
        Utils::WriteStringToFile(abandoned, "a", "2");
    }
    EXPECT_EQ(directory.read("asset.dat"), "a=1\n");

    file.open(3);
    Utils::WriteStringToFile(file, "a", "3");
    file.open(3);
    file.close();
    EXPECT_EQ(directory.read("asset.dat"), "a=1\n");
}

TEST_F(PropertyFileTest, KeepsTheModeOfTheFile) {
    const std::string name = directory.write("asset.dat", "a=1\n");
    ASSERT_EQ(::chmod(name.c_str(), 0600), 0);
    file.open(3);
    Utils::WriteStringToFile(file, "a", "2");
    file.close();
    struct stat status {};
    ASSERT_EQ(::stat(name.c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 07777U, 0600U);
}

TEST_F(PropertyFileTest, MustBeOpenToBeReadOrWritten) {
    EXPECT_THROW(Utils::ReadStringFromFile(file, "a"), FrameworkException);
    EXPECT_THROW(Utils::ReadDateFromFile(file, "a"), FrameworkException);
    EXPECT_THROW(Utils::WriteStringToFile(file, "a", "1"), FrameworkException);
    EXPECT_THROW(Utils::WriteDateToFile(file, "a", DateTime()), FrameworkException);
    file.open(3);
    file.close();
    EXPECT_THROW(Utils::ReadStringFromFile(file, "a"), FrameworkException);
    EXPECT_NO_THROW(file.close());
}

TEST_F(PropertyFileTest, CannotBeWrittenWhenOpenedForReading) {
    directory.write("asset.dat", "a=1\n");
    file.open(1);
    EXPECT_THROW(Utils::WriteStringToFile(file, "a", "2"), FrameworkException);
    EXPECT_EQ(Utils::ReadStringFromFile(file, "a"), "1");
    file.close();
    EXPECT_EQ(directory.read("asset.dat"), "a=1\n");
}

TEST_F(PropertyFileTest, ReportsWhyItCannotBeOpened) {
    PropertyFile ofDirectory(path(directory.withSlash()));
    for (const unsigned long mode : {1UL, 3UL}) {
        try {
            ofDirectory.open(mode);
            FAIL() << "no exception";
        } catch (const FrameworkException& failure) {
            EXPECT_EQ(failure.what(), "Cannot open " + directory.withSlash() + ": Is a directory");
        }
    }
    EXPECT_THROW(file.open(1), FrameworkException) << "absent";
    EXPECT_THROW(file.open(2), FrameworkException) << "no such mode";
}

TEST_F(PropertyFileTest, IsClosedAndUnchangedWhenItCannotBeCommitted) {
    directory.write("asset.dat", "a=1\n");
    file.open(3);
    Utils::WriteStringToFile(file, "a", "2");
    std::filesystem::remove(directory.file("asset.dat"));
    std::filesystem::create_directory(directory.file("asset.dat"));
    EXPECT_THROW(file.close(), FrameworkException);
    EXPECT_NO_THROW(file.close());
    EXPECT_TRUE(std::filesystem::is_directory(directory.file("asset.dat")));
}

}  // namespace
