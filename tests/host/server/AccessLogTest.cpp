#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>

#include "server/AccessLog.h"
#include "support/Files.h"
#include "support/TemporaryDirectory.h"

using namespace cimhost::server;

namespace {

const AccessRecord record{
    "127.0.0.1:40000", "alice", "EnumerateInstances", "VELKO_Lease", 200, 0, 12, std::chrono::microseconds(1500)};

TEST(AccessLogTest, ALineHasAllFieldsInOrder) {
    EXPECT_EQ(formatted(record, std::chrono::system_clock::from_time_t(0)),
              "1970-01-01T00:00:00Z 127.0.0.1:40000 alice EnumerateInstances VELKO_Lease 200/0 12 1.500");
}

TEST(AccessLogTest, ClientsCannotForgeLines) {
    AccessRecord forged;
    forged.user = "a b\n1970-01-01 \\ \xC3\xA4";
    EXPECT_EQ(formatted(forged, std::chrono::system_clock::from_time_t(0)),
              "1970-01-01T00:00:00Z - a\\x20b\\x0a1970-01-01\\x20\\x5c\\x20\\xc3\\xa4 - - 0/0 0 0.000");
    forged.user = std::string(10'000, 'x');
    EXPECT_LT(formatted(forged, {}).size(), 300U);
}

TEST(AccessLogTest, ReopeningFollowsARotation) {
    const testsupport::TemporaryDirectory directory;
    const std::string file = directory.withSlash() + "access.log";
    AccessLog log(file);
    log.write("first");
    std::filesystem::rename(file, file + ".1");
    log.write("second");
    log.reopen();
    log.write("third");
    EXPECT_THAT(testsupport::readFile(file + ".1"), testing::HasSubstr("second\n"));
    EXPECT_THAT(testsupport::readFile(file), testing::EndsWith("third\n"));
    EXPECT_EQ(std::filesystem::status(file).permissions() & std::filesystem::perms::others_all,
              std::filesystem::perms::none);
}

TEST(AccessLogTest, AFileThatCannotBeOpenedIsAnError) {
    EXPECT_THROW(AccessLog("/nonexistent/access.log"), std::system_error);
}

}  // namespace
