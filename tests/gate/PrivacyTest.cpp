#include "GateFixture.h"
#include "support/Files.h"
#include "support/FullDisk.h"

// Checks that the message of a refused request does not contain data of other clients.

namespace gatetest {
namespace {

using testing::HasSubstr;
using testing::Not;
using testsupport::FullDisk;
using Outcomes = std::vector<Outcome>;

/** Two clients, the first of which has stored strings that contain its name in leases, a warranty and asset data. */
class PrivacyTest : public GateTest {
protected:
    static constexpr const char* first = "alice-with-a-name-of-some-length";
    static constexpr const char* second = "bob";

    PrivacyTest() {
        const std::string name = first;
        EXPECT_THAT(create(ofFirst, {named("Lessor", text(name + " Leasing")), named("BaseRent", text("1 " + name))}),
                    isAnswered(1));
        EXPECT_THAT(create(ofFirst, {named("Warrantor", text(name + " Services"))}, warranty), isAnswered(1));
        EXPECT_THAT(modifyAsset({named("PrimaryOwnerName", text(name)), named("AssetNumber", text("A-1 " + name)),
                                 named("PersonalizedLabel1", text("Room of " + name)),
                                 named("PersonalizedData1", text(name + "'s"))}),
                    isDone());
        EXPECT_THAT(create("shared", {named("FairMarketValue", text("for " + name))}), isAnswered(1));
    }

    Outcome modifyAsset(std::vector<NamedValue> properties) {
        const auto paths = gate().enumerateInstanceNames(classPath(asset)).paths();
        const ObjectPath path = paths.empty() ? classPath(asset) : paths.front();
        return gate().modifyInstance(path, testsupport::instance(path, std::move(properties)));
    }

    /**
     * Expects that each request was refused with a message, and that the messages do not contain data of the first
     * client.
     */
    static void expectNothingOfFirst(const Outcomes& refusals) {
        for (const Outcome& refusal : refusals) {
            EXPECT_NE(refusal.rc, CMPI_RC_OK);
            EXPECT_TRUE(refusal.hasMessage) << refusal.rc;
            EXPECT_NE(refusal.message, "");
            EXPECT_THAT(refusal.message, Not(HasSubstr(first)));
            EXPECT_THAT(refusal.message, Not(HasSubstr(std::string(first).substr(1)))) << "a part of the name";
        }
    }

    const std::string ofFirst = "lease-of-a";  ///< an identifier that the second client may know
};

TEST_F(PrivacyTest, ARefusedRequestDoesNotRevealOtherRecords) {
    const std::string mine = std::string(second) + "-lease";
    const NamedValue lossy = named("Lessor", text(std::string(second) + "_of_the_file"));
    expectNothingOfFirst({
        create(mine, {lossy}),
        create("shared", {named("Lessor", text("the second"))}),
        create(ofFirst),
        create(ofFirst, {}, warranty),
        create("", {named("Lessor", text(second))}),
        modify(mine, {named("Lessor", text("Leasing"))}),
        modify(ofFirst, {lossy}),
        modify(ofFirst, {named("LeaseTerm", text(second))}),
        modify(ofFirst, {named("ElementName", text(second))}),
        modify("shared", {named("BaseRent", text(std::string(second) + "\tmoney"))}),
        remove(mine),
        gate().getInstance(keyedPath(warranty, second)),
    });
}

TEST_F(PrivacyTest, ARefusedChangeOfAssetDataDoesNotRevealThem) {
    expectNothingOfFirst({
        modifyAsset({named("AssetIdTag", text(second))}),
        modifyAsset({named("PurchaseDate", text("yesterday"))}),
        modifyAsset({named("PersonalizedLabel1", uint32(1))}),
        modifyAsset({named("NoSuchProperty", text(second))}),
        create(second, {}, asset),
        remove(second, asset),
    });
}

TEST_F(PrivacyTest, AFullDiskDoesNotRevealOtherRecords) {
    const std::string leases = testsupport::readFile(dataFile("Lease.dat"));
    const NamedValue large = named("Lessor", text(std::string(1000, 'x')));
    {
        const FullDisk disk(leases.size() + 10);
        expectNothingOfFirst({create(second), create(second, {large}), modify(ofFirst, {large})});
    }
    const FullDisk disk(leases.size() / 2);  // smaller than the old content
    expectNothingOfFirst({modify("shared", {large}), remove("shared")});
    const FullDisk none(1);
    expectNothingOfFirst({modifyAsset({named("AssetNumber", text(second))})});
}

TEST_F(PrivacyTest, AMissingDataDirectoryDoesNotRevealOtherRecords) {
    std::filesystem::remove_all(agentEnvironment::dataDirectory());
    expectNothingOfFirst(
        {create(second), modify(ofFirst, {named("LeaseTerm", uint32(1))}), remove(ofFirst), remove(ofFirst, warranty)});
}

}  // namespace
}  // namespace gatetest
