#pragma once

#include <array>

#include "AssetIDDetails.h"

/** The asset data file: its name, its lock, and the keys that are read and written. */
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

}  // namespace KO::LeaseWarrantyProvider
