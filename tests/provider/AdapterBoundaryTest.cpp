// Tests adapters with a framework that fails, or that writes a value and returns false. The test program replaces
// functions of the framework.

#include <gmock/gmock.h>

#include <functional>

#include "CMPIAssetIDDetail.h"
#include "KO/Exceptions.h"
#include "KO/Instrumentation.h"
#include "KO/ProviderUtilities.h"
#include "RequestFixture.h"

namespace {

/** Replaces the framework's request for the computer's path: counts the calls, and calls `before` first. */
struct ComputerDouble {
    std::function<void()> before = [] {};
    int calls = 0;
};

ComputerDouble& computer() {
    static ComputerDouble theDouble;
    return theDouble;
}

constexpr const char* onlyProperty = "SystemLocation";

}  // namespace

std::string KO::Instrumentation::getPathToComputer() {
    ++computer().calls;
    computer().before();
    return "/system/computer";
}

/** Writes a value for every property but returns true for one property only. */
bool KO::ProviderUtilities::getProperty(const CMPIInstance*, const char* name, std::string& value, bool) {
    value = std::string("written for ") + name;
    return name == std::string(onlyProperty);
}

namespace {

using namespace providerTest;
using testing::ElementsAre;
using testing::IsEmpty;

using KO::LeaseWarrantyProvider::AssetAdapterTraits;
using KO::LeaseWarrantyProvider::AssetIDDetails;

class AssetModificationBoundary : public CleanAgent {};

TEST_F(AssetModificationBoundary, IgnoresValuesOfMissingProperties) {
    write(agentEnvironment::dataDirectory() / "asset.dat",
          "USER.AssetNumber=A-1\nUSER.Name=Ann\nUSER.PurchaseDate=20250101000000.000000+000\nUSER.Location=Hall\n");
    AssetIDDetails details;
    const CMPIInstance instance{};
    AssetAdapterTraits::modify(details, &instance);
    const AssetIDDetails reread;
    std::string text;
    EXPECT_TRUE(reread.getAssetNumber(text));
    EXPECT_EQ(text, "A-1");
    EXPECT_TRUE(reread.getPrimaryOwnerName(text));
    EXPECT_EQ(text, "Ann");
    EXPECT_TRUE(reread.getPurchaseDate(text));
    EXPECT_EQ(text, "20250101000000.000000+000");
    EXPECT_TRUE(reread.getSystemLocation(text));
    EXPECT_EQ(text, "written for SystemLocation");
    std::vector<AssetIDDetails::PersonalizedPair> pairs;
    EXPECT_TRUE(details.getPersonalizedData(pairs));
    EXPECT_EQ(pairs, (std::vector<AssetIDDetails::PersonalizedPair>(5)));
}

/** Tests both classes whose records clients can create. */
class CreationBoundary : public RequestTest {
protected:
    void SetUp() override {
        RequestTest::SetUp();
        computer() = {};
    }
    void TearDown() override {
        computer() = {};
        RequestTest::TearDown();
    }

    static void expectNothingCreated() {
        EXPECT_THAT(LeaseBase::cache.table, IsEmpty());
        EXPECT_THAT(WarrantyBase::cache.table, IsEmpty());
        EXPECT_TRUE(std::filesystem::is_empty(agentEnvironment::dataDirectory()));
    }

    static constexpr const char* classNames[] = {"VELKO_Lease", "VELKO_Warranty"};
};

TEST_F(CreationBoundary, RequestsTheComputersPathOnce) {
    for (const char* className : classNames) {
        computer().calls = 0;
        EXPECT_EQ(create(className, {textKey("InstanceID", "A")}), CMPI_RC_OK);
        EXPECT_EQ(computer().calls, 1) << className;
    }
    EXPECT_EQ(LeaseBase::cache.table.size(), 1U);
    EXPECT_EQ(WarrantyBase::cache.table.size(), 1U);
}

TEST_F(CreationBoundary, RequestsTheComputersPathEvenWithoutAKey) {
    for (const char* className : classNames) {
        computer().calls = 0;
        EXPECT_EQ(create(className, {}), CMPI_RC_OK);
        EXPECT_EQ(computer().calls, 1) << className;
        EXPECT_THAT(events, ElementsAre(testing::VariantWith<cimhost::Done>(testing::_)));
        events.clear();
    }
    expectNothingCreated();
}

TEST_F(CreationBoundary, CreatesNothingIfTheComputersPathIsNotAvailable) {
    computer().before = [] { throw KO::InstrumentationException("no tree"); };
    for (const char* className : classNames) {
        EXPECT_EQ(create(className, {textKey("InstanceID", "A")}), CMPI_RC_OK);
        EXPECT_THAT(events, IsEmpty());
    }
    const std::string file = "LeaseAndWarrantyProvider.cpp";
    EXPECT_THAT(logMessagesOf(file, "LeaseAndWarranty_CreateInstance"),
                ElementsAre(variable("classId", "20", file), message("no tree", file), variable("classId", "21", file),
                            message("no tree", file)));
    expectNothingCreated();
}

}  // namespace
