// An unnamed computer that precedes or follows the computer that is searched for.

#include "SettingKinds.h"

namespace {

using namespace providerTest;

constexpr const char* namelessNodes = R"(
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

template <class Kind>
class NamelessSetting : public SettingElement<Kind> {
protected:
    NamelessSetting() : SettingElement<Kind>(namelessNodes) {}
};

TYPED_TEST_SUITE(NamelessSetting, SettingKinds, KindNames);

TYPED_TEST(NamelessSetting, FailsOnAnUnnamedComputerBeforeTheMatch) {
    for (const char* name : {"behind", "unknown"}) {
        EXPECT_EQ(thrown<InstrumentationException>([&] {
                      this->toElement({{"Name", name}});
                  }),
                  "Name Property on Computer Node not available.");
    }
    EXPECT_EQ(logMessagesOf(TypeParam::elementFile, "setFilter").size(), 0U);
}

TYPED_TEST(NamelessSetting, IgnoresAnUnnamedComputerAfterTheMatch) {
    EXPECT_EQ(this->toElement({{"Name", "before"}}), (Keys{{"InstanceID", "/first"}}));
}

TYPED_TEST(NamelessSetting, RejectsThePathOfAnUnnamedComputer) {
    EXPECT_EQ(thrown<InstrumentationException>([&] {
                  this->toComputer({{"InstanceID", "/nameless"}});
              }),
              "Name Property on computer not available.");
    EXPECT_EQ(this->toComputer({{"InstanceID", "/last"}}), (Keys{{"Name", "behind"}}));
}

}  // namespace
