#include <gmock/gmock.h>

#include "gate/cmpi/Failure.h"

namespace gate {
namespace {

TEST(StaticStringTest, IsReadThroughItsTableAndByItsHandle) {
    StaticString message("The reason.");
    CMPIStatus status{CMPI_RC_ERR_FAILED, nullptr};
    EXPECT_STREQ(message.handle()->ft->getCharPtr(message.handle(), &status), "The reason.");
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_STREQ(message.handle()->ft->getCharPtr(message.handle(), nullptr), "The reason.");
    EXPECT_STREQ(static_cast<const char*>(message.handle()->hdl), "The reason.");
}

TEST(StaticStringTest, SurvivesItsReleaseAndThatOfItsClone) {
    StaticString message("The reason.");
    CMPIStatus status{CMPI_RC_ERR_FAILED, nullptr};
    CMPIString* clone = message.handle()->ft->clone(message.handle(), &status);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(message.handle()->ft->release(message.handle()).rc, CMPI_RC_OK);
    EXPECT_STREQ(clone->ft->getCharPtr(clone, nullptr), "The reason.");
    EXPECT_EQ(clone->ft->release(clone).rc, CMPI_RC_OK);
    EXPECT_STREQ(message.handle()->ft->getCharPtr(message.handle(), nullptr), "The reason.");
}

}  // namespace
}  // namespace gate
