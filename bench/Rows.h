#pragma once

#include <array>
#include <cstddef>
#include <string>
#include <vector>

/**
 * The data of the benchmarks as plain structs, which are written to the provider's files and which the baseline serves.
 *
 * Each struct has the name of its CIM class, its keys, and its properties in the order in which the provider sets them.
 * Records also have the fields of their file, in file order.
 */
namespace bench {

/** A key of a class: its name and its member. */
template <class Row>
struct Key {
    const char* name;
    std::string Row::*member;
};

struct LeaseRow {
    static constexpr const char* className = "VELKO_Lease";
    static constexpr const char* fileName = "Lease.dat";

    std::string instanceId{};
    std::string lessor{};
    std::string commencement{};  ///< CIM datetime; empty: none
    unsigned int term = 0;
    bool earlyTermination = false;
    bool fixedPricePurchase = false;
    bool renewal = false;
    bool bargainRenewal = false;
    std::string baseRent{};
    std::string marketRental{};
    std::string marketValue{};
    std::string terminationValue{};
    unsigned int rateFactor = 0;

    static constexpr std::array<Key<LeaseRow>, 1> keys{{{"InstanceID", &LeaseRow::instanceId}}};
    static constexpr Key<LeaseRow> modified{"Lessor", &LeaseRow::lessor};  ///< the property that modifications change

    template <class Set>
    void eachProperty(const Set& set) const {
        set.string("InstanceID", instanceId);
        set.string("ElementName", "Lease Information");
        set.string("Lessor", lessor);
        set.date("BaseTermCommencementDate", commencement);
        set.number("LeaseTerm", term);
        set.flag("EarlyTerminationOption", earlyTermination);
        set.flag("FixedPricePurchaseOption", fixedPricePurchase);
        set.flag("RenewalOption", renewal);
        set.flag("BargainRenewalOption", bargainRenewal);
        set.string("BaseRent", baseRent);
        set.string("FairMarketRental", marketRental);
        set.string("FairMarketValue", marketValue);
        set.string("TerminationValue", terminationValue);
        set.number("NetMonthlyLeaseRateFactor", rateFactor);
    }

    template <class Row, class Visitor>
    static void eachField(Row& row, Visitor& visitor) {
        visitor.identifier(row.instanceId);
        visitor.value(row.lessor);
        visitor.date(row.commencement);
        visitor.number(row.term);
        visitor.flag(row.earlyTermination);
        visitor.flag(row.fixedPricePurchase);
        visitor.flag(row.renewal);
        visitor.flag(row.bargainRenewal);
        visitor.value(row.baseRent);
        visitor.value(row.marketRental);
        visitor.value(row.marketValue);
        visitor.value(row.terminationValue);
        visitor.number(row.rateFactor);
    }
};

struct WarrantyRow {
    static constexpr const char* className = "VELKO_Warranty";
    static constexpr const char* fileName = "Warranty.dat";

    std::string instanceId{};
    std::string warrantor{};
    std::string commencement{};  ///< CIM datetime; empty: none
    unsigned int duration = 0;

    static constexpr std::array<Key<WarrantyRow>, 1> keys{{{"InstanceID", &WarrantyRow::instanceId}}};
    static constexpr Key<WarrantyRow> modified{"Warrantor", &WarrantyRow::warrantor};

    template <class Set>
    void eachProperty(const Set& set) const {
        set.string("InstanceID", instanceId);
        set.string("ElementName", "Warranty Information");
        set.date("WarrantyStartDate", commencement);
        set.number("WarrantyDuration", duration);
        set.string("Warrantor", warrantor);
    }

    template <class Row, class Visitor>
    static void eachField(Row& row, Visitor& visitor) {
        visitor.identifier(row.instanceId);
        visitor.value(row.warrantor);
        visitor.date(row.commencement);
        visitor.number(row.duration);
    }
};

struct AgentRow {
    static constexpr const char* className = "VELKO_OstrelAgent";

    std::string name{};
    std::string identifyingNumber{};
    std::string productName{};
    std::string vendor{};
    std::string version{};
    std::string buildNumber{};

    static constexpr std::array<Key<AgentRow>, 5> keys{{{"Name", &AgentRow::name},
                                                        {"IdentifyingNumber", &AgentRow::identifyingNumber},
                                                        {"ProductName", &AgentRow::productName},
                                                        {"Vendor", &AgentRow::vendor},
                                                        {"Version", &AgentRow::version}}};

    template <class Set>
    void eachProperty(const Set& set) const {
        set.string("Caption", "VEL Ostrel");
        set.string("Description", "VEL Ostrel");
        set.string("BuildNumber", buildNumber);
        set.string("Status", "OK");
        set.string("Name", name);
        set.string("ProductName", productName);
        set.string("IdentifyingNumber", identifyingNumber);
        set.string("Vendor", vendor);
        set.string("Version", version);
    }
};

struct AssetRow {
    static constexpr const char* className = "VELKO_AssetIDDetails";

    /** A property that is stored in the asset file. */
    struct Stored {
        const char* property;
        const char* fileKey;
        const char* value;
    };

    /** The stored properties. DeploymentProfile and DeploymentUpdateTime have the values of profile and profileDate. */
    static const std::array<Stored, 4> owner;
    static const std::array<Stored, 2> asset;
    static const std::array<Stored, 10> personalized;
    static const std::array<Stored, 2> dates;
    static const Stored location;
    static const Stored profile;
    static const Stored profileDate;

    std::string identifyingNumber{};
    std::string name{};
    std::string vendor{};
    std::string version{};
    std::string productName{};

    static constexpr std::array<Key<AssetRow>, 4> keys{{{"IdentifyingNumber", &AssetRow::identifyingNumber},
                                                        {"Name", &AssetRow::name},
                                                        {"Vendor", &AssetRow::vendor},
                                                        {"Version", &AssetRow::version}}};

    template <class Set>
    void eachProperty(const Set& set) const {
        const auto stored = [&](const Stored& one) { set.string(one.property, one.value); };
        set.string("IdentifyingNumber", identifyingNumber);
        set.string("Name", name);
        set.string("Vendor", vendor);
        set.string("Version", version);
        set.string("Caption", "Asset ID Information");
        set.string("Description", "Asset ID Information");
        set.string("CSName", name);
        for (const Stored& one : owner) {
            stored(one);
        }
        set.number("AssetIDStringArea", 1024);
        for (const Stored& one : asset) {
            stored(one);
        }
        set.string("ProductName", productName);
        for (const Stored& one : personalized) {
            stored(one);
        }
        for (const Stored& one : dates) {
            set.date(one.property, one.value);
        }
        stored(location);
        set.date("LocalDateTime", profileDate.value);  // the provider sets the current time
        stored(profile);
        set.date(profileDate.property, profileDate.value);
        set.string("DeploymentProfile", profile.value);
        set.date("DeploymentUpdateTime", profileDate.value);
    }
};

/** Names of the agent and of the computer that it manages. */
namespace names {
constexpr const char* nameSpace = "root/cimv2";
constexpr const char* agent = "Benchmark Agent";
constexpr const char* agentNumber = "ID-1";
constexpr const char* agentVersion = "4.2.0";
constexpr const char* agentBuild = "77";
constexpr const char* vendor = "Example Maker";
constexpr const char* computer = "benchhost";
constexpr const char* computerModel = "Model X";
constexpr const char* systemNode = "/system";
constexpr const char* computerNode = "/system/computer";  ///< identifier of the computer's lease
constexpr const char* computerClass = "VELKO_ComputerSystem";
constexpr const char* leaseSettingClass = "VELKO_LeaseSetting";
}  // namespace names

/**
 * The identifier of a record in a table of this size. The middle record belongs to the computer, so that there is an
 * association.
 */
std::string instanceIdOf(std::size_t index, std::size_t size);

/** Returns a table of this number of rows; a product class has one row. */
template <class Row>
std::vector<Row> makeRows(std::size_t size);

/** The content of the asset file with the values of AssetRow. */
std::string assetFileContent();

}  // namespace bench
