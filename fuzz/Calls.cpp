#include "Calls.h"

#include <array>
#include <string>
#include <vector>

#include "schema/MofWriter.h"
#include "schema/ObjectPathText.h"
#include "support/Values.h"

namespace fuzz {

namespace {

using cimhost::NamedValue;
using cimhost::Operation;
using cimhost::Value;
using Names = std::vector<const char*>;

using Action = std::variant<Operation, Event>;

/** Actions that are listed more often are chosen more often. */
constexpr std::array<Action, 19> actions{Operation::createInstance,
                                         Operation::createInstance,
                                         Operation::createInstance,
                                         Operation::modifyInstance,
                                         Operation::modifyInstance,
                                         Operation::modifyInstance,
                                         Operation::deleteInstance,
                                         Operation::deleteInstance,
                                         Operation::getInstance,
                                         Operation::enumerateInstances,
                                         Event::restart,
                                         Operation::enumerateInstanceNames,
                                         Operation::associators,
                                         Operation::associatorNames,
                                         Operation::references,
                                         Operation::referenceNames,
                                         Operation::execQuery,
                                         Event::cleanup,
                                         Event::associationCleanup};

const char* nameOf(Event event) {
    switch (event) {
        case Event::cleanup:
            return "cleanup";
        case Event::associationCleanup:
            return "associationCleanup";
        default:
            return "restart";
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

const std::vector<std::string>& strings() {
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

/** A string that can be stored. */
std::string validString(Bytes& bytes) {
    constexpr std::size_t validStrings = 5;
    return strings()[bytes.below(validStrings)];
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
            return Value::array(CMPI_string, {nextString(bytes)});
        case 11:
            return testsupport::real64(1.5);
        default:
            return testsupport::text(nextString(bytes));
    }
}

/** A value for a key, usually a string. */
Value nextKeyValue(Bytes& bytes) {
    return bytes.below(8) == 0 ? nextValue(bytes) : testsupport::text(nextString(bytes));
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

Value validValue(Bytes& bytes, CMPIType type) {
    switch (type) {
        case CMPI_uint32:
            return testsupport::uint32(number(bytes));
        case CMPI_boolean:
            return testsupport::boolean(bytes.below(2) == 1);
        case CMPI_dateTime:
            return testsupport::dateTime(date(bytes));
        default:
            return testsupport::text(validString(bytes));
    }
}

/** Some of the modifiable properties of a class. */
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

void makeValid(Call& call, Bytes& bytes) {
    cimhost::Request& request = call.request;
    call.isValid = true;
    call.hasInstance = true;
    constexpr std::array classNames{"VELKO_Lease", "VELKO_Lease", "VELKO_Warranty", "VELKO_AssetIDDetails"};
    request.path = {"", "root/cimv2", bytes.pick(classNames), {{"InstanceID", testsupport::text(validString(bytes))}}};
    if (request.path.className == classNames.back()) {
        request.path.keys = {{"IdentifyingNumber", testsupport::text("/system")},
                             {"Name", testsupport::text("testhost")},
                             {"Vendor", testsupport::text("Example Maker")},
                             {"Version", testsupport::text("4.2.0")}};
    }
    request.instance = {request.path, {}};
    for (const Writable* each : someWritables(bytes, request.path.className)) {
        request.instance.properties.push_back({each->name, validValue(bytes, each->type)});
    }
    if (bytes.below(4) == 0) {
        for (const Writable* each : someWritables(bytes, request.path.className)) {
            request.properties = request.properties.value_or(std::vector<std::string>{});
            request.properties->emplace_back(each->name);
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

void addInstance(Call& call, Bytes& bytes) {
    const std::size_t count = bytes.below(9);
    call.hasInstance = count != 8;
    if (!call.hasInstance) {
        return;
    }
    cimhost::Instance& instance = call.request.instance;
    instance.path = call.request.path;
    for (std::size_t property = 0; property < count; ++property) {
        std::string name = bytes.pick(properties);
        instance.properties.push_back({std::move(name), nextValue(bytes)});
    }
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

std::string nextString(Bytes& bytes) {
    const std::size_t choice = bytes.byte();
    if (choice < 16 * 8) {
        return strings()[choice % strings().size()];
    }
    std::string string;
    for (std::size_t left = choice % 16; left > 0 && !bytes.isAtEnd(); --left) {
        const auto byte = static_cast<char>(bytes.byte());
        string += byte == '\0' ? ' ' : byte;
    }
    return string;
}

std::string describe(const Call& call) {
    if (call.event) {
        return std::string(nameOf(*call.event)) + "\n";
    }
    const cimhost::Request& request = call.request;
    std::string description =
        std::string(cimhost::nameOf(request.operation)) + " " + cimhost::formatObjectPath(request.path) + "\n";
    for (const std::string& name : request.properties.value_or(std::vector<std::string>{})) {
        description += "  listed: " + name + "\n";
    }
    for (const auto* name : {&request.filter.associationClass, &request.filter.resultClass, &request.filter.role,
                             &request.filter.resultRole}) {
        description += *name ? "  filter: " + **name + "\n" : "";
    }
    return description + (call.hasInstance ? cimhost::formatMof(request.instance) : "");
}

Call nextCall(Bytes& bytes) {
    Call call;
    const Action& action = bytes.pick(actions);
    if (const auto* event = std::get_if<Event>(&action)) {
        call.event = *event;
    } else {
        call.request.operation = std::get<Operation>(action);
    }
    if (!call.event && call.request.operation <= Operation::deleteInstance && bytes.below(2) == 1) {
        makeValid(call, bytes);
        return call;
    }
    call.request.path = nextPath(bytes);
    if (call.performs(Operation::createInstance) || call.performs(Operation::modifyInstance)) {
        addInstance(call, bytes);
        call.request.properties = nextProperties(bytes);
    } else if (call.performs(Operation::enumerateInstances) || call.performs(Operation::getInstance)) {
        call.request.properties = nextProperties(bytes);
    } else if (!call.event && cimhost::isAssociationOperation(call.request.operation)) {
        call.request.filter.associationClass = nextAssociation(bytes);
        call.request.filter.resultClass = nextName(bytes);
        call.request.filter.role = nextName(bytes);
        call.request.filter.resultRole = nextName(bytes);
        call.request.properties = nextProperties(bytes);
    }
    return call;
}

}  // namespace fuzz
