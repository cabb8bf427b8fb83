// A computer without a name, before and behind those that are looked for.

#include "SettingSides.h"

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

TYPED_TEST_SUITE(SettingElement, SettingSides, SideNames);

TYPED_TEST(SettingElement, FailsOnANamelessComputerBeforeTheOneLookedFor) {
    for (const char* name : {"behind", "nobody"}) {
        EXPECT_EQ(thrown<InstrumentationException>([&] {
                      this->toElement({{"Name", name}});
                  }),
                  "Name Property on Computer Node not available.");
    }
    EXPECT_EQ(textsOf(TypeParam::elementFile, "setFilter").size(), 0U);
}

TYPED_TEST(SettingElement, DoesNotReachANamelessComputerBehindTheOneLookedFor) {
    EXPECT_EQ(this->toElement({{"Name", "before"}}), (Keys{{"InstanceID", "/first"}}));
}

TYPED_TEST(SettingElement, RefusesThePathOfANamelessComputer) {
    EXPECT_EQ(thrown<InstrumentationException>([&] {
                  this->toComputer({{"InstanceID", "/nameless"}});
              }),
              "Name Property on computer not available.");
    EXPECT_EQ(this->toComputer({{"InstanceID", "/last"}}), (Keys{{"Name", "behind"}}));
}

}  // namespace
