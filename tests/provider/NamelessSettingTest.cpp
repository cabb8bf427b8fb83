// An unnamed computer before and after those that are searched.

#include "SettingKinds.h"

const char* const agentNodes = R"(
[[instrumentation.node]]
type = 40
path = "/first"
properties = { "108" = "before" }

[[instrumentation.node]]
type = 40
path = "/nameless"
properties = { "36" = "Example Maker" }

[[instrumentation.node]]
type = 40
path = "/last"
properties = { "108" = "behind" }
)";

namespace {

using namespace providerTest;

TYPED_TEST_SUITE(SettingElement, SettingKinds, KindNames);

TYPED_TEST(SettingElement, FailsOnAnUnnamedComputerBeforeTheMatch) {
    for (const char* name : {"behind", "unknown"}) {
        EXPECT_EQ(thrown<InstrumentationException>([&] {
                      this->toElement({{"Name", name}});
                  }),
                  "Name Property on Computer Node not available.");
    }
    EXPECT_EQ(logMessagesOf(TypeParam::elementFile, "setFilter").size(), 0U);
}

TYPED_TEST(SettingElement, IgnoresAnUnnamedComputerAfterTheMatch) {
    EXPECT_EQ(this->toElement({{"Name", "before"}}), (Keys{{"InstanceID", "/first"}}));
}

TYPED_TEST(SettingElement, RejectsThePathOfAnUnnamedComputer) {
    EXPECT_EQ(thrown<InstrumentationException>([&] {
                  this->toComputer({{"InstanceID", "/nameless"}});
              }),
              "Name Property on computer not available.");
    EXPECT_EQ(this->toComputer({{"InstanceID", "/last"}}), (Keys{{"Name", "behind"}}));
}

}  // namespace
