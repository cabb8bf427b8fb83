// Translation between a computer and its lease or warranty.

#include "SettingKinds.h"

namespace {

using namespace providerTest;

TYPED_TEST_SUITE(SettingElement, SettingKinds, KindNames);

constexpr const char* noNameKey = "Could not find 'Name' Key in Moniker";
constexpr const char* noInstanceIdKey = "Could not find 'InstanceID' Key in Moniker";

TYPED_TEST(SettingElement, ReturnsTheStringFormOfTheComputersPath) {
    EXPECT_EQ(this->toElement({{"Name", "alpha"}}), (Keys{{"InstanceID", "/system/first%20box"}}));
}

TYPED_TEST(SettingElement, FindsTheSecondComputer) {
    EXPECT_EQ(this->toElement({{"Name", "beta"}}), (Keys{{"InstanceID", "/system/second%5Fbox"}}));
}

TYPED_TEST(SettingElement, ReturnsTheNameOfThePathsComputer) {
    EXPECT_EQ(this->toComputer({{"InstanceID", "/system/first%20box"}}), (Keys{{"Name", "alpha"}}));
    EXPECT_EQ(this->toComputer({{"InstanceID", "/system/second%5Fbox"}}), (Keys{{"Name", "beta"}}));
    EXPECT_EQ(this->toComputer({{"InstanceID", "/system/third"}}), (Keys{{"Name", "beta"}}));
}

TYPED_TEST(SettingElement, ReturnsTheNameOfANodeOfAnyType) {
    EXPECT_EQ(this->toComputer({{"InstanceID", "/system"}}), (Keys{{"Name", "the system"}}));
}

TYPED_TEST(SettingElement, ReturnsTheOriginalComputerAfterTranslationInBothDirections) {
    for (const char* name : {"alpha", "beta"}) {
        EXPECT_EQ(this->toComputer(this->toElement({{"Name", name}})), (Keys{{"Name", name}}));
    }
}

TYPED_TEST(SettingElement, ReturnsTheEmptyPathForAnUnknownComputer) {
    for (const char* name : {"ALPHA", "alpha ", "", "the system"}) {
        EXPECT_EQ(this->toElement({{"Name", name}}), (Keys{{"InstanceID", ""}})) << name;
    }
}

TYPED_TEST(SettingElement, FindsAKeyAfterOtherKeys) {
    EXPECT_EQ(this->toElement({{"CreationClassName", "alpha"}, {"Name", "beta"}}),
              (Keys{{"InstanceID", "/system/second%5Fbox"}}));
    EXPECT_EQ(this->toComputer({{"Name", "x"}, {"ElementName", "y"}, {"InstanceID", "/system/third"}}),
              (Keys{{"Name", "beta"}}));
}

TYPED_TEST(SettingElement, UsesTheFirstOfTwoKeysWithTheSameName) {
    EXPECT_EQ(this->toElement({{"Name", "alpha"}, {"Name", "beta"}}), (Keys{{"InstanceID", "/system/first%20box"}}));
    EXPECT_EQ(this->toComputer({{"InstanceID", "/system/third"}, {"InstanceID", "/system"}}), (Keys{{"Name", "beta"}}));
}

TYPED_TEST(SettingElement, RejectsAComputerWithoutItsKey) {
    for (const Keys& keys : {Keys{}, Keys{{"name", "alpha"}}, Keys{{"NAME", "alpha"}}, Keys{{"Name ", "alpha"}},
                             Keys{{"InstanceID", "alpha"}, {"", "alpha"}}}) {
        EXPECT_EQ(thrown<FrameworkException>([&] { this->toElement(keys); }), noNameKey);
    }
}

TYPED_TEST(SettingElement, RejectsALeaseOrWarrantyWithoutItsKey) {
    for (const Keys& keys : {Keys{}, Keys{{"InstanceId", "/system/third"}}, Keys{{"Name", "/system/third"}}}) {
        EXPECT_EQ(thrown<FrameworkException>([&] { this->toComputer(keys); }), noInstanceIdKey);
    }
}

TYPED_TEST(SettingElement, RejectsThePathOfAMissingOrUnnamedNode) {
    for (const char* path : {"", "/system/fourth", "/SYSTEM", "/system/first box ", "/system/fan", "lease 1"}) {
        EXPECT_EQ(thrown<InstrumentationException>([&] {
                      this->toComputer({{"InstanceID", path}});
                  }),
                  "Name Property on computer not available.")
            << path;
    }
}

TYPED_TEST(SettingElement, SearchesAgainInEachCall) {
    EXPECT_EQ(this->toElement({{"Name", "beta"}}), (Keys{{"InstanceID", "/system/second%5Fbox"}}));
    EXPECT_EQ(this->toElement({{"Name", "alpha"}}), (Keys{{"InstanceID", "/system/first%20box"}}));
    EXPECT_EQ(this->toComputer({{"InstanceID", "/system"}}), (Keys{{"Name", "the system"}}));
    EXPECT_EQ(this->toElement({{"Name", "beta"}}), (Keys{{"InstanceID", "/system/second%5Fbox"}}));
    EXPECT_THROW(this->toComputer({{"InstanceID", "/nowhere"}}), InstrumentationException);
    EXPECT_EQ(this->toComputer({{"InstanceID", "/system/third"}}), (Keys{{"Name", "beta"}}));
}

TYPED_TEST(SettingElement, SearchesAgainRegardlessOfTheCurrentRecord) {
    this->fill({"/system/first%20box", "unrelated", "/system/second%5Fbox"});
    typename TypeParam::Setting fresh;
    const auto toElement = [&](const char* name) {
        Moniker argument = moniker({{"Name", name}});
        return keysOf(TypeParam::elementMoniker(fresh, argument));
    };
    const auto toComputer = [&](const char* path) {
        Moniker argument = moniker({{"InstanceID", path}});
        return keysOf(fresh.getComputerMoniker(argument));
    };
    const Keys alpha = {{"InstanceID", "/system/first%20box"}};
    const Keys beta = {{"InstanceID", "/system/second%5Fbox"}};
    EXPECT_EQ(toElement("beta"), beta);
    EXPECT_EQ(toElement("alpha"), alpha) << "the element is at its record";
    EXPECT_EQ(toComputer("/system/third"), (Keys{{"Name", "beta"}}));
    EXPECT_EQ(toElement("alpha"), alpha);
    EXPECT_EQ(toElement("unknown"), (Keys{{"InstanceID", ""}}));
    EXPECT_EQ(toElement("beta"), beta);
    EXPECT_EQ(toComputer("/system/first%20box"), (Keys{{"Name", "alpha"}}));
}

TYPED_TEST(SettingElement, KeepsTheKeysOfItsArgument) {
    const Keys keys = {{"Other", "x"}, {"Name", "alpha"}, {"InstanceID", "/system"}};
    Moniker argument = moniker(keys);
    TypeParam::elementMoniker(this->setting, argument);
    EXPECT_EQ(keysOf(argument), keys);
    std::string name;
    EXPECT_TRUE(argument.getName(name));
    EXPECT_EQ(name, "Name");
    this->setting.getComputerMoniker(argument);
    EXPECT_EQ(keysOf(argument), keys);
}

TYPED_TEST(SettingElement, NeedsNoRecordWithTheIdentifier) {
    this->fill({"unrelated"});
    typename TypeParam::Setting fresh;
    Moniker argument = moniker({{"Name", "alpha"}});
    EXPECT_EQ(keysOf(TypeParam::elementMoniker(fresh, argument)), (Keys{{"InstanceID", "/system/first%20box"}}));
}

TYPED_TEST(SettingElement, MovesToTheRecordOfTheComputer) {
    this->fill({"unrelated", "/system/second%5Fbox"});
    typename TypeParam::Setting fresh;
    Moniker argument = moniker({{"Name", "beta"}});
    agentEnvironment::forgetLog();
    TypeParam::elementMoniker(fresh, argument);
    const auto evaluations = logMessagesOf(TypeParam::elementFile, "evaluate");
    EXPECT_EQ(evaluations.size(), 4U) << "the first record is skipped, the second is kept";
}

TYPED_TEST(SettingElement, ThrowsIfTheCountIsNotZeroAndTheTableIsEmpty) {
    this->count() = 1;
    EXPECT_EQ(thrown<InstrumentationException>([] { typename TypeParam::Setting fresh; }),
              Words<typename TypeParam::Store>::noRecords);
}

}  // namespace
