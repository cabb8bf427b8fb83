// Agents without a computer node or without a system node: the asset data are not read.

#include "AssetSupport.h"

#include <gmock/gmock.h>

#if defined(AGENT_WITHOUT_COMPUTER)
constexpr bool hasComputer = false;
const char* const agentNodes = R"(
[[instrumentation.node]]
type = 1
path = "/system"
properties = { "36" = "Example Maker", "108" = "the system" }
)";
#elif defined(AGENT_WITHOUT_SYSTEM)
constexpr bool hasComputer = true;
const char* const agentNodes = R"(
[[instrumentation.node]]
type = 40
path = "/computer"
properties = { "36" = "Computer Maker", "39" = "Model X - Tower", "108" = "testhost" }
)";
#endif

namespace {

using namespace providerTest;
using testing::ElementsAre;

using AbsentNodeAsset = AssetFile;

TEST_F(AbsentNodeAsset, DoesNotReadTheFile) {
    write(path(), "USER.Name=Anna\n");
    const AssetIDDetails element;
    expectNothingStored(element);
    EXPECT_THAT(
        logMessagesOf("AssetIDDetails.cpp", "AssetIDDetails"),
        ElementsAre(entering("AssetIDDetails", "AssetIDDetails.cpp"), exiting("AssetIDDetails", "AssetIDDetails.cpp")));
}

TEST_F(AbsentNodeAsset, CreatesTheFile) {
    const AssetIDDetails element;
    EXPECT_TRUE(std::filesystem::is_regular_file(path()));
}

TEST_F(AbsentNodeAsset, StartsAtTheComputerIfThereIsOne) {
    AssetIDDetails element;
    EXPECT_EQ(hasCurrent(element), hasComputer);
    std::string text = "before";
    EXPECT_EQ(element.getName(text), hasComputer);
    EXPECT_EQ(text, hasComputer ? "testhost" : "before");
    ++element;
    EXPECT_FALSE(hasCurrent(element));
}

TEST_F(AbsentNodeAsset, ReturnsVendorAndIdentifyingNumberIfThereIsASystem) {
    const AssetIDDetails element;
    std::string text = "before";
    EXPECT_EQ(element.getVendor(text), !hasComputer);
    EXPECT_EQ(text, hasComputer ? "before" : "Example Maker");
    EXPECT_EQ(element.getIdentifyingNumber(), hasComputer ? "" : "/system");
}

}  // namespace
