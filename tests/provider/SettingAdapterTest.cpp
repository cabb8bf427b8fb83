// Translation between the paths of both ends in the setting adapters.

#include <cmpimacs.h>
#include <gmock/gmock.h>

#include <sstream>

#include "CMPILeaseSetting.h"
#include "CMPIWarrantySetting.h"
#include "KO/ProviderUtilities.h"
#include "NodesFixture.h"
#include "Support.h"
#include "broker/Broker.h"
#include "broker/RequestScope.h"

namespace {

using namespace providerTest;
using testing::ElementsAre;

using KO::ProviderUtilities;

struct LeaseSettingAdapter {
    using Adapter = KO::LeaseWarrantyProvider::CMPILeaseSetting;
    static constexpr const char* elementClass = "VELKO_Lease";
    static constexpr const char* sourceFile = "CMPILeaseSetting.cpp";
    static constexpr const char* locateName = "locateLease";
    static constexpr CMPIObjectPath* (Adapter::*locate)(const CMPIObjectPath*) = &Adapter::locateLease;
};

struct WarrantySettingAdapter {
    using Adapter = KO::LeaseWarrantyProvider::CMPIWarrantySetting;
    static constexpr const char* elementClass = "VELKO_Warranty";
    static constexpr const char* sourceFile = "CMPIWarrantySetting.cpp";
    static constexpr const char* locateName = "locateWarranty";
    static constexpr CMPIObjectPath* (Adapter::*locate)(const CMPIObjectPath*) = &Adapter::locateWarranty;
};

template <class Kind>
class SettingAdapter : private ProcessNodes, public CleanAgent {
protected:
    SettingAdapter() : ProcessNodes(settingNodes) {}

    using Adapter = typename Kind::Adapter;
    static constexpr CMPIObjectPath* (Adapter::*locateComputer)(const CMPIObjectPath*) = &Adapter::locateComputer;
    static constexpr const char* computerClass = "VELKO_ComputerSystem";

    CMPIObjectPath* path(const char* className) {
        return ProviderUtilities::createObjectPath(broker.handle(), className, "root/elsewhere");
    }

    CMPIObjectPath* path(const char* className, const char* key, const std::string& value) {
        CMPIObjectPath* made = path(className);
        ProviderUtilities::setKeyProperty(made, key, value);
        return made;
    }

    /** Returns an adapter's translation of a path. */
    const CMPIObjectPath* located(CMPIObjectPath* (Adapter::*operation)(const CMPIObjectPath*),
                                  const CMPIObjectPath* source) {
        Adapter adapter(broker.handle(), nullptr, path(computerClass));
        agentEnvironment::forgetLog();
        return (adapter.*operation)(source);
    }

    static void expectPath(const CMPIObjectPath* found, const char* className, const char* key, const char* value) {
        EXPECT_EQ(ProviderUtilities::getNamespace(found), "root/elsewhere");
        EXPECT_STREQ(CMGetCharPtr(CMGetClassName(found, nullptr)), className);
        EXPECT_EQ(ProviderUtilities::getKeyCount(found), 1U);
        std::string foundValue;
        EXPECT_TRUE(ProviderUtilities::getKeyProperty(found, key, foundValue));
        EXPECT_EQ(foundValue, value);
    }

    /** Expects that the operation is traced at error level under its name, with the path as its argument. */
    static void expectTraced(const char* function, const CMPIObjectPath* source) {
        std::ostringstream list;
        list << " objectPath=" << source;
        EXPECT_THAT(logMessagesOf(Kind::sourceFile, function),
                    ElementsAre(entering(function, Kind::sourceFile, list.str()),
                                exiting(function, Kind::sourceFile, list.str())));
        for (const LogRecord& record : recordsOf(Kind::sourceFile, function)) {
            EXPECT_EQ(record.level, 3000);
        }
    }

    cimhost::Broker broker{};
    cimhost::RequestScope scope{broker};
};

using SettingAdapters = testing::Types<LeaseSettingAdapter, WarrantySettingAdapter>;

struct AdapterNames {
    template <class Kind>
    static std::string GetName(int) {
        return Kind::elementClass;
    }
};

TYPED_TEST_SUITE(SettingAdapter, SettingAdapters, AdapterNames);

TYPED_TEST(SettingAdapter, LocatesTheElementOfAComputer) {
    const CMPIObjectPath* source = this->path(this->computerClass, "Name", "alpha");
    this->expectPath(this->located(TypeParam::locate, source), TypeParam::elementClass, "InstanceID",
                     "/system/first%20box");
    this->expectTraced(TypeParam::locateName, source);
}

TYPED_TEST(SettingAdapter, LocatesTheComputerOfAnElement) {
    const CMPIObjectPath* source = this->path(TypeParam::elementClass, "InstanceID", "/system/first%20box");
    this->expectPath(this->located(this->locateComputer, source), this->computerClass, "Name", "alpha");
    this->expectTraced("locateComputer", source);
}

TYPED_TEST(SettingAdapter, ReturnsAPathWithoutKeysForASourceWithoutKeys) {
    EXPECT_EQ(ProviderUtilities::getKeyCount(this->located(TypeParam::locate, this->path(this->computerClass))), 0U);
    EXPECT_EQ(ProviderUtilities::getKeyCount(this->located(this->locateComputer, this->path(TypeParam::elementClass))),
              0U);
}

}  // namespace
