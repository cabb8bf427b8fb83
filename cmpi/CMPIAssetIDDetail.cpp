#include "CMPIAssetIDDetail.h"

#include "LoggerNames.h"
#include "ProductAdapterImpl.h"

#include <vector>

namespace KO::LeaseWarrantyProvider {

std::string loggerCMPIAssetIDDetail = LoggerNames::kept(LoggerNames::provider);

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

/** Replaces the text by the property's value, if the instance has it. */
void takeText(const CMPIInstance* instance, const char* name, std::string& text) {
    std::string value;
    if (ProviderUtilities::getProperty(instance, name, value, false)) {
        text = value;
    }
}

/** Always five pairs: one that the instance does not carry repeats the one before it. */
void modifyPairs(A& details, const CMPIInstance* instance) {
    std::string label;
    std::string data;
    std::vector<A::PersonalizedPair> pairs;
    for (const PairProperties& properties : pairProperties) {
        takeText(instance, properties.label, label);
        takeText(instance, properties.data, data);
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

/** Changes are a table of their own, above: they are taken in another order than an instance is filled. */
const std::array<PropertyRow<A>, 24> AssetClass::properties{{
    filled<A, &A::getIdentifyingNumber>("IdentifyingNumber"),
    filled<A, &A::getName, ValueForm::typed, Presence::always>("Name"),
    filled<A, &A::getVendor, ValueForm::typed, Presence::always>("Vendor"),
    filled<A, &A::getVersion>("Version"),
    filled<A, &A::getCaption>("Caption"),
    filled<A, &A::getDescription>("Description"),
    filled<A, &A::getCSName, ValueForm::typed, Presence::always>("CSName"),
    filled<A, &A::getPrimaryOwnerName>("PrimaryOwnerName"),
    filled<A, &A::getPrimaryOwnerPhone>("PrimaryOwnerPhone"),
    filled<A, &A::getPrimaryOwnerPosition>("PrimaryOwnerPosition"),
    filled<A, &A::getPrimaryOwnerDepartment>("PrimaryOwnerDepartment"),
    filled<A, &A::getAssetIDStringArea>("AssetIDStringArea"),
    filled<A, &A::getAssetNumber>("AssetNumber"),
    filled<A, &A::getAssetIdTag>("AssetIdTag"),
    filled<A, &A::getProductName>("ProductName"),
    {"PersonalizedLabel1", &fillPairs, nullptr},
    filled<A, &A::getLastInventoried, ValueForm::dateTime>("LastInventoried"),
    filled<A, &A::getPurchaseDate, ValueForm::dateTime>("PurchaseDate"),
    filled<A, &A::getSystemLocation, ValueForm::text>("SystemLocation"),
    filled<A, &A::getLocalDateTime, ValueForm::dateTime>("LocalDateTime"),
    filled<A, &A::getZOPMProfile>("ZOPMProfile"),
    filled<A, &A::getZOPMUpdateTime, ValueForm::dateTime>("ZOPMUpdateTime"),
    filled<A, &A::getDeploymentProfile>("DeploymentProfile"),
    filled<A, &A::getDeploymentUpdateTime, ValueForm::dateTime>("DeploymentUpdateTime"),
}};

void AssetClass::modify(AssetIDDetails& details, const CMPIInstance* instance) {
    take(details, instance, assetNumber);
    modifyPairs(details, instance);
    for (const Modification& modification : modifications) {
        take(details, instance, modification);
    }
    details.flushAssetData();
}

template class ElementAdapter<AssetClass>;
template class ProductAdapter<AssetClass>;
template void CMPIAssetIDDetail::modifyCMPIInstance<AssetClass>(const CMPIInstance*, const char**);

}  // namespace KO::LeaseWarrantyProvider
