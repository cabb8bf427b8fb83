// A system without a vendor. A filter matches if its property cannot be read.

#include "AssetSupport.h"

namespace {

using namespace providerTest;

constexpr const char* vendorlessNodes = R"(
[[instrumentation.node]]
type = 1
path = "/system"
properties = { "108" = "the system" }

[[instrumentation.node]]
type = 40
path = "/system/computer"
properties = { "36" = "Computer Maker", "39" = "Model X - Tower", "108" = "testhost" }
)";

class VendorlessAsset : public AssetFile {
protected:
    VendorlessAsset() : AssetFile(vendorlessNodes) {}
};

TEST_F(VendorlessAsset, MatchesEveryVendorFilter) {
    for (const char* vendor : {"Computer Maker", "another maker", ""}) {
        AssetIDDetails element;
        element.setFilter(AssetIDDetails::FILTER_VENDOR, vendor);
        EXPECT_TRUE(hasCurrent(element)) << vendor;
        EXPECT_TRUE(element.evaluate());
    }
}

TEST_F(VendorlessAsset, DoesNotMatchAFilterForAnotherName) {
    AssetIDDetails element;
    element.setFilter(AssetIDDetails::FILTER_VENDOR, "another maker");
    element.setFilter(AssetIDDetails::FILTER_NAME, "otherhost");
    EXPECT_FALSE(hasCurrent(element));
}

TEST_F(VendorlessAsset, HasNoVendorAndKeepsTheArgument) {
    const AssetIDDetails element;
    std::string text = "before";
    EXPECT_FALSE(element.getVendor(text));
    EXPECT_EQ(text, "before");
}

}  // namespace
