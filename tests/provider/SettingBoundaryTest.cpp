// What the framework throws in a moniker operation, and what of it may leave. The program's own
// Moniker::getKeyCount takes the place of the framework's.

#include "SettingSides.h"

#include <csignal>
#include <functional>
#include <memory>
#include <new>
#include <stdexcept>

namespace {

/** What the framework does in place of counting keys. */
std::function<void()>& insteadOfCounting() {
    static std::function<void()> action = [] {};
    return action;
}

}  // namespace

unsigned int KO::Moniker::getKeyCount() const {
    insteadOfCounting()();
    return 0;
}

namespace {

using namespace providerTest;

template <class Side>
class MonikerBoundary : public RecordStore<typename Side::Store> {
protected:
    void TearDown() override {
        insteadOfCounting() = [] {};
        RecordStore<typename Side::Store>::TearDown();
    }

    template <class Thrown>
    static void frameworkThrows(const Thrown& failure) {
        insteadOfCounting() = [failure] { throw failure; };
    }

    void toElement() { Side::elementMoniker(setting, argument); }
    void toComputer() { setting.getComputerMoniker(argument); }

    /** Both operations end the process, by its abnormal end. */
    void expectEnd() {
        EXPECT_EXIT(toElement(), testing::KilledBySignal(SIGABRT), "terminate");
        EXPECT_EXIT(toComputer(), testing::KilledBySignal(SIGABRT), "terminate");
    }

    std::unique_ptr<typename Side::Setting> owner = std::make_unique<typename Side::Setting>();
    typename Side::Setting& setting = *owner;
    Moniker argument{};
};

template <class Side>
using MonikerBoundaryDeathTest = MonikerBoundary<Side>;

TYPED_TEST_SUITE(MonikerBoundary, SettingSides, SideNames);
TYPED_TEST_SUITE(MonikerBoundaryDeathTest, SettingSides, SideNames);

TYPED_TEST(MonikerBoundary, LetsTheElementsOwnFailuresOut) {
    EXPECT_EQ(thrown<FrameworkException>([&] { this->toElement(); }), "Could not find 'Name' Key in Moniker");
    EXPECT_EQ(thrown<FrameworkException>([&] { this->toComputer(); }), "Could not find 'InstanceID' Key in Moniker");
}

TYPED_TEST(MonikerBoundary, LetsInstrumentationExceptionsOut) {
    this->frameworkThrows(InstrumentationException("from below"));
    EXPECT_EQ(thrown<InstrumentationException>([&] { this->toElement(); }), "from below");
    EXPECT_EQ(thrown<InstrumentationException>([&] { this->toComputer(); }), "from below");
}

TYPED_TEST(MonikerBoundary, LetsFrameworkExceptionsOut) {
    this->frameworkThrows(FrameworkException("from below"));
    EXPECT_EQ(thrown<FrameworkException>([&] { this->toElement(); }), "from below");
    EXPECT_EQ(thrown<FrameworkException>([&] { this->toComputer(); }), "from below");
}

TYPED_TEST(MonikerBoundaryDeathTest, EndsTheProcessOnAProviderException) {
    this->frameworkThrows(KO::ProviderException("from below"));
    this->expectEnd();
}

TYPED_TEST(MonikerBoundaryDeathTest, EndsTheProcessOnAStandardException) {
    this->frameworkThrows(std::runtime_error("from below"));
    this->expectEnd();
    this->frameworkThrows(std::bad_alloc());
    this->expectEnd();
}

TYPED_TEST(MonikerBoundaryDeathTest, EndsTheProcessOnWhatIsNoExceptionObject) {
    this->frameworkThrows(5);
    this->expectEnd();
}

}  // namespace
