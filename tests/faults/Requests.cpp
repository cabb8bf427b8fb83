#include <ostream>
#include <stdexcept>

#include "TestEnvironment.h"
#include "support/Values.h"

namespace faults {

namespace {

using cimhost::NamedValue;
using cimhost::ObjectPath;
using testsupport::boolean;
using testsupport::dateTime;
using testsupport::named;
using testsupport::text;
using testsupport::uint32;

constexpr const char* nameSpace = "root/cimv2";

ObjectPath pathOf(const std::string& className, std::vector<NamedValue> keys = {}) {
    return testsupport::objectPath(nameSpace, className, std::move(keys));
}

ObjectPath identified(const std::string& className, const std::string& identifier) {
    return pathOf(className, {named("InstanceID", text(identifier))});
}

ObjectPath computer() {
    return pathOf("VELKO_ComputerSystem", {named("Name", text("testhost"))});
}

std::vector<NamedValue> productKeys(const std::string& number, const std::string& name, const std::string& vendor) {
    return {named("IdentifyingNumber", text(number)), named("Name", text(name)), named("Vendor", text(vendor)),
            named("Version", text("4.2.0"))};
}

ObjectPath assetPath() {
    return pathOf("VELKO_AssetIDDetails", productKeys("/system", "testhost", "Example Maker"));
}

std::vector<NamedValue> leaseValues() {
    return {named("Lessor", text("Another lessor with a long name")),
            named("BaseTermCommencementDate", dateTime("20270101000000.000000+000")),
            named("LeaseTerm", uint32(48)),
            named("EarlyTerminationOption", boolean(true)),
            named("FixedPricePurchaseOption", boolean(true)),
            named("RenewalOption", boolean(true)),
            named("BargainRenewalOption", boolean(true)),
            named("BaseRent", text("4000.00 EUR every month")),
            named("FairMarketRental", text("4001.00 EUR every month")),
            named("FairMarketValue", text("4002.00 EUR at the end")),
            named("TerminationValue", text("4003.00 EUR at the end")),
            named("NetMonthlyLeaseRateFactor", uint32(49))};
}

std::vector<NamedValue> warrantyValues() {
    return {named("WarrantyStartDate", dateTime("20270202000000.000000+000")), named("WarrantyDuration", uint32(60)),
            named("Warrantor", text("Another warrantor with a long name"))};
}

std::vector<NamedValue> assetValues() {
    std::vector<NamedValue> values{named("AssetNumber", text("A-4711, another number")),
                                   named("PrimaryOwnerName", text("Jo Example the Second")),
                                   named("PrimaryOwnerPhone", text("+49 89 1234567890")),
                                   named("PrimaryOwnerPosition", text("head of everything else")),
                                   named("PrimaryOwnerDepartment", text("another department")),
                                   named("SystemLocation", text("somewhere else entirely")),
                                   named("LastInventoried", dateTime("20270303000000.000000+000")),
                                   named("PurchaseDate", dateTime("20270404000000.000000+000")),
                                   named("ZOPMProfile", text("another profile than before")),
                                   named("ZOPMUpdateTime", dateTime("20270505000000.000000+000"))};
    for (const char* pair : {"1", "2", "3", "4", "5"}) {
        values.push_back(named(std::string("PersonalizedLabel") + pair, text(std::string("another label ") + pair)));
        values.push_back(named(std::string("PersonalizedData") + pair, text(std::string("other data ") + pair)));
    }
    return values;
}

CMPIStatus names(const Arguments& with) {
    return with.instances->ft->enumerateInstanceNames(with.instances, with.context, with.result, with.path);
}

CMPIStatus instances(const Arguments& with) {
    return with.instances->ft->enumerateInstances(with.instances, with.context, with.result, with.path, nullptr);
}

CMPIStatus get(const Arguments& with) {
    return with.instances->ft->getInstance(with.instances, with.context, with.result, with.path, nullptr);
}

CMPIStatus create(const Arguments& with) {
    return with.instances->ft->createInstance(with.instances, with.context, with.result, with.path, with.instance);
}

CMPIStatus modify(const Arguments& with) {
    return with.instances->ft->modifyInstance(with.instances, with.context, with.result, with.path, with.instance,
                                              nullptr);
}

CMPIStatus remove(const Arguments& with) {
    return with.instances->ft->deleteInstance(with.instances, with.context, with.result, with.path);
}

CMPIStatus query(const Arguments& with) {
    return with.instances->ft->execQuery(with.instances, with.context, with.result, with.path, "WQL",
                                         "SELECT * FROM VELKO_Lease");
}

CMPIStatus cleanUp(const Arguments& with) {
    return with.instances->ft->cleanup(with.instances, with.context, false);
}

CMPIStatus cleanUpAssociations(const Arguments& with) {
    return with.associations->ft->cleanup(with.associations, with.context, false);
}

template <const char* const& association>
CMPIStatus associators(const Arguments& with) {
    return with.associations->ft->associators(with.associations, with.context, with.result, with.path, association,
                                              nullptr, nullptr, nullptr, nullptr);
}

template <const char* const& association>
CMPIStatus associatorNames(const Arguments& with) {
    return with.associations->ft->associatorNames(with.associations, with.context, with.result, with.path, association,
                                                  nullptr, nullptr, nullptr);
}

template <const char* const& association>
CMPIStatus references(const Arguments& with) {
    return with.associations->ft->references(with.associations, with.context, with.result, with.path, association,
                                             nullptr, nullptr);
}

template <const char* const& association>
CMPIStatus referenceNames(const Arguments& with) {
    return with.associations->ft->referenceNames(with.associations, with.context, with.result, with.path, association,
                                                 nullptr);
}

constexpr const char* leaseSetting = "VELKO_LeaseSetting";
constexpr const char* warrantySetting = "VELKO_WarrantySetting";

RequestCase reading(const char* name, ObjectPath path, CMPIStatus (*call)(const Arguments&)) {
    return {name, std::move(path), {}, call};
}

RequestCase changing(const char* name, const char* file, ObjectPath path, std::vector<NamedValue> values,
                     CMPIStatus (*call)(const Arguments&)) {
    cimhost::Instance instance = testsupport::instance(path, std::move(values));
    return {name, std::move(path), std::move(instance), call, file};
}

}  // namespace

const std::vector<RequestCase>& allRequests() {
    static const ObjectPath leaseOfComputer = identified("VELKO_Lease", "/system/computer");
    static const ObjectPath warrantyOfComputer = identified("VELKO_Warranty", "/system/computer");
    static const std::vector<RequestCase> all{
        changing("CreateLease", leaseFile, identified("VELKO_Lease", "lease that is new"), {}, &create),
        changing("ModifyLease", leaseFile, leaseOfComputer, leaseValues(), &modify),
        changing("EmptyLessor", leaseFile, leaseOfComputer, {named("Lessor", text(""))}, &modify),
        changing("DeleteLease", leaseFile, leaseOfComputer, {}, &remove),
        changing("CreateWarranty", warrantyFile, identified("VELKO_Warranty", "warranty that is new"), {}, &create),
        changing("ModifyWarranty", warrantyFile, warrantyOfComputer, warrantyValues(), &modify),
        changing("DeleteWarranty", warrantyFile, warrantyOfComputer, {}, &remove),
        changing("ModifyAsset", assetFile, assetPath(), assetValues(), &modify),
        changing("ModifyAssetNumber", assetFile, assetPath(), {named("AssetNumber", text("A-4711, another number"))},
                 &modify),
        changing("EmptyAssetNumber", assetFile, assetPath(), {named("AssetNumber", text(""))}, &modify),
        reading("GetLease", leaseOfComputer, &get),
        reading("GetWarranty", warrantyOfComputer, &get),
        reading("GetAsset", assetPath(), &get),
        reading("GetAgent", pathOf("VELKO_OstrelAgent", productKeys("ID-1", "Test Agent", "VEL")), &get),
        reading("NamesOfLeases", pathOf("VELKO_Lease"), &names),
        reading("NamesOfWarranties", pathOf("VELKO_Warranty"), &names),
        reading("NamesOfAssets", pathOf("VELKO_AssetIDDetails"), &names),
        reading("NamesOfAgents", pathOf("VELKO_OstrelAgent"), &names),
        reading("NamesOfLeaseSettings", pathOf(leaseSetting), &names),
        reading("NamesOfWarrantySettings", pathOf(warrantySetting), &names),
        reading("Leases", pathOf("VELKO_Lease"), &instances),
        reading("Warranties", pathOf("VELKO_Warranty"), &instances),
        reading("Assets", pathOf("VELKO_AssetIDDetails"), &instances),
        reading("Agents", pathOf("VELKO_OstrelAgent"), &instances),
        reading("LeaseSettings", pathOf(leaseSetting), &instances),
        reading("WarrantySettings", pathOf(warrantySetting), &instances),
        reading("LeasesOfComputer", computer(), &associators<leaseSetting>),
        reading("WarrantiesOfComputer", computer(), &associators<warrantySetting>),
        reading("NamesOfLeasesOfComputer", computer(), &associatorNames<leaseSetting>),
        reading("NamesOfWarrantiesOfComputer", computer(), &associatorNames<warrantySetting>),
        reading("ComputersOfLease", leaseOfComputer, &associators<leaseSetting>),
        reading("ComputersOfWarranty", warrantyOfComputer, &associators<warrantySetting>),
        reading("NamesOfComputersOfLease", leaseOfComputer, &associatorNames<leaseSetting>),
        reading("NamesOfComputersOfWarranty", warrantyOfComputer, &associatorNames<warrantySetting>),
        reading("LeaseSettingsOfComputer", computer(), &references<leaseSetting>),
        reading("WarrantySettingsOfComputer", computer(), &references<warrantySetting>),
        reading("NamesOfLeaseSettingsOfComputer", computer(), &referenceNames<leaseSetting>),
        reading("NamesOfWarrantySettingsOfComputer", computer(), &referenceNames<warrantySetting>),
        reading("UnknownInstances", pathOf("VELKO_Unknown"), &instances),
        reading("Query", pathOf("VELKO_Lease"), &query),
        reading("CleanUp", pathOf("VELKO_Lease"), &cleanUp),
        reading("CleanUpAssociations", pathOf(leaseSetting), &cleanUpAssociations),
    };
    return all;
}

std::vector<RequestCase> changingRequests() {
    std::vector<RequestCase> requests;
    for (const RequestCase& request : allRequests()) {
        if (request.changes != nullptr) {
            requests.push_back(request);
        }
    }
    return requests;
}

const RequestCase& requestNamed(const std::string& name) {
    for (const RequestCase& request : allRequests()) {
        if (request.name == name) {
            return request;
        }
    }
    throw std::out_of_range("no request " + name);
}

namespace {

/** Returns a change of one value per file. @param number value of the record's term; a new record has 1 */
std::map<std::string, RequestCase> smallChanges(unsigned int number) {
    return {
        {leaseFile, changing("repair", leaseFile, identified("VELKO_Lease", "lease number 1"),
                             {named("LeaseTerm", uint32(number))}, &modify)},
        {warrantyFile, changing("repair", warrantyFile, identified("VELKO_Warranty", "warranty number 1"),
                                {named("WarrantyDuration", uint32(number))}, &modify)},
        {assetFile, changing("repair", assetFile, assetPath(), {named("SystemLocation", text("repaired"))}, &modify)},
    };
}

}  // namespace

const RequestCase& repairOf(const std::string& dataFile) {
    static const std::map<std::string, RequestCase> repairs = smallChanges(1);
    return repairs.at(dataFile);
}

const RequestCase& otherChangeOf(const std::string& dataFile) {
    static const std::map<std::string, RequestCase> detours = smallChanges(3);
    return detours.at(dataFile);
}

std::string classOf(const std::string& dataFile) {
    return repairOf(dataFile).path.className;
}

std::ostream& operator<<(std::ostream& stream, const RequestCase& request) {
    return stream << request.name;
}

}  // namespace faults
