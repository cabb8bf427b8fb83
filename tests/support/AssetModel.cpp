#include "support/AssetModel.h"

#include "cim/DateTime.h"
#include "schema/MofWriter.h"
#include "support/Values.h"

namespace testsupport {

const std::array<AssetField, 21> assetFields{{
    {"USER.AssetNumber", "AssetNumber", AssetKind::text},
    {"USER.AssetIdTag", "AssetIdTag", AssetKind::readOnly},
    {"USER.Name", "PrimaryOwnerName", AssetKind::text},
    {"USER.Phone", "PrimaryOwnerPhone", AssetKind::text},
    {"USER.Position", "PrimaryOwnerPosition", AssetKind::text},
    {"USER.Department", "PrimaryOwnerDepartment", AssetKind::text},
    {"USER.Location", "SystemLocation", AssetKind::text},
    {"USER.ZOPMProfile", "ZOPMProfile", AssetKind::text},
    {"USER.LastInventoried", "LastInventoried", AssetKind::date},
    {"USER.PurchaseDate", "PurchaseDate", AssetKind::date},
    {"USER.ZOPMUpdateTime", "ZOPMUpdateTime", AssetKind::date},
    {"USER.PersonalizedLabel1", "PersonalizedLabel1", AssetKind::personalized},
    {"USER.PersonalizedLabel2", "PersonalizedLabel2", AssetKind::personalized},
    {"USER.PersonalizedLabel3", "PersonalizedLabel3", AssetKind::personalized},
    {"USER.PersonalizedLabel4", "PersonalizedLabel4", AssetKind::personalized},
    {"USER.PersonalizedLabel5", "PersonalizedLabel5", AssetKind::personalized},
    {"USER.PersonalizedData1", "PersonalizedData1", AssetKind::personalized},
    {"USER.PersonalizedData2", "PersonalizedData2", AssetKind::personalized},
    {"USER.PersonalizedData3", "PersonalizedData3", AssetKind::personalized},
    {"USER.PersonalizedData4", "PersonalizedData4", AssetKind::personalized},
    {"USER.PersonalizedData5", "PersonalizedData5", AssetKind::personalized},
}};

std::string AssetField::kept(const std::string& given) const {
    const bool isPointInTime = cim::isPointInTime(given);
    return kind != AssetKind::date || isPointInTime ? given : std::string();
}

std::string shownValue(const AssetField& field, const std::string& kept) {
    const std::string name = std::string(field.property) + "=";
    if (field.kind == AssetKind::date) {
        return name + (kept.empty() ? "NULL" : cimhost::formatMof(dateTime(kept)));
    }
    const bool isAbsent = field.kind == AssetKind::personalized && kept.empty();
    return name + cimhost::formatMof(text(isAbsent ? "Null" : kept));
}

std::vector<std::string> shownAsset(const cimhost::Instance& instance) {
    std::vector<std::string> values;
    for (const AssetField& field : assetFields) {
        const cimhost::Value* value = find(instance.properties, field.property);
        values.push_back(std::string(field.property) + "=" + (value == nullptr ? "" : cimhost::formatMof(*value)));
    }
    return values;
}

}  // namespace testsupport
