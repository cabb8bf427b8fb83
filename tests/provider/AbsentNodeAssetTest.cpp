// Tests the asset element with an agent without a computer node or without a system node. The element then does not
// read its file.

#include <gmock/gmock.h>

#include "AssetSupport.h"

namespace {

using namespace providerTest;
using testing::ElementsAre;

constexpr const char* onlySystem = R"(
[[instrumentation.node]]
type = 1
path = "/system"
properties = { "36" = "Example Maker", "108" = "the system" }
)";

constexpr const char* onlyComputer = R"(
[[instrumentation.node]]
type = 40
path = "/computer"
properties = { "36" = "Computer Maker", "39" = "Model X - Tower", "108" = "testhost" }
)";

/** The parameter is whether the agent has a computer node; otherwise it has a system node. */
class AbsentNodeAsset : public testing::WithParamInterface<bool>, public AssetFile {
protected:
    AbsentNodeAsset() : AssetFile(GetParam() ? onlyComputer : onlySystem) {}

    const bool hasComputer = GetParam();
};

INSTANTIATE_TEST_SUITE_P(Agent, AbsentNodeAsset, testing::Bool(),
                         [](const auto& parameter) { return parameter.param ? "WithoutSystem" : "WithoutComputer"; });

TEST_P(AbsentNodeAsset, DoesNotReadTheFile) {
    write(path(), "USER.Name=Anna\n");
    const AssetIDDetails element;
    expectNothingStored(element);
    EXPECT_THAT(
        logMessagesOf("AssetIDDetails.cpp", "AssetIDDetails"),
        ElementsAre(entering("AssetIDDetails", "AssetIDDetails.cpp"), exiting("AssetIDDetails", "AssetIDDetails.cpp")));
}

TEST_P(AbsentNodeAsset, CreatesTheFile) {
    const AssetIDDetails element;
    EXPECT_TRUE(std::filesystem::is_regular_file(path()));
}

TEST_P(AbsentNodeAsset, StartsAtTheComputerIfThereIsOne) {
    AssetIDDetails element;
    EXPECT_EQ(hasCurrent(element), hasComputer);
    std::string text = "before";
    EXPECT_EQ(element.getName(text), hasComputer);
    EXPECT_EQ(text, hasComputer ? "testhost" : "before");
    ++element;
    EXPECT_FALSE(hasCurrent(element));
}

TEST_P(AbsentNodeAsset, ReturnsVendorAndIdentifyingNumberIfThereIsASystem) {
    const AssetIDDetails element;
    std::string text = "before";
    EXPECT_EQ(element.getVendor(text), !hasComputer);
    EXPECT_EQ(text, hasComputer ? "before" : "Example Maker");
    EXPECT_EQ(element.getIdentifyingNumber(), hasComputer ? "" : "/system");
}

}  // namespace
