#include <gtest/gtest.h>

#include "KO/PlatformUtilities.h"
#include "KO/Product.h"
#include "agent/TestConfiguration.h"

using KO::PlatformUtilities;
using KO::Product;

TEST(Product, IsAsConfigured) {
    EXPECT_EQ(Product::getName(), L"Test Agent");
    EXPECT_EQ(Product::getVersion(), L"2.3.4");
    EXPECT_EQ(Product::getBuildNumber(), L"77");
    EXPECT_EQ(Product::getIdentifyingNumber(), L"N-1");
    EXPECT_EQ(Product::getVendor(), L"Gr\u00fcn");
}

TEST(PlatformUtilities, ReturnDirectoriesThatEndWithASeparator) {
    EXPECT_EQ(PlatformUtilities::getKelsaDirectory(), agent_test::configuredDirectory() + "install/");
    EXPECT_EQ(PlatformUtilities::getKelsaDataDir(), agent_test::configuredDirectory() + "data/");
}

TEST(PlatformUtilities, ReturnTheSameStringEachTime) {
    EXPECT_EQ(static_cast<const void*>(PlatformUtilities::getKelsaDataDir()), PlatformUtilities::getKelsaDataDir());
}
