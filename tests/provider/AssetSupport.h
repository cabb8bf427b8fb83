#pragma once

#include <string>
#include <utility>
#include <vector>

#include "AssetIDDetails.h"
#include "NodesFixture.h"
#include "Support.h"

/** Helpers for the tests of the asset element. */
namespace providerTest {

using KO::LeaseWarrantyProvider::AssetIDDetails;
using Pairs = std::vector<AssetIDDetails::PersonalizedPair>;

constexpr const char* noDate = "00000000000000.000000-000";
constexpr const char* someDate = "20240229123000.000000+060";
constexpr unsigned long withoutLimit = 0xFFFFFFFF;

struct TextGetter {
    const char* name;
    bool (AssetIDDetails::*get)(std::string&) const;
    const char* key;
};

/** Getters of the stored strings. */
inline const std::vector<TextGetter> stringGetters = {
    {"getAssetNumber", &AssetIDDetails::getAssetNumber, "USER.AssetNumber"},
    {"getAssetIdTag", &AssetIDDetails::getAssetIdTag, "USER.AssetIdTag"},
    {"getPrimaryOwnerName", &AssetIDDetails::getPrimaryOwnerName, "USER.Name"},
    {"getPrimaryOwnerPhone", &AssetIDDetails::getPrimaryOwnerPhone, "USER.Phone"},
    {"getPrimaryOwnerPosition", &AssetIDDetails::getPrimaryOwnerPosition, "USER.Position"},
    {"getPrimaryOwnerDepartment", &AssetIDDetails::getPrimaryOwnerDepartment, "USER.Department"},
    {"getSystemLocation", &AssetIDDetails::getSystemLocation, "USER.Location"},
    {"getZOPMProfile", &AssetIDDetails::getZOPMProfile, "USER.ZOPMProfile"},
    {"getDeploymentProfile", &AssetIDDetails::getDeploymentProfile, "USER.ZOPMProfile"},
};
inline const std::vector<TextGetter> dateGetters = {
    {"getLastInventoried", &AssetIDDetails::getLastInventoried, "USER.LastInventoried"},
    {"getPurchaseDate", &AssetIDDetails::getPurchaseDate, "USER.PurchaseDate"},
    {"getZOPMUpdateTime", &AssetIDDetails::getZOPMUpdateTime, "USER.ZOPMUpdateTime"},
    {"getDeploymentUpdateTime", &AssetIDDetails::getDeploymentUpdateTime, "USER.ZOPMUpdateTime"},
};

/** Returns the value of a getter, or "(none)" if the getter returns false. */
inline std::string valueOf(const AssetIDDetails& element, const TextGetter& getter) {
    std::string value = "(untouched)";
    if ((element.*getter.get)(value)) {
        return value;
    }
    EXPECT_EQ(value, "(untouched)") << getter.name;
    return "(none)";
}

inline Pairs pairsOf(const AssetIDDetails& element) {
    Pairs pairs;
    EXPECT_TRUE(element.getPersonalizedData(pairs));
    return pairs;
}

/** Expects that no getter of a stored value returns true or changes its argument. */
inline void expectNothingStored(const AssetIDDetails& element) {
    for (const auto& getters : {stringGetters, dateGetters}) {
        for (const TextGetter& getter : getters) {
            EXPECT_EQ(valueOf(element, getter), "(none)") << getter.name;
        }
    }
    Pairs pairs = {{"before", "before"}};
    EXPECT_FALSE(element.getPersonalizedData(pairs));
    EXPECT_EQ(pairs, (Pairs{{"before", "before"}}));
}

/** Provides an empty data directory for an agent with these nodes. */
class AssetFile : private ProcessNodes, public CleanAgent {
protected:
    explicit AssetFile(const char* nodes = assetNodes) : ProcessNodes(nodes) {}

    static std::filesystem::path path() { return agentEnvironment::dataDirectory() / "asset.dat"; }
    static std::string file() { return contentOf(path()); }
};

}  // namespace providerTest
