#include "Calls.h"

#include "schema/MofWriter.h"
#include "schema/ObjectPathText.h"
#include "support/Values.h"

#include <array>
#include <string>
#include <vector>

namespace fuzz {

namespace {

using cimhost::NamedValue;
using cimhost::Value;
using Names = std::vector<const char*>;

/** The more often it stands here, the more often it is picked. */
constexpr std::array actions{Action::createInstance,     Action::createInstance,  Action::createInstance,
                             Action::modifyInstance,     Action::modifyInstance,  Action::modifyInstance,
                             Action::deleteInstance,     Action::deleteInstance,  Action::getInstance,
                             Action::enumerateInstances, Action::restart,         Action::enumerateInstanceNames,
                             Action::associators,        Action::associatorNames, Action::references,
                             Action::referenceNames,     Action::execQuery,       Action::cleanup,
                             Action::associationCleanup};

const char* nameOf(Action action) {
    switch (action) {
        case Action::cleanup:
            return "cleanup";
        case Action::associationCleanup:
            return "associationCleanup";
        case Action::restart:
            return "restart";
        default:
            return cimhost::nameOf(static_cast<cimhost::Operation>(action));
    }
}

const Names classes{"VELKO_Lease",
                    "VELKO_Warranty",
                    "VELKO_Lease",
                    "VELKO_Warranty",
                    "VELKO_AssetIDDetails",
                    "VELKO_LeaseSetting",
                    "VELKO_WarrantySetting",
                    "VELKO_OstrelAgent",
                    "VELKO_ComputerSystem",
                    "velko_lease",
                    "Velko_WARRANTY",
                    "Unknown_Class",
                    ""};

const Names nameSpaces{"root/cimv2", "root/other", ""};

const Names keys{"InstanceID", "InstanceID", "InstanceID",        "instanceid",  "Name",       "Name",
                 "Vendor",     "Version",    "IdentifyingNumber", "ProductName", "Antecedent", "Dependent"};

const Names properties{"Lessor",
                       "BaseTermCommencementDate",
                       "LeaseTerm",
                       "EarlyTerminationOption",
                       "FixedPricePurchaseOption",
                       "RenewalOption",
                       "BargainRenewalOption",
                       "BaseRent",
                       "FairMarketRental",
                       "FairMarketValue",
                       "TerminationValue",
                       "NetMonthlyLeaseRateFactor",
                       "WarrantyStartDate",
                       "WarrantyDuration",
                       "Warrantor",
                       "AssetNumber",
                       "PersonalizedLabel1",
                       "PersonalizedData1",
                       "PersonalizedLabel3",
                       "PersonalizedData5",
                       "PrimaryOwnerName",
                       "PrimaryOwnerPhone",
                       "PrimaryOwnerPosition",
                       "PrimaryOwnerDepartment",
                       "LastInventoried",
                       "PurchaseDate",
                       "SystemLocation",
                       "ZOPMProfile",
                       "ZOPMUpdateTime",
                       "InstanceID",
                       "Caption",
                       "AssetIdTag",
                       "LocalDateTime",
                       "lessor",
                       "Unknown"};

const std::vector<std::string>& texts() {
    static const std::vector<std::string> all{"A",
                                              "B",
                                              "lease 1",
                                              "/system/computer",
                                              "Jo Example",
                                              "lease_1",
                                              "/system",
                                              "testhost",
                                              "Example Maker",
                                              "4.2.0",
                                              "",
                                              "*",
                                              "X",
                                              " ",
                                              "_",
                                              "two  blanks ",
                                              "line\nfeed",
                                              "\t",
                                              "20260101000000.000000+060",
                                              "00000000000000.000000-000",
                                              "20261301000000.000000+000",
                                              "00000007000000.000000:000",
                                              "1",
                                              "0",
                                              "\xFF\xC3\xA4%s%n",
                                              std::string(600, 'x')};
    return all;
}

/** A text that can be stored. */
std::string aptText(Bytes& bytes) {
    constexpr std::size_t aptTexts = 5;
    return texts()[bytes.below(aptTexts)];
}

/** A string object without characters, which some object managers pass to providers. */
Value withoutCharacters(Bytes& bytes) {
    return bytes.below(2) == 0 ? Value::nullStringObject() : Value::stringWithoutCharacters();
}

std::uint32_t number(Bytes& bytes) {
    constexpr std::array<std::uint32_t, 6> numbers{0, 1, 36, 255, 65536, 4294967295U};
    return bytes.pick(numbers);
}

std::string date(Bytes& bytes) {
    constexpr std::array dates{"20260101000000.000000+060", "00000007000000.000000:000", "20240229235959.999999-720"};
    return bytes.pick(dates);
}

/** A value of any type. */
Value nextValue(Bytes& bytes) {
    switch (bytes.below(16)) {
        case 0:
            return testsupport::uint32(number(bytes));
        case 1:
            return testsupport::uint64(std::uint64_t{number(bytes)} << bytes.below(33));
        case 2:
            return testsupport::sint64(-std::int64_t{number(bytes)});
        case 3:
            return testsupport::uint8(bytes.byte());
        case 4:
        case 5:
            return testsupport::boolean(bytes.below(2) == 1);
        case 6:
            return testsupport::dateTime(date(bytes));
        case 7:
            return withoutCharacters(bytes);
        case 8:
            return testsupport::nullOf(bytes.below(2) == 1 ? CMPI_string : CMPI_uint32);
        case 9:
            return testsupport::reference({"", bytes.pick(nameSpaces), bytes.pick(classes), {}});
        case 10:
            return Value::array(CMPI_string, {nextText(bytes)});
        case 11:
            return testsupport::real64(1.5);
        default:
            return testsupport::text(nextText(bytes));
    }
}

/** Mostly a text. */
Value nextKeyValue(Bytes& bytes) {
    return bytes.below(8) == 0 ? nextValue(bytes) : testsupport::text(nextText(bytes));
}

/** A property that can be modified. */
struct Writable {
    const char* className;
    const char* name;
    CMPIType type;
};

constexpr Writable writables[] = {{"VELKO_Lease", "Lessor", CMPI_string},
                                  {"VELKO_Lease", "BaseTermCommencementDate", CMPI_dateTime},
                                  {"VELKO_Lease", "LeaseTerm", CMPI_uint32},
                                  {"VELKO_Lease", "RenewalOption", CMPI_boolean},
                                  {"VELKO_Lease", "BargainRenewalOption", CMPI_boolean},
                                  {"VELKO_Lease", "BaseRent", CMPI_string},
                                  {"VELKO_Lease", "TerminationValue", CMPI_string},
                                  {"VELKO_Lease", "NetMonthlyLeaseRateFactor", CMPI_uint32},
                                  {"VELKO_Warranty", "WarrantyStartDate", CMPI_dateTime},
                                  {"VELKO_Warranty", "WarrantyDuration", CMPI_uint32},
                                  {"VELKO_Warranty", "Warrantor", CMPI_string},
                                  {"VELKO_AssetIDDetails", "AssetNumber", CMPI_string},
                                  {"VELKO_AssetIDDetails", "PersonalizedLabel2", CMPI_string},
                                  {"VELKO_AssetIDDetails", "PersonalizedData5", CMPI_string},
                                  {"VELKO_AssetIDDetails", "PurchaseDate", CMPI_dateTime},
                                  {"VELKO_AssetIDDetails", "SystemLocation", CMPI_string}};

Value aptValue(Bytes& bytes, CMPIType type) {
    switch (type) {
        case CMPI_uint32:
            return testsupport::uint32(number(bytes));
        case CMPI_boolean:
            return testsupport::boolean(bytes.below(2) == 1);
        case CMPI_dateTime:
            return testsupport::dateTime(date(bytes));
        default:
            return testsupport::text(aptText(bytes));
    }
}

/** Some of a class's properties that can be modified. */
std::vector<const Writable*> someWritables(Bytes& bytes, const std::string& className) {
    const std::size_t low = bytes.byte();
    const std::size_t chosen = low | std::size_t{bytes.byte()} << 8U;
    std::vector<const Writable*> some;
    for (std::size_t row = 0; row < std::size(writables); ++row) {
        if (className == writables[row].className && (chosen >> row & 1U) != 0) {
            some.push_back(&writables[row]);
        }
    }
    return some;
}

void makeApt(Call& call, Bytes& bytes) {
    call.isApt = true;
    constexpr std::array apt{"VELKO_Lease", "VELKO_Lease", "VELKO_Warranty", "VELKO_AssetIDDetails"};
    call.path = {"", "root/cimv2", bytes.pick(apt), {{"InstanceID", testsupport::text(aptText(bytes))}}};
    if (call.path.className == apt.back()) {
        call.path.keys = {{"IdentifyingNumber", testsupport::text("/system")},
                          {"Name", testsupport::text("testhost")},
                          {"Vendor", testsupport::text("Example Maker")},
                          {"Version", testsupport::text("4.2.0")}};
    }
    call.instance = cimhost::Instance{call.path, {}};
    for (const Writable* each : someWritables(bytes, call.path.className)) {
        call.instance->properties.push_back({each->name, aptValue(bytes, each->type)});
    }
    if (bytes.below(4) == 0) {
        for (const Writable* each : someWritables(bytes, call.path.className)) {
            call.properties = call.properties.value_or(std::vector<std::string>{});
            call.properties->emplace_back(each->name);
        }
    }
}

cimhost::ObjectPath nextPath(Bytes& bytes) {
    cimhost::ObjectPath path{"", bytes.pick(nameSpaces), bytes.pick(classes), {}};
    constexpr std::array<std::size_t, 8> counts{1, 1, 1, 1, 1, 0, 2, 4};
    for (std::size_t count = bytes.pick(counts); count > 0; --count) {
        std::string name = bytes.pick(keys);
        path.keys.push_back({std::move(name), nextKeyValue(bytes)});
    }
    return path;
}

std::optional<cimhost::Instance> nextInstance(Bytes& bytes, const cimhost::ObjectPath& path) {
    const std::size_t count = bytes.below(9);
    if (count == 8) {
        return std::nullopt;
    }
    cimhost::Instance instance{path, {}};
    for (std::size_t property = 0; property < count; ++property) {
        std::string name = bytes.pick(properties);
        instance.properties.push_back({std::move(name), nextValue(bytes)});
    }
    return instance;
}

cimhost::PropertyList nextProperties(Bytes& bytes) {
    const std::size_t count = bytes.below(8);
    if (count >= 4) {
        return std::nullopt;
    }
    std::vector<std::string> names;
    for (std::size_t name = 0; name < count; ++name) {
        names.emplace_back(bytes.pick(properties));
    }
    return names;
}

std::optional<std::string> nextName(Bytes& bytes) {
    const Names names{"VELKO_LeaseSetting", "VELKO_WarrantySetting", "Antecedent", "Dependent"};
    switch (bytes.below(4)) {
        case 0:
            return bytes.pick(names);
        case 1:
            return bytes.pick(classes);
        default:
            return std::nullopt;
    }
}

std::optional<std::string> nextAssociation(Bytes& bytes) {
    const Names names{"VELKO_LeaseSetting", "VELKO_WarrantySetting", "velko_leasesetting"};
    return bytes.below(4) == 0 ? nextName(bytes) : bytes.pick(names);
}

}  // namespace

std::string nextText(Bytes& bytes) {
    const std::size_t choice = bytes.byte();
    if (choice < 16 * 8) {
        return texts()[choice % texts().size()];
    }
    std::string text;
    for (std::size_t left = choice % 16; left > 0 && !bytes.isUsedUp(); --left) {
        const auto byte = static_cast<char>(bytes.byte());
        text += byte == '\0' ? ' ' : byte;
    }
    return text;
}

std::string toText(const Call& call) {
    std::string text = nameOf(call.action);
    text += " " + cimhost::formatObjectPath(call.path) + "\n";
    for (const std::string& name : call.properties.value_or(std::vector<std::string>{})) {
        text += "  listed: " + name + "\n";
    }
    for (const auto* name :
         {&call.filter.associationClass, &call.filter.resultClass, &call.filter.role, &call.filter.resultRole}) {
        text += *name ? "  filter: " + **name + "\n" : "";
    }
    return text + (call.instance ? cimhost::formatMof(*call.instance) : "");
}

Call nextCall(Bytes& bytes) {
    Call call{bytes.pick(actions)};
    if (call.action <= Action::deleteInstance && bytes.below(2) == 1) {
        makeApt(call, bytes);
        return call;
    }
    call.path = nextPath(bytes);
    switch (call.action) {
        case Action::createInstance:
        case Action::modifyInstance:
            call.instance = nextInstance(bytes, call.path);
            call.properties = nextProperties(bytes);
            break;
        case Action::enumerateInstances:
        case Action::getInstance:
            call.properties = nextProperties(bytes);
            break;
        case Action::associators:
        case Action::associatorNames:
        case Action::references:
        case Action::referenceNames:
            call.filter.associationClass = nextAssociation(bytes);
            call.filter.resultClass = nextName(bytes);
            call.filter.role = nextName(bytes);
            call.filter.resultRole = nextName(bytes);
            call.properties = nextProperties(bytes);
            break;
        default:
            break;
    }
    return call;
}

}  // namespace fuzz
