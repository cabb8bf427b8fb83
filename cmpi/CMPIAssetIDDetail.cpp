#include "CMPIAssetIDDetail.h"

#include <vector>

#include "ProductAdapterImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerCMPIAssetIDDetail = LoggerNames::loggerName(LoggerNames::provider);

const TraceSource AssetAdapterTraits::traceSource{loggerCMPIAssetIDDetail, "CMPIAssetIDDetail.cpp"};

namespace {

using A = AssetIDDetails;

/** Property names of a personalized pair. */
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

/** Sets all ten properties of the pairs. Sets none if there are not exactly five pairs. */
void fillPairs(const A& details, InstanceBuilder& builder, const char*) {
    std::vector<A::PersonalizedPair> pairs;
    if (!details.getPersonalizedData(pairs) || pairs.size() != pairProperties.size()) {
        return;
    }
    for (std::size_t pair = 0; pair < pairs.size(); ++pair) {
        builder.text = pairs[pair].first;
        ProviderUtilities::setProperty(builder.instance, pairProperties[pair].label, builder.text);
        builder.text = pairs[pair].second;
        ProviderUtilities::setProperty(builder.instance, pairProperties[pair].data, builder.text);
    }
}

/** Replaces the string with the property's value if the instance has the property. */
void takeText(const CMPIInstance* instance, const char* name, std::string& text) {
    std::string value;
    if (ProviderUtilities::getProperty(instance, name, value, false)) {
        text = value;
    }
}

/** Sets all five pairs. For a label or data property that the instance lacks, repeats that of the preceding pair. */
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

/** A property that clients can modify. */
struct Modification {
    const char* name;
    bool isDateTime;
    void (A::*set)(const std::string& value);
};

/** Properties that are set after the asset number and the pairs, in this order. */
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

const std::array<KeyRow<A>, 4> AssetAdapterTraits::keys{{
    key<A, &A::getIdentifyingNumber>("IdentifyingNumber"),
    key<A, &A::getName>("Name"),
    key<A, &A::getVendor>("Vendor"),
    key<A, &A::getVersion>("Version"),
}};

/** The order is neither that of the keys nor that of the filter types. */
const std::array<KeyFilter<A>, 4> AssetAdapterTraits::filters{{
    {"Name", A::FILTER_NAME},
    {"IdentifyingNumber", A::FILTER_IDENTIFYING_NUMBER},
    {"Vendor", A::FILTER_VENDOR},
    {"Version", A::FILTER_VERSION},
}};

/** Modifications use a separate table, since they are applied in a different order. */
const std::array<PropertyRow<A>, 24> AssetAdapterTraits::properties{{
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

void AssetAdapterTraits::modify(AssetIDDetails& details, const CMPIInstance* instance) {
    take(details, instance, assetNumber);
    modifyPairs(details, instance);
    for (const Modification& modification : modifications) {
        take(details, instance, modification);
    }
    details.flushAssetData();
}

template class ElementAdapter<CMPIAssetIDDetail, AssetAdapterTraits>;
template class ProductAdapter<AssetAdapterTraits>;
template void CMPIAssetIDDetail::modifyCMPIInstance<AssetAdapterTraits>(const CMPIInstance*, const char**);

}  // namespace KO::LeaseWarrantyProvider
