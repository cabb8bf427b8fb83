#pragma once

#include "ElementSides.h"
#include "KO/Moniker.h"
#include "LeaseSetting.h"
#include "WarrantySetting.h"

#include <memory>
#include <string>
#include <utility>
#include <vector>

/** The two setting elements as the typed tests see them. */
namespace providerTest {

using KO::FrameworkException;
using KO::Moniker;
using Keys = std::vector<std::pair<std::string, std::string>>;

struct LeaseSettingSide {
    using Setting = KO::LeaseWarrantyProvider::LeaseSetting;
    using Store = LeaseSide;

    static constexpr const char* sourceFile = "LeaseSetting.cpp";
    static constexpr const char* elementFile = "Lease.cpp";
    static constexpr const char* name = "LeaseSetting";
    static constexpr const char* toElement = "getLeaseMoniker";
    static constexpr const char* elementLabel = " monikerLease=";
    static constexpr bool marksExitToElement = false;
    static Moniker elementMoniker(Setting& setting, Moniker& computer) { return setting.getLeaseMoniker(computer); }
};

struct WarrantySettingSide {
    using Setting = KO::LeaseWarrantyProvider::WarrantySetting;
    using Store = WarrantySide;

    static constexpr const char* sourceFile = "WarrantySetting.cpp";
    static constexpr const char* elementFile = "Warranty.cpp";
    static constexpr const char* name = "WarrantySetting";
    static constexpr const char* toElement = "getWarrantyMoniker";
    static constexpr const char* elementLabel = " monikerWarranty=";
    static constexpr bool marksExitToElement = true;
    static Moniker elementMoniker(Setting& setting, Moniker& computer) { return setting.getWarrantyMoniker(computer); }
};

using SettingSides = testing::Types<LeaseSettingSide, WarrantySettingSide>;

inline Moniker moniker(const Keys& keys) {
    Moniker made;
    for (const auto& [name, value] : keys) {
        made.addKey(name, value);
    }
    return made;
}

inline Keys keysOf(Moniker moniker) {
    Keys keys(moniker.getKeyCount());
    for (unsigned int index = 0; index < keys.size(); ++index) {
        EXPECT_TRUE(moniker.selectKey(index));
        EXPECT_TRUE(moniker.getName(keys[index].first));
        EXPECT_TRUE(moniker.getValue(keys[index].second));
    }
    return keys;
}

/** A setting element over empty stores, and its operations on keys. */
template <class Side>
class SettingElement : public RecordStore<typename Side::Store> {
protected:
    Keys toElement(const Keys& computer) {
        Moniker argument = moniker(computer);
        return keysOf(Side::elementMoniker(setting, argument));
    }

    Keys toComputer(const Keys& element) {
        Moniker argument = moniker(element);
        return keysOf(setting.getComputerMoniker(argument));
    }

    std::unique_ptr<typename Side::Setting> owner = std::make_unique<typename Side::Setting>();
    typename Side::Setting& setting = *owner;
};

}  // namespace providerTest
