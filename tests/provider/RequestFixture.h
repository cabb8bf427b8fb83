#pragma once

#include <string>
#include <utility>
#include <vector>

#include "LeaseAndWarrantyProvider.h"
#include "LeaseBase.h"
#include "Support.h"
#include "WarrantyBase.h"
#include "broker/Broker.h"
#include "broker/RequestScope.h"
#include "model/ResultEvent.h"

namespace providerTest {

using KO::LeaseWarrantyProvider::LeaseBase;
using KO::LeaseWarrantyProvider::LeaseUnit;
using KO::LeaseWarrantyProvider::WarrantyBase;
using KO::LeaseWarrantyProvider::WarrantyUnit;

inline cimhost::NamedValue textKey(const std::string& name, const std::string& text) {
    return {name, cimhost::Value::of(text)};
}

/** Makes requests like an object manager. Tests can access the provider's tables, which are empty at first. */
class RequestTest : public CleanAgent {
protected:
    void SetUp() override {
        CleanAgent::SetUp();
        emptyTables();
        instances = LeaseAndWarrantyProvider_Create_InstanceMI(broker.handle(), nullptr, nullptr);
        associations = LeaseAndWarrantyProvider_Create_AssociationMI(broker.handle(), nullptr, nullptr);
        agentEnvironment::forgetLog();
    }

    void TearDown() override {
        emptyTables();
        CleanAgent::TearDown();
    }

    static void emptyTables() {
        LeaseBase::cache.table.clear();
        LeaseBase::cache.index = {};
        LeaseBase::cache.recordCountLease = 0;
        WarrantyBase::cache.table.clear();
        WarrantyBase::cache.index = {};
        WarrantyBase::cache.recordCountWarranty = 0;
    }

    /** @name Requests
     * Each returns the status code and appends the results to the events.
     */
    ///@{
    CMPIrc enumerate(const std::string& className) {
        cimhost::RequestScope scope(broker);
        return instances->ft
            ->enumerateInstances(instances, nullptr, scope.result(events), pathOf(scope, className, {}), nullptr)
            .rc;
    }

    CMPIrc enumerateNames(const std::string& className) {
        cimhost::RequestScope scope(broker);
        return instances->ft
            ->enumerateInstanceNames(instances, nullptr, scope.result(events), pathOf(scope, className, {}))
            .rc;
    }

    CMPIrc get(const std::string& className, std::vector<cimhost::NamedValue> keys) {
        cimhost::RequestScope scope(broker);
        return instances->ft
            ->getInstance(instances, nullptr, scope.result(events), pathOf(scope, className, std::move(keys)), nullptr)
            .rc;
    }

    CMPIrc create(const std::string& className, std::vector<cimhost::NamedValue> keys) {
        cimhost::RequestScope scope(broker);
        return instances->ft
            ->createInstance(instances, nullptr, scope.result(events), pathOf(scope, className, std::move(keys)),
                             nullptr)
            .rc;
    }

    CMPIrc associate(const char* associationClass) {
        cimhost::RequestScope scope(broker);
        return associations->ft
            ->associatorNames(associations, nullptr, scope.result(events),
                              pathOf(scope, "VELKO_ComputerSystem", {textKey("Name", "testhost")}), associationClass,
                              nullptr, nullptr, nullptr)
            .rc;
    }
    ///@}

    cimhost::Broker broker{};
    cimhost::ResultEvents events{};
    CMPIInstanceMI* instances = nullptr;
    CMPIAssociationMI* associations = nullptr;

private:
    static const CMPIObjectPath* pathOf(cimhost::RequestScope& scope, const std::string& className,
                                        std::vector<cimhost::NamedValue> keys) {
        return scope.objectPath({"", "root/cimv2", className, std::move(keys)});
    }
};

}  // namespace providerTest
