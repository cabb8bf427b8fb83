// Tests exceptions that the framework throws in a moniker function, and keys that cannot be selected. The test program
// replaces the functions of Moniker that read keys.

#include <csignal>
#include <functional>
#include <memory>
#include <new>
#include <optional>
#include <set>
#include <stdexcept>

#include "SettingKinds.h"

namespace {

using Key = std::pair<std::string, std::string>;

/** The keys of every moniker in the program. */
struct MonikerDouble {
    std::function<void()> beforeCounting = [] {};
    std::vector<Key> keys{};
    std::optional<std::size_t> selected{};
    std::set<unsigned int> unselectable{};
};

MonikerDouble& monikers() {
    static MonikerDouble theDouble;
    return theDouble;
}

/** Reads the selected key's name or value; returns false without a selection. */
bool readSelected(std::string Key::*part, std::string& text) {
    if (!monikers().selected) {
        return false;
    }
    text = monikers().keys[*monikers().selected].*part;
    return true;
}

}  // namespace

unsigned int KO::Moniker::getKeyCount() const {
    monikers().beforeCounting();
    return static_cast<unsigned int>(monikers().keys.size());
}

bool KO::Moniker::selectKey(unsigned int index) {
    if (monikers().unselectable.count(index) != 0) {
        return false;
    }
    monikers().selected = index;
    return true;
}

bool KO::Moniker::getName(std::string& name) const {
    return readSelected(&Key::first, name);
}

bool KO::Moniker::getValue(std::string& value) const {
    return readSelected(&Key::second, value);
}

namespace {

using namespace providerTest;

constexpr const char* noNameKey = "Could not find 'Name' Key in Moniker";
constexpr const char* noInstanceIdKey = "Could not find 'InstanceID' Key in Moniker";

template <class Kind>
class MonikerBoundary : public RecordStore<typename Kind::Store> {
protected:
    void TearDown() override {
        monikers() = {};
        RecordStore<typename Kind::Store>::TearDown();
    }

    template <class Thrown>
    static void frameworkThrows(const Thrown& failure) {
        monikers().beforeCounting = [failure] { throw failure; };
    }

    void toElement() { Kind::elementMoniker(setting, argument); }
    void toComputer() { setting.getComputerMoniker(argument); }

    /** Expects both operations to terminate the process. */
    void expectEnd() {
        EXPECT_EXIT(toElement(), testing::KilledBySignal(SIGABRT), "terminate");
        EXPECT_EXIT(toComputer(), testing::KilledBySignal(SIGABRT), "terminate");
    }

    std::unique_ptr<typename Kind::Setting> owner = std::make_unique<typename Kind::Setting>();
    typename Kind::Setting& setting = *owner;
    Moniker argument{};
};

template <class Kind>
using MonikerBoundaryDeathTest = MonikerBoundary<Kind>;

TYPED_TEST_SUITE(MonikerBoundary, SettingKinds, KindNames);
TYPED_TEST_SUITE(MonikerBoundaryDeathTest, SettingKinds, KindNames);

TYPED_TEST(MonikerBoundary, PropagatesFailuresOfTheElement) {
    EXPECT_EQ(thrown<FrameworkException>([&] { this->toElement(); }), noNameKey);
    EXPECT_EQ(thrown<FrameworkException>([&] { this->toComputer(); }), noInstanceIdKey);
}

TYPED_TEST(MonikerBoundary, PropagatesInstrumentationExceptions) {
    this->frameworkThrows(InstrumentationException("from below"));
    EXPECT_EQ(thrown<InstrumentationException>([&] { this->toElement(); }), "from below");
    EXPECT_EQ(thrown<InstrumentationException>([&] { this->toComputer(); }), "from below");
}

TYPED_TEST(MonikerBoundary, PropagatesFrameworkExceptions) {
    this->frameworkThrows(FrameworkException("from below"));
    EXPECT_EQ(thrown<FrameworkException>([&] { this->toElement(); }), "from below");
    EXPECT_EQ(thrown<FrameworkException>([&] { this->toComputer(); }), "from below");
}

TYPED_TEST(MonikerBoundary, ReportsLackOfMemoryAsAFrameworkException) {
    this->frameworkThrows(std::bad_alloc());
    EXPECT_EQ(thrown<FrameworkException>([&] { this->toElement(); }), "out of memory");
    EXPECT_EQ(thrown<FrameworkException>([&] { this->toComputer(); }), "out of memory");
}

TYPED_TEST(MonikerBoundaryDeathTest, TerminatesOnAProviderException) {
    this->frameworkThrows(KO::ProviderException("from below"));
    this->expectEnd();
}

TYPED_TEST(MonikerBoundaryDeathTest, TerminatesOnAStandardException) {
    this->frameworkThrows(std::runtime_error("from below"));
    this->expectEnd();
}

TYPED_TEST(MonikerBoundaryDeathTest, TerminatesOnANonstandardException) {
    this->frameworkThrows(5);
    this->expectEnd();
}

TYPED_TEST(MonikerBoundary, SkipsAKeyThatCannotBeSelected) {
    monikers().keys = {
        {"Name", "unknown"}, {"Name", "testhost"}, {"InstanceID", "/nowhere"}, {"InstanceID", "/system"}};
    monikers().selected = 0;
    monikers().unselectable = {0, 2};
    this->toElement();
    EXPECT_EQ(logMessagesOf(TypeParam::sourceFile, TypeParam::toElement).at(1),
              variable("Name", "testhost", TypeParam::sourceFile));
    monikers().selected = 2;
    this->toComputer();
    EXPECT_EQ(logMessagesOf(TypeParam::sourceFile, "getComputerMoniker").at(1),
              variable("Name", "testhost", TypeParam::sourceFile))
        << "the name of the system";
}

TYPED_TEST(MonikerBoundary, DoesNotReuseThePrecedingKeyIfSelectionFails) {
    monikers().keys = {{"Name", "testhost"}, {"InstanceID", "/system"}};
    monikers().unselectable = {0, 1};
    monikers().selected = 0;
    EXPECT_EQ(thrown<FrameworkException>([&] { this->toElement(); }), noNameKey);
    monikers().selected = 1;
    EXPECT_EQ(thrown<FrameworkException>([&] { this->toComputer(); }), noInstanceIdKey);
}

}  // namespace
