#pragma once

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "ElementKinds.h"
#include "KO/Moniker.h"
#include "LeaseSetting.h"
#include "NodesFixture.h"
#include "WarrantySetting.h"

/** Parameters of typed tests: the two setting elements. */
namespace providerTest {

using KO::FrameworkException;
using KO::Moniker;
using Keys = std::vector<std::pair<std::string, std::string>>;

struct LeaseSettingKind {
    using Setting = KO::LeaseWarrantyProvider::LeaseSetting;
    using Store = LeaseKind;

    static constexpr const char* sourceFile = "LeaseSetting.cpp";
    static constexpr const char* elementFile = "Lease.cpp";
    static constexpr const char* name = "LeaseSetting";
    static constexpr const char* toElement = "getLeaseMoniker";
    static constexpr const char* elementLabel = " monikerLease=";
    static constexpr bool marksExitToElement = false;
    static Moniker elementMoniker(Setting& setting, Moniker& computer) { return setting.getLeaseMoniker(computer); }
};

struct WarrantySettingKind {
    using Setting = KO::LeaseWarrantyProvider::WarrantySetting;
    using Store = WarrantyKind;

    static constexpr const char* sourceFile = "WarrantySetting.cpp";
    static constexpr const char* elementFile = "Warranty.cpp";
    static constexpr const char* name = "WarrantySetting";
    static constexpr const char* toElement = "getWarrantyMoniker";
    static constexpr const char* elementLabel = " monikerWarranty=";
    static constexpr bool marksExitToElement = true;
    static Moniker elementMoniker(Setting& setting, Moniker& computer) { return setting.getWarrantyMoniker(computer); }
};

using SettingKinds = testing::Types<LeaseSettingKind, WarrantySettingKind>;

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

/** A setting element with empty stores. Its translations take and return keys. */
template <class Kind>
class SettingElement : private ProcessNodes, public RecordStore<typename Kind::Store> {
protected:
    explicit SettingElement(const char* nodes = settingNodes) : ProcessNodes(nodes) {}

    Keys toElement(const Keys& computer) {
        Moniker argument = moniker(computer);
        return keysOf(Kind::elementMoniker(setting, argument));
    }

    Keys toComputer(const Keys& element) {
        Moniker argument = moniker(element);
        return keysOf(setting.getComputerMoniker(argument));
    }

    std::unique_ptr<typename Kind::Setting> owner = std::make_unique<typename Kind::Setting>();
    typename Kind::Setting& setting = *owner;
};

}  // namespace providerTest
