#include "RecordFixture.h"

#include <algorithm>

namespace contract {

namespace {

bool samePropertyAs(const std::string& left, const std::string& right) {
    return left.substr(0, left.find('=')) == right.substr(0, right.find('='));
}

}  // namespace

const RecordClass lease{
    "Lease",
    "VELKO_Lease",
    "Lease.dat",
    "*\n00000000000000.000000-000\n0\n0\n0\n0\n0\n*\n*\n*\n*\n0\n",
    13,
    {"ElementName=\"Lease Information\"", "Lessor=\"\"", "BaseTermCommencementDate=NULL", "LeaseTerm=0",
     "EarlyTerminationOption=FALSE", "FixedPricePurchaseOption=FALSE", "RenewalOption=FALSE",
     "BargainRenewalOption=FALSE", "BaseRent=\"\"", "FairMarketRental=\"\"", "FairMarketValue=\"\"",
     "TerminationValue=\"\"", "NetMonthlyLeaseRateFactor=0"},
    "Lessor",
    "LeaseTerm",
    "BaseTermCommencementDate",
    "Lease with the supplied instance Id exists.",
    "Lease record not available",
    "Identify a Lease to remove.",
    "Could not open Lease record.",
};

const RecordClass warranty{
    "Warranty",
    "VELKO_Warranty",
    "Warranty.dat",
    "*\n00000000000000.000000-000\n0\n",
    4,
    {"ElementName=\"Warranty Information\"", "WarrantyStartDate=NULL", "WarrantyDuration=0", "Warrantor=\"\""},
    "Warrantor",
    "WarrantyDuration",
    "WarrantyStartDate",
    "Warranty with the supplied instance Id exists.",
    "Warranty record not available",
    "Identify a Warranty to remove.",
    "Could not open Warranty record.",
};

const testsupport::ModelFields& RecordClass::fields() const {
    return className == std::string(lease.className) ? testsupport::leaseFields() : testsupport::warrantyFields();
}

std::vector<std::string> RecordClass::shownRecord(const std::string& instanceId,
                                                  const std::vector<std::string>& changed) const {
    std::vector<std::string> properties = defaultProperties;
    for (const std::string& change : changed) {
        const auto same = [&](const std::string& each) { return samePropertyAs(each, change); };
        *std::find_if(properties.begin(), properties.end(), same) = change;
    }
    properties.insert(properties.begin(), "InstanceID=\"" + instanceId + "\"");
    return properties;
}

std::ostream& operator<<(std::ostream& stream, const RecordClass& recordClass) {
    return stream << recordClass.name;
}

Outcome RecordTest::create(const std::string& instanceId) {
    return provider().createInstance(path(instanceId), clientInstance(path(instanceId), {}));
}

Outcome RecordTest::get(const std::string& instanceId) {
    return provider().getInstance(path(instanceId));
}

Outcome RecordTest::modify(const std::string& instanceId, std::vector<NamedValue> properties) {
    return provider().modifyInstance(path(instanceId), clientInstance(path(instanceId), std::move(properties)));
}

Outcome RecordTest::remove(const std::string& instanceId) {
    return provider().deleteInstance(path(instanceId));
}

void RecordTest::createAll(const std::vector<std::string>& instanceIds) {
    for (const std::string& instanceId : instanceIds) {
        const Outcome outcome = create(instanceId);
        ASSERT_THAT(outcome, isOk(1));
        ASSERT_EQ(outcome.instances().size(), 1U) << instanceId;
    }
}

std::vector<std::string> RecordTest::identifiers() {
    const Outcome outcome = provider().enumerateInstanceNames(allPath());
    EXPECT_THAT(outcome, isOk(1));
    return identifiersOf(outcome.paths());
}

std::vector<std::string> RecordTest::recordOf(const std::string& instanceId) {
    const Outcome outcome = get(instanceId);
    EXPECT_THAT(outcome, isOk(1));
    const std::vector<Instance> instances = outcome.instances();
    EXPECT_LE(instances.size(), 1U);
    return instances.empty() ? std::vector<std::string>() : shown(instances.front().properties);
}

std::string RecordTest::dataOfNew(const std::vector<std::string>& storedIdentifiers) const {
    std::string content = std::to_string(storedIdentifiers.size()) + "\n";
    for (const std::string& identifier : storedIdentifiers) {
        content += kind().newRecord(identifier);
    }
    return content;
}

}  // namespace contract
