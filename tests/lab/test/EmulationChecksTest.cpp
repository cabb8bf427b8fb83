#include "broker/RequestScope.h"
#include "host/operations/OperationsFixture.h"
#include "lab/emulation/ManagerEmulation.h"

// Differences between object managers in their checks of requests and responses.

namespace {

using cimhost::NamedValue;
using cimhost::Operation;
using cimhost::Status;
using cimhost::lab::Manager;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::StartsWith;
using testsupport::text;

/** The class Typed_Thing, whose provider is Echo. */
class EmulationChecksTest : public OperationsTest {
protected:
    EmulationChecksTest() {
        add("Typed_Thing", "Echo", "EchoProvider", true, false);
        options.classInfo = [](const std::string& name) {
            auto shape = std::make_shared<cimhost::ClassInfo>();
            shape->name = "Typed_Thing";
            shape->properties = {{"Name", CMPI_string, false, true, {}},
                                 {"Size", CMPI_uint8, false, false, {}},
                                 {"Depth", CMPI_sint32, false, false, {}},
                                 {"Since", CMPI_dateTime, false, false, {}},
                                 {"Note", CMPI_string, false, false, {}}};
            return name == shape->name ? shape : nullptr;
        };
    }

    Status modify(Manager which, const char* property, cimhost::Value value) {
        started.reset();
        options.behaviour = cimhost::lab::emulationOf(which);
        const NamedValue sent = testsupport::named(property, std::move(value));
        return manager()
            .perform(cimhost::Request::modifyInstance(OperationsTest::named("Typed_Thing", "a"), {{}, {sent}}))
            .status;
    }

    static Status statusOf(Manager which, std::size_t instances) {
        cimhost::Instance instance{OperationsTest::named("Typed_Thing", "some name"), {}};
        for (int property = 0; property < 18; ++property) {
            instance.properties.push_back(
                testsupport::named("A property " + std::to_string(property), text("A value")));
        }
        cimhost::ProviderResponse response;
        response.events.assign(instances, std::make_shared<cimhost::Instance>(instance));
        return cimhost::lab::emulationOf(which)->statusOf(response, Operation::enumerateInstances);
    }
};

TEST_F(EmulationChecksTest, IntegersOfAnotherTypeReachTheProviderOrAreMadeToFit) {
    for (const Manager each : cimhost::lab::everyManager) {
        EXPECT_TRUE(modify(each, "Size", testsupport::uint64(255)).ok());
        EXPECT_TRUE(modify(each, "Size", testsupport::sint32(7)).ok());
        EXPECT_TRUE(modify(each, "Depth", testsupport::sint64(-2147483648)).ok());
    }
    for (const Manager each : {Manager::standard, Manager::sfcb}) {
        EXPECT_TRUE(modify(each, "Size", testsupport::uint64(256)).ok());
    }
    EXPECT_EQ(modify(Manager::openPegasus, "Size", testsupport::uint64(256)).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(modify(Manager::openPegasus, "Size", testsupport::sint32(-1)).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(modify(Manager::openPegasus, "Depth", testsupport::sint64(-2147483649)).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(modify(Manager::openPegasus, "Size", testsupport::boolean(true)).rc, CMPI_RC_ERR_TYPE_MISMATCH);
}

TEST_F(EmulationChecksTest, AStringForANumberReachesTheProviderOrCrashesItOrIsRejected) {
    EXPECT_TRUE(modify(Manager::standard, "Size", text("5")).ok());
    EXPECT_THAT(modify(Manager::sfcb, "Size", text("5")).message,
                StartsWith("The manager's provider process would have died: "));
    EXPECT_TRUE(modify(Manager::sfcb, "Since", text("5")).ok());
    const Status refused = modify(Manager::openPegasus, "Size", text("5"));
    EXPECT_EQ(refused.rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_THAT(refused.message, HasSubstr("Size"));
    EXPECT_TRUE(modify(Manager::openPegasus, "Unknown", text("5")).ok())
        << "the provider decides about unknown properties";
}

TEST_F(EmulationChecksTest, AnInvalidDatetimeReachesTheProviderOrIsRejected) {
    const auto month13 = testsupport::dateTime("20261301000000.000000+000");
    EXPECT_TRUE(modify(Manager::standard, "Since", month13).ok());
    EXPECT_TRUE(modify(Manager::sfcb, "Since", month13).ok());
    EXPECT_EQ(modify(Manager::openPegasus, "Since", month13).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_TRUE(modify(Manager::openPegasus, "Since", testsupport::dateTime("20261201000000.000000+000")).ok());
}

TEST_F(EmulationChecksTest, ALongResponseFailsIfThereIsALimit) {
    for (const Manager each : cimhost::lab::everyManager) {
        EXPECT_TRUE(statusOf(each, 4000).ok());
    }
    EXPECT_EQ(statusOf(Manager::sfcb, 7000).rc, CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(statusOf(Manager::openPegasus, 7000).ok());
}

TEST_F(EmulationChecksTest, APropertyFilterKeepsKeysOrOnlyListedOnes) {
    const auto shown = [this](Manager which) {
        started.reset();
        options.behaviour = cimhost::lab::emulationOf(which);
        cimhost::RequestScope scope(manager().broker());
        const cimhost::Instance whole{OperationsTest::named("Typed_Thing", "a"),
                                      {testsupport::named("Note", text("n")), testsupport::named("Name", text("a"))}};
        auto* instance = const_cast<CMPIInstance*>(scope.instance(whole));
        const char* list[] = {"Note", nullptr};
        const char* keys[] = {"Name", nullptr};
        EXPECT_EQ(instance->ft->setPropertyFilter(instance, list, keys).rc, CMPI_RC_OK);
        return instance->ft->getPropertyCount(instance, nullptr);
    };
    EXPECT_EQ(shown(Manager::standard), 2U);
    EXPECT_EQ(shown(Manager::openPegasus), 2U);
    EXPECT_EQ(shown(Manager::sfcb), 1U);
}

}  // namespace
