#include "CMPIAssetIDDetail.h"

#include "LoggerNames.h"
#include "ProductAdapterImpl.h"

#include <vector>

namespace KO::LeaseWarrantyProvider {

std::string loggerCMPIAssetIDDetail(LoggerNames::provider);

const TraceUnit AssetClass::unit{loggerCMPIAssetIDDetail, "CMPIAssetIDDetail.cpp"};

namespace {

using A = AssetIDDetails;

/** The properties of one personalized pair. */
struct PairProperties {
    const char* label;
    const char* data;
};

constexpr std::array<PairProperties, A::pairCount> pairProperties{{
    {"PersonalizedLabel1", "PersonalizedData1"},
    {"PersonalizedLabel2", "PersonalizedData2"},
    {"PersonalizedLabel3", "PersonalizedData3"},
    {"PersonalizedLabel4", "PersonalizedData4"},
    {"PersonalizedLabel5", "PersonalizedData5"},
}};

/** All ten properties of the pairs, or none unless there are exactly five. */
void fillPairs(const A& details, Filling& filling, const char*) {
    std::vector<A::PersonalizedPair> pairs;
    if (!details.getPersonalizedData(pairs) || pairs.size() != pairProperties.size()) {
        return;
    }
    for (std::size_t pair = 0; pair < pairs.size(); ++pair) {
        filling.text = pairs[pair].first;
        ProviderUtilities::setProperty(filling.instance, pairProperties[pair].label, filling.text);
        filling.text = pairs[pair].second;
        ProviderUtilities::setProperty(filling.instance, pairProperties[pair].data, filling.text);
    }
}

/** Always five pairs: one that the instance does not carry repeats the one before it. */
void modifyPairs(A& details, const CMPIInstance* instance) {
    std::string label;
    std::string data;
    std::vector<A::PersonalizedPair> pairs;
    for (const PairProperties& properties : pairProperties) {
        ProviderUtilities::getProperty(instance, properties.label, label, false);
        ProviderUtilities::getProperty(instance, properties.data, data, false);
        pairs.emplace_back(label, data);
    }
    details.setPersonalizedData(pairs);
}

/** A property that a client may change. */
struct Modification {
    const char* name;
    bool isDateTime;
    void (A::*set)(const std::string& value);
};

/** What follows the asset number and the pairs, in the order in which it is taken. */
constexpr std::array<Modification, 9> modifications{{
    {"PrimaryOwnerName", false, &A::setOwnerName},
    {"PrimaryOwnerPhone", false, &A::setOwnerPhone},
    {"PrimaryOwnerPosition", false, &A::setOwnerPosition},
    {"PrimaryOwnerDepartment", false, &A::setOwnerDepartment},
    {"LastInventoried", true, &A::setLastInventoried},
    {"PurchaseDate", true, &A::setSystemPurchaseDate},
    {"SystemLocation", false, &A::setSystemLocation},
    {"ZOPMProfile", false, &A::setZOPMProfile},
    {"ZOPMUpdateTime", true, &A::setZOPMUpdateTime},
}};

constexpr Modification assetNumber{"AssetNumber", false, &A::setAssetNumber};

void take(A& details, const CMPIInstance* instance, const Modification& modification) {
    std::string value;
    if (ProviderUtilities::getProperty(instance, modification.name, value, modification.isDateTime)) {
        (details.*modification.set)(value);
    }
}

}  // namespace

const std::array<KeyRow<A>, 4> AssetClass::keys{{
    key<A, &A::getIdentifyingNumber>("IdentifyingNumber"),
    key<A, &A::getName>("Name"),
    key<A, &A::getVendor>("Vendor"),
    key<A, &A::getVersion>("Version"),
}};

/** Neither in the order of the keys nor in that of the types. */
const std::array<KeyFilter<A>, 4> AssetClass::filters{{
    {"Name", A::FILTER_NAME},
    {"IdentifyingNumber", A::FILTER_IDENTIFYING_NUMBER},
    {"Vendor", A::FILTER_VENDOR},
    {"Version", A::FILTER_VERSION},
}};

const std::array<PropertyRow<A>, 24> AssetClass::properties{{
    readOnly<A, &A::getIdentifyingNumber>("IdentifyingNumber"),
    readOnly<A, &A::getName, ValueForm::typed, Presence::always>("Name"),
    readOnly<A, &A::getVendor, ValueForm::typed, Presence::always>("Vendor"),
    readOnly<A, &A::getVersion>("Version"),
    readOnly<A, &A::getCaption>("Caption"),
    readOnly<A, &A::getDescription>("Description"),
    readOnly<A, &A::getCSName, ValueForm::typed, Presence::always>("CSName"),
    readOnly<A, &A::getPrimaryOwnerName>("PrimaryOwnerName"),
    readOnly<A, &A::getPrimaryOwnerPhone>("PrimaryOwnerPhone"),
    readOnly<A, &A::getPrimaryOwnerPosition>("PrimaryOwnerPosition"),
    readOnly<A, &A::getPrimaryOwnerDepartment>("PrimaryOwnerDepartment"),
    readOnly<A, &A::getAssetIDStringArea>("AssetIDStringArea"),
    readOnly<A, &A::getAssetNumber>("AssetNumber"),
    readOnly<A, &A::getAssetIdTag>("AssetIdTag"),
    readOnly<A, &A::getProductName>("ProductName"),
    {"PersonalizedLabel1", &fillPairs, nullptr},
    readOnly<A, &A::getLastInventoried, ValueForm::dateTime>("LastInventoried"),
    readOnly<A, &A::getPurchaseDate, ValueForm::dateTime>("PurchaseDate"),
    readOnly<A, &A::getSystemLocation, ValueForm::text>("SystemLocation"),
    readOnly<A, &A::getLocalDateTime, ValueForm::dateTime>("LocalDateTime"),
    readOnly<A, &A::getZOPMProfile>("ZOPMProfile"),
    readOnly<A, &A::getZOPMUpdateTime, ValueForm::dateTime>("ZOPMUpdateTime"),
    readOnly<A, &A::getDeploymentProfile>("DeploymentProfile"),
    readOnly<A, &A::getDeploymentUpdateTime, ValueForm::dateTime>("DeploymentUpdateTime"),
}};

void AssetClass::modify(AssetIDDetails& details, const CMPIInstance* instance) {
    take(details, instance, assetNumber);
    modifyPairs(details, instance);
    for (const Modification& modification : modifications) {
        take(details, instance, modification);
    }
    details.flushAssetData();
}

template class ProductAdapter<AssetClass>;
template void CMPIAssetIDDetail::modifyCMPIInstance<AssetClass>(const CMPIInstance*, const char**);

}  // namespace KO::LeaseWarrantyProvider
