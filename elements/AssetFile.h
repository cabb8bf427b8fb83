#pragma once

#include <array>
#include <string>
#include <variant>

#include "AssetIDDetails.h"

/** The asset data file: its name, its lock, and the fields that are read and written. */
namespace KO::LeaseWarrantyProvider {

constexpr const wchar_t* assetFileName = L"asset.dat";

/** Scoped lock of the asset data file. */
class FileLock {
public:
    FileLock() { _fileMutex.lock(withoutLimit); }
    ~FileLock() { _fileMutex.unlock(); }
    FileLock(const FileLock&) = delete;
    FileLock& operator=(const FileLock&) = delete;

private:
    static constexpr unsigned long withoutLimit = 0xFFFFFFFF;
};

constexpr const char* USER_ASSET_NUMBER_KEY = "USER.AssetNumber";
constexpr const char* USER_ASSET_ID_TAG_KEY = "USER.AssetIdTag";
constexpr const char* USER_OWNER_NAME_KEY = "USER.Name";
constexpr const char* USER_OWNER_PHONE_KEY = "USER.Phone";
constexpr const char* USER_OWNER_POSITION_KEY = "USER.Position";
constexpr const char* USER_OWNER_DEPARTMENT_KEY = "USER.Department";
constexpr const char* USER_LAST_INVENTORIED_KEY = "USER.LastInventoried";
constexpr const char* USER_SYSTEM_PURCHASE_DATE_KEY = "USER.PurchaseDate";
constexpr const char* USER_SYSTEM_LOCATION_KEY = "USER.Location";
constexpr const char* USER_ZOPM_PROFILE_KEY = "USER.ZOPMProfile";
constexpr const char* USER_ZOPM_UPDATE_TIME_KEY = "USER.ZOPMUpdateTime";
constexpr const char* USER_PERSONALIZED_LABEL1_KEY = "USER.PersonalizedLabel1";
constexpr const char* USER_PERSONALIZED_LABEL2_KEY = "USER.PersonalizedLabel2";
constexpr const char* USER_PERSONALIZED_LABEL3_KEY = "USER.PersonalizedLabel3";
constexpr const char* USER_PERSONALIZED_LABEL4_KEY = "USER.PersonalizedLabel4";
constexpr const char* USER_PERSONALIZED_LABEL5_KEY = "USER.PersonalizedLabel5";
constexpr const char* USER_PERSONALIZED_DATA1_KEY = "USER.PersonalizedData1";
constexpr const char* USER_PERSONALIZED_DATA2_KEY = "USER.PersonalizedData2";
constexpr const char* USER_PERSONALIZED_DATA3_KEY = "USER.PersonalizedData3";
constexpr const char* USER_PERSONALIZED_DATA4_KEY = "USER.PersonalizedData4";
constexpr const char* USER_PERSONALIZED_DATA5_KEY = "USER.PersonalizedData5";

/** The keys of a personalized pair. */
struct PairKeys {
    const char* label;
    const char* data;
};

constexpr std::array<PairKeys, 5> pairKeys{{
    {USER_PERSONALIZED_LABEL1_KEY, USER_PERSONALIZED_DATA1_KEY},
    {USER_PERSONALIZED_LABEL2_KEY, USER_PERSONALIZED_DATA2_KEY},
    {USER_PERSONALIZED_LABEL3_KEY, USER_PERSONALIZED_DATA3_KEY},
    {USER_PERSONALIZED_LABEL4_KEY, USER_PERSONALIZED_DATA4_KEY},
    {USER_PERSONALIZED_LABEL5_KEY, USER_PERSONALIZED_DATA5_KEY},
}};

/** Replaces an empty label or data string, so that all five pairs have values. */
constexpr const char* emptyPersonalized = "Null";

/** The fields before the pairs, in the order in which they are read and written. */
struct AssetIDDetails::StoredFields {
    struct Field {
        const char* key;
        std::variant<std::string AssetIDDetails::*, DateTime AssetIDDetails::*> member;
        const char* name;  ///< name of a string field in the trace
    };

    static constexpr std::array<Field, 11> all{{
        {USER_ASSET_NUMBER_KEY, &AssetIDDetails::_AssetNumber, "_AssetNumber"},
        {USER_ASSET_ID_TAG_KEY, &AssetIDDetails::_AssetIdTag, "_AssetIdTag"},
        {USER_OWNER_NAME_KEY, &AssetIDDetails::_OwnerName, "_OwnerName"},
        {USER_OWNER_PHONE_KEY, &AssetIDDetails::_OwnerPhone, "_OwnerPhone"},
        {USER_OWNER_POSITION_KEY, &AssetIDDetails::_OwnerPosition, "_OwnerPosition"},
        {USER_OWNER_DEPARTMENT_KEY, &AssetIDDetails::_OwnerDepartment, "_OwnerDepartment"},
        {USER_LAST_INVENTORIED_KEY, &AssetIDDetails::_LastInventoried, nullptr},
        {USER_SYSTEM_PURCHASE_DATE_KEY, &AssetIDDetails::_PurchaseDate, nullptr},
        {USER_SYSTEM_LOCATION_KEY, &AssetIDDetails::_SystemLocation, "_SystemLocation"},
        {USER_ZOPM_PROFILE_KEY, &AssetIDDetails::_ZOPMProfile, "_ZOPMProfile"},
        {USER_ZOPM_UPDATE_TIME_KEY, &AssetIDDetails::_ZOPMUpdateTime, nullptr},
    }};
};

/** Calls onText for each string field and onDate for each date field, in order. */
template <class OnText, class OnDate>
void AssetIDDetails::forEachField(OnText onText, OnDate onDate) {
    for (const auto& field : StoredFields::all) {
        if (const auto* text = std::get_if<std::string AssetIDDetails::*>(&field.member)) {
            onText(field, this->**text);
        } else {
            onDate(field, this->*std::get<DateTime AssetIDDetails::*>(field.member));
        }
    }
}

}  // namespace KO::LeaseWarrantyProvider
