#include "Rows.h"

#include <cstdio>

namespace bench {

const std::array<AssetRow::Stored, 4> AssetRow::owner{{
    {"PrimaryOwnerName", "USER.Name", "Jo Example"},
    {"PrimaryOwnerPhone", "USER.Phone", "+00 123 456789"},
    {"PrimaryOwnerPosition", "USER.Position", "Engineer"},
    {"PrimaryOwnerDepartment", "USER.Department", "Research and Development"},
}};

const std::array<AssetRow::Stored, 2> AssetRow::asset{{
    {"AssetNumber", "USER.AssetNumber", "A-000123"},
    {"AssetIdTag", "USER.AssetIdTag", "tag 123"},
}};

const std::array<AssetRow::Stored, 10> AssetRow::personalized{{
    {"PersonalizedLabel1", "USER.PersonalizedLabel1", "Room"},
    {"PersonalizedData1", "USER.PersonalizedData1", "1.23"},
    {"PersonalizedLabel2", "USER.PersonalizedLabel2", "Rack"},
    {"PersonalizedData2", "USER.PersonalizedData2", "7"},
    {"PersonalizedLabel3", "USER.PersonalizedLabel3", "Cost centre"},
    {"PersonalizedData3", "USER.PersonalizedData3", "4711"},
    {"PersonalizedLabel4", "USER.PersonalizedLabel4", "Switch"},
    {"PersonalizedData4", "USER.PersonalizedData4", "sw-12 port 34"},
    {"PersonalizedLabel5", "USER.PersonalizedLabel5", "Remark"},
    {"PersonalizedData5", "USER.PersonalizedData5", "second power supply in store"},
}};

const std::array<AssetRow::Stored, 2> AssetRow::dates{{
    {"LastInventoried", "USER.LastInventoried", "20260105120000.000000+060"},
    {"PurchaseDate", "USER.PurchaseDate", "20240301000000.000000+060"},
}};

const AssetRow::Stored AssetRow::location{"SystemLocation", "USER.Location", "Building 4"};
const AssetRow::Stored AssetRow::profile{"ZOPMProfile", "USER.ZOPMProfile", "standard workstation"};
const AssetRow::Stored AssetRow::profileDate{"ZOPMUpdateTime", "USER.ZOPMUpdateTime", "20240302000000.000000+060"};

namespace {

/** Returns the strings in turn as the index grows. */
template <std::size_t count>
std::string oneOf(const std::array<const char*, count>& strings, std::size_t index) {
    return strings[index % count];
}

constexpr std::array<const char*, 4> parties{"ACME Leasing Co", "Example Leasing and Finance Ltd", "Lessor 3",
                                             "City Office Supplies"};

/** Every fourth record has no date. */
constexpr std::array<const char*, 4> commencements{"20260101000000.000000+000", "20250630000000.000000+060", "",
                                                   "20240301000000.000000-300"};

constexpr std::array<const char*, 4> amounts{"1250.00 EUR", "89.90 USD", "", "120000.00 EUR per annum"};

template <class Rows>
void append(std::string& content, const Rows& rows) {
    for (const AssetRow::Stored& row : rows) {
        content += std::string(row.fileKey) + '=' + row.value + '\n';
    }
}

template <class Row>
std::vector<Row> recordRows(std::size_t size, Row (*make)(std::size_t index)) {
    std::vector<Row> rows;
    rows.reserve(size);
    for (std::size_t index = 0; index < size; ++index) {
        rows.push_back(make(index));
        rows.back().instanceId = instanceIdOf(index, size);
    }
    return rows;
}

LeaseRow makeLease(std::size_t index) {
    LeaseRow row;
    row.lessor = oneOf(parties, index);
    row.commencement = oneOf(commencements, index);
    row.term = 12 + static_cast<unsigned int>(index % 48);
    row.earlyTermination = index % 2 == 0;
    row.renewal = index % 3 == 0;
    row.baseRent = oneOf(amounts, index);
    row.marketRental = oneOf(amounts, index + 1);
    row.marketValue = oneOf(amounts, index + 2);
    row.terminationValue = oneOf(amounts, index + 3);
    row.rateFactor = static_cast<unsigned int>(index % 1000);
    return row;
}

WarrantyRow makeWarranty(std::size_t index) {
    WarrantyRow row;
    row.warrantor = oneOf(parties, index);
    row.commencement = oneOf(commencements, index);
    row.duration = 12 + static_cast<unsigned int>(index % 48);
    return row;
}

}  // namespace

std::string instanceIdOf(std::size_t index, std::size_t size) {
    if (index == size / 2) {
        return names::computerNode;
    }
    char id[32];
    std::snprintf(id, sizeof id, "record %08zu", index);
    return id;
}

template <>
std::vector<LeaseRow> makeRows(std::size_t size) {
    return recordRows(size, &makeLease);
}

template <>
std::vector<WarrantyRow> makeRows(std::size_t size) {
    return recordRows(size, &makeWarranty);
}

template <>
std::vector<AgentRow> makeRows(std::size_t size) {
    return std::vector<AgentRow>(
        size, {names::agent, names::agentNumber, names::agent, names::vendor, names::agentVersion, names::agentBuild});
}

template <>
std::vector<AssetRow> makeRows(std::size_t size) {
    return std::vector<AssetRow>(
        size, {names::systemNode, names::computer, names::vendor, names::agentVersion, names::computerModel});
}

std::string assetFileContent() {
    std::string content;
    append(content, AssetRow::owner);
    append(content, AssetRow::asset);
    append(content, AssetRow::personalized);
    append(content, AssetRow::dates);
    append(content, std::array<AssetRow::Stored, 3>{AssetRow::location, AssetRow::profile, AssetRow::profileDate});
    return content;
}

}  // namespace bench
