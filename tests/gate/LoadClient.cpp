#include "LoadClient.h"

#include <set>

namespace gatetest {

namespace {

using cimhost::Request;

using testsupport::Form;
using testsupport::ModelRecord;
using testsupport::RecordModel;

/** Returns a value for a field, derived from the number, in the model's format. */
std::string valueOf(Form form, int number) {
    switch (form) {
        case Form::number:
            return std::to_string(number);
        case Form::flag:
            return number % 2 == 0 ? "0" : "1";
        case Form::date:
            return std::to_string(20'200'101'000'000 + number) + ".000000+060";
        default:
            return "Text of " + std::to_string(number);
    }
}

cimhost::Value cimValue(Form form, const std::string& value) {
    switch (form) {
        case Form::number:
            return uint32(static_cast<std::uint32_t>(std::stoul(value)));
        case Form::flag:
            return testsupport::boolean(value == "1");
        case Form::date:
            return testsupport::dateTime(value);
        default:
            return text(value);
    }
}

/** Returns whether an instance has all values of a record. */
bool shows(const LoadedKind& kind, const Instance& instance, const ModelRecord& record) {
    const RecordModel model(kind.fields);
    return model.shownFields(instance) == model.shown(record);
}

ObjectPath assetPath() {
    return testsupport::objectPath(nameSpace, asset,
                                   {named("IdentifyingNumber", text("/system")), named("Name", text("alpha")),
                                    named("Vendor", text("Example Maker")), named("Version", text("4.2.0"))});
}

}  // namespace

const std::vector<LoadedKind>& loadedKinds() {
    static const std::vector<LoadedKind> kinds{
        {lease, leaseSetting, "Lease.dat", testsupport::leaseFields()},
        {warranty, warrantySetting, "Warranty.dat", testsupport::warrantyFields()},
    };
    return kinds;
}

const std::vector<const char*>& loadedAssetProperties() {
    static const std::vector<const char*> properties{"AssetNumber",          "PrimaryOwnerName",   "PrimaryOwnerPhone",
                                                     "PrimaryOwnerPosition", "SystemLocation",     "ZOPMProfile",
                                                     "PersonalizedLabel1",   "PersonalizedData1",  "PersonalizedLabel2",
                                                     "PersonalizedData2",    "PersonalizedLabel5", "PersonalizedData5"};
    return properties;
}

ModelRecord filledRecord(const LoadedKind& kind, const std::string& id, int number) {
    ModelRecord record{id};
    for (std::size_t field = 1; field < kind.fields.size(); ++field) {
        record.push_back(valueOf(kind.fields[field].form, number));
    }
    return record;
}

std::vector<NamedValue> propertiesOf(const LoadedKind& kind, const ModelRecord& record) {
    std::vector<NamedValue> properties;
    for (std::size_t field = 1; field < kind.fields.size(); ++field) {
        properties.push_back(named(kind.fields[field].property, cimValue(kind.fields[field].form, record[field])));
    }
    return properties;
}

void LoadClient::work(int round) {
    for (const LoadedKind& kind : loadedKinds()) {
        workOn(kind, round);
    }
    changeAsset(round);
}

void LoadClient::workOn(const LoadedKind& kind, int round) {
    const std::string id = "client " + std::to_string(number) + " round " + std::to_string(round);
    create(kind, id, number + 1, false);
    create(kind, "shared " + std::to_string(round), number + 1, true);
    read(kind, id);
    modify(kind, id, 100 * (number + 1) + round);
    enumerate(kind);
    if (number == 0) {
        move(kind, round);
    } else {
        associate(kind);
    }
    if (round % 2 == 1) {
        remove(kind, id);
    }
}

void LoadClient::expect(bool holds, const std::string& what, const cimhost::Status& status) {
    if (!holds) {
        problems.push_back(what + ": " + std::to_string(status.rc) + " " + status.message);
    }
}

/** Creates a record. All clients try to create each shared record; one of them succeeds. */
void LoadClient::create(const LoadedKind& kind, const std::string& id, int value, bool isShared) {
    const ModelRecord record = filledRecord(kind, id, value);
    const cimhost::Status status = gate.create(id, propertiesOf(kind, record), kind.className);
    expect(status.ok() || (isShared && status.rc == CMPI_RC_ERR_ALREADY_EXISTS), "creating " + id, status);
    if (status.ok()) {
        expected.records[kind.className][id] = record;
    }
}

void LoadClient::read(const LoadedKind& kind, const std::string& id) {
    const auto answer = gate.manager().perform(Request::getInstance(keyedPath(kind.className, id)));
    expect(answer.ok(), "getting " + id, answer.status);
    expect(shows(kind, answer.instance(), expected.records[kind.className][id]), "values of " + id);
}

void LoadClient::modify(const LoadedKind& kind, const std::string& id, int value) {
    const ModelRecord record = filledRecord(kind, id, value);
    const auto status = gate.modify(keyedPath(kind.className, id), propertiesOf(kind, record));
    expect(status.ok(), "modifying " + id, status);
    expected.records[kind.className][id] = record;
}

void LoadClient::remove(const LoadedKind& kind, const std::string& id) {
    const auto status = gate.remove(id, kind.className);
    expect(status.ok(), "deleting " + id, status);
    expected.records[kind.className].erase(id);
}

/** Checks that each record of this client is listed once, with its expected values. */
void LoadClient::enumerate(const LoadedKind& kind) {
    const auto answer = gate.manager().perform(Request::enumerateInstances(classPath(kind.className)));
    expect(answer.ok(), "enumerating", answer.status);
    const ExpectedState::Records& own = expected.records[kind.className];
    std::set<std::string> seen;
    for (const Instance& instance : answer.instances) {
        const std::string id = valueIn(instance, "InstanceID").value_or("(none)");
        expect(seen.insert(id).second, id + " is listed twice");
        const auto found = own.find(id);
        expect(found == own.end() || shows(kind, instance, found->second), "listed values of " + id);
    }
    for (const auto& [id, record] : own) {
        expect(seen.count(id) == 1, id + " is missing");
    }
}

/**
 * Follows the association of the first computer in both directions. Each request makes an up-call, since another
 * provider serves computers.
 */
void LoadClient::associate(const LoadedKind& kind) {
    expectRecordsOf(kind, "alpha", {firstNode});
    expectComputer(kind, firstNode, "alpha");
}

/** Creates and deletes the record of the second computer. */
void LoadClient::move(const LoadedKind& kind, int round) {
    create(kind, secondNode, round + 1, false);
    expectRecordsOf(kind, "beta", {secondNode});
    expectComputer(kind, secondNode, "beta");
    remove(kind, secondNode);
    expectRecordsOf(kind, "beta", {});
}

void LoadClient::expectRecordsOf(const LoadedKind& kind, const char* computer,
                                 const std::vector<std::string>& identifiers) {
    const auto names =
        gate.manager().perform(Request::associatorNames(computerPath(computer), {kind.setting, {}, {}, {}}));
    expect(names.ok() && identifiersOf(names.paths) == identifiers, std::string("records of ") + computer,
           names.status);
    const auto references =
        gate.manager().perform(Request::referenceNames(computerPath(computer), {{}, kind.setting, {}, {}}));
    expect(references.ok() && references.paths.size() == identifiers.size(), std::string("references of ") + computer,
           references.status);
}

void LoadClient::expectComputer(const LoadedKind& kind, const char* identifier, const std::string& computer) {
    const auto found =
        gate.manager().perform(Request::associators(keyedPath(kind.className, identifier), {kind.setting, {}, {}, {}}));
    const bool isIt = found.instances.size() == 1 && valueIn(found.instance(), "Name") == computer;
    expect(found.ok() && isIt, std::string("computer of ") + identifier, found.status);
}

void LoadClient::changeAsset(int round) {
    const auto& properties = loadedAssetProperties();
    if (static_cast<std::size_t>(number) >= properties.size()) {
        return;
    }
    const char* property = properties[static_cast<std::size_t>(number)];
    const std::string value = "client " + std::to_string(number) + " round " + std::to_string(round);
    const auto status = gate.modify(assetPath(), {named(property, text(value))});
    expect(status.ok(), std::string("changing ") + property, status);
    expected.asset[property] = value;
    const auto answer = gate.manager().perform(Request::getInstance(assetPath()));
    expect(answer.ok() && valueIn(answer.instance(), property) == value, std::string("reading ") + property,
           answer.status);
}

}  // namespace gatetest
