#include "GateModel.h"

#include <algorithm>
#include <iterator>

#include "Target.h"
#include "cim/DateTime.h"
#include "cim/Names.h"
#include "framework/PropertyText.h"
#include "support/AssetModel.h"

namespace fuzz {

namespace {

using cimhost::Operation;
using testsupport::AssetField;
using testsupport::AssetKind;
using testsupport::Form;
using testsupport::ModelRecord;
using testsupport::RecordModel;

constexpr const char* identifierName = "InstanceID";

/** The value that a client sends for a field; none if the client sends no value. */
std::optional<std::string> given(const Call& call, const testsupport::ModelField& field) {
    switch (field.form) {
        case Form::number:
            return givenNumber(call.request.instance, field.property);
        case Form::flag:
            return givenFlag(call.request.instance, field.property);
        default:
            return givenString(call.request.instance, field.property);
    }
}

/** The value that clients receive for a value of the asset file. */
std::string shownOf(const AssetField& field, const std::string& stored) {
    const bool isEmpty = field.kind == AssetKind::personalized && stored == "Null";  // the provider's empty value
    return isEmpty ? std::string() : stored;
}

/** The asset data by key of the file; absent values are empty. */
AssetValues assetValues() {
    const KO::PropertyText properties(dataFile("asset.dat").value_or(""));
    AssetValues values;
    for (const AssetField& field : testsupport::assetFields) {
        values[field.key] = shownOf(field, properties.get(field.key).value_or(""));
    }
    return values;
}

/** Removes from both ends characters that an object manager may remove: control characters, blanks, non-ASCII bytes. */
std::string trimmed(const std::string& value, bool alsoOutsideAscii) {
    const auto stays = [&](unsigned char each) { return each > ' ' && !(alsoOutsideAscii && each > 0x7F); };
    const auto begin = std::find_if(value.begin(), value.end(), stays);
    const auto end = std::find_if(value.rbegin(), std::make_reverse_iterator(begin), stays).base();
    return {begin, end};
}

/** Whether a sent value equals the stored value as the client received it, and is therefore not a change. */
bool isSentBack(const Call& call, const std::string& value, const std::string& stored) {
    return !stored.empty() && (trimmed(stored, false) == value ||
                               (!call.request.properties.has_value() && trimmed(stored, true) == value));
}

/** The records of a store. Replaces one of the two representations of no date, which clients cannot distinguish. */
Records recordsOf(const Store& store) {
    Records records = store.records();
    for (ModelRecord& record : records) {
        for (std::size_t index = 0; index < record.size(); ++index) {
            const bool isNoDate = store.fields()[index].form == Form::date && record[index] == cim::noDate;
            record[index] = isNoDate ? "" : record[index];
        }
    }
    return records;
}

/** Whether a valid call's values can be stored: records lose strings of one character, asset data lose intervals. */
bool canBeStored(const Call& call, bool isRecord) {
    const auto& values = call.request.instance.properties;
    return std::all_of(values.begin(), values.end(), [&](const cimhost::NamedValue& each) {
        const auto value = givenString(call.request.instance, each.name.string().c_str());
        return !value || (isRecord ? value->size() > 1 : value->find(':') == std::string::npos);
    });
}

/** The status that a valid call must have; none for other calls. */
std::optional<int> requiredStatus(const Call& call, const Snapshot& before) {
    const Store* store = storeOf(call.request.path.className);
    const bool isCreation = call.performs(Operation::createInstance);
    const bool hasValues = isCreation || call.performs(Operation::modifyInstance);
    if (!call.isValid || (hasValues && !canBeStored(call, store != nullptr))) {
        return std::nullopt;
    }
    if (store == nullptr) {
        const bool isPermitted = !isCreation && !call.performs(Operation::deleteInstance);
        return isPermitted ? CMPI_RC_OK : CMPI_RC_ERR_NOT_SUPPORTED;
    }
    if (call.request.operation <= Operation::enumerateInstanceNames) {
        return CMPI_RC_OK;
    }
    const Records& records = before.of(*store);
    const bool exists = std::any_of(records.begin(), records.end(), [&](const ModelRecord& record) {
        return record.front() == keyString(call.request.path, identifierName);
    });
    if (exists == isCreation) {
        return isCreation ? CMPI_RC_ERR_ALREADY_EXISTS : CMPI_RC_ERR_NOT_FOUND;
    }
    return CMPI_RC_OK;
}

void requireFileHolds(const Store& store, const Records& records) {
    RecordModel model(store.fields());
    model.records = records;
    requireSame(dataFile(store.fileName).value_or("0\n"), model.written(), store.fileName);
    requireSame<std::size_t>(store.count(), records.size(), "count of records");
}

void applyGiven(const RecordModel& model, const Call& call, ModelRecord& record, bool byList) {
    for (std::size_t index = 1; index < model.fields.size(); ++index) {
        const testsupport::ModelField& field = model.fields[index];
        const auto value = given(call, field);
        if (value && (!byList || isListed(call, field.property))) {
            record[index] = *value;
        }
    }
}

void requireCreated(const Store& store, const Call& call, const cimhost::ProviderResponse& response, Records expected,
                    const Records& after) {
    const auto paths = cimhost::eventsOf<cimhost::ObjectPath>(response.events);
    require(paths.size() == 1 && response.doneCount() == 1, "a creation returns a path");
    const auto identifier = keyString(paths.front(), identifierName);
    require(identifier && !identifier->empty(), "a new record has an identifier");
    require(keyString(call.request.path, identifierName).value_or("").empty() ||
                keyString(call.request.path, identifierName) == identifier,
            "the identifier is the path's");
    RecordModel model(store.fields());
    model.records = std::move(expected);
    require(model.find(*identifier) == nullptr, "an existing record is not created again");
    ModelRecord record = model.newRecord(*identifier);
    applyGiven(model, call, record, false);
    model.records.push_back(std::move(record));
    require(after == model.records, "the new record, with its values, is the only change");
}

void requireModified(const Store& store, const Call& call, Records expected, const Records& after) {
    RecordModel model(store.fields());
    model.records = std::move(expected);
    ModelRecord* record = model.find(keyString(call.request.path, identifierName).value_or(""));
    require(record != nullptr, "the modified record exists");
    applyGiven(model, call, *record, true);
    require(after == model.records, "the record has the sent values, and nothing else is changed");
}

void requireRemoved(const Call& call, Records expected, const Records& after) {
    const auto identifier = keyString(call.request.path, identifierName);
    const auto found = std::find_if(expected.begin(), expected.end(),
                                    [&](const ModelRecord& record) { return record.front() == identifier; });
    require(found != expected.end(), "the deleted record existed");
    expected.erase(found);
    require(after == expected, "only the record is deleted");
}

void requireAsset(const Call& call, const AssetValues& before, const AssetValues& after) {
    require(call.performs(Operation::modifyInstance), "asset data can only be modified");
    for (const AssetField& field : testsupport::assetFields) {
        const std::string& stored = before.at(field.key);
        const auto value = givenString(call.request.instance, field.property);
        const bool isChange = value && field.kind != AssetKind::readOnly && isListed(call, field.property) &&
                              !isSentBack(call, *value, stored);
        requireSame(after.at(field.key), isChange ? shownOf(field, field.kept(*value)) : stored, field.key);
    }
}

void requireChange(const Call& call, const cimhost::ProviderResponse& response, const Snapshot& before,
                   const Snapshot& after) {
    const Store* store = storeOf(call.request.path.className);
    if (store == nullptr) {
        require(cim::sameName(call.request.path.className, "VELKO_AssetIDDetails"), "only some classes can be changed");
        require(before.leases == after.leases && before.warranties == after.warranties, "records are unchanged");
        return requireAsset(call, before.asset, after.asset);
    }
    const Store& other = store == &leaseStore() ? warrantyStore() : leaseStore();
    require(before.of(other) == after.of(other) && before.asset == after.asset, "other classes are unchanged");
    if (call.performs(Operation::createInstance)) {
        requireCreated(*store, call, response, before.of(*store), after.of(*store));
    } else if (call.performs(Operation::modifyInstance)) {
        requireModified(*store, call, before.of(*store), after.of(*store));
    } else {
        requireRemoved(call, before.of(*store), after.of(*store));
    }
}

std::vector<std::vector<std::string>> shown(const RecordModel& model, const Call& call,
                                            const cimhost::ProviderResponse& response) {
    std::vector<std::vector<std::string>> all;
    for (const auto& instance : cimhost::eventsOf<cimhost::Instance>(response.events)) {
        all.push_back(model.shownFields(instance));
    }
    for (const auto& path : cimhost::eventsOf<cimhost::ObjectPath>(response.events)) {
        ModelRecord record = model.newRecord(keyString(path, identifierName).value_or(""));
        all.push_back(shownRecord(model, call, record));
    }
    return all;
}

/** Enumerations and gets of records return the stored records. */
void requireReading(const Call& call, const cimhost::ProviderResponse& response, const Snapshot& stored) {
    const Store* store = storeOf(call.request.path.className);
    if (store == nullptr || !call.isRead()) {
        return;
    }
    const RecordModel model(store->fields());
    const auto identifier = keyString(call.request.path, identifierName);
    std::vector<std::vector<std::string>> expected;
    for (const ModelRecord& record : stored.of(*store)) {
        if (!call.performs(Operation::getInstance) || record.front() == identifier) {
            expected.push_back(shownRecord(model, call, record));
        }
    }
    const bool isMissing = call.performs(Operation::getInstance) && expected.empty();
    require((response.status.rc == CMPI_RC_OK) == !isMissing, "an existing record can be read");
    require(shown(model, call, response) == expected, "the response has the instances");
}

}  // namespace

bool isListed(const Call& call, const std::string& property) {
    return !call.request.properties ||
           std::any_of(call.request.properties->begin(), call.request.properties->end(),
                       [&](const std::string& each) { return cim::sameName(each, property); });
}

std::vector<std::string> shownRecord(const RecordModel& model, const Call& call, const ModelRecord& record) {
    std::vector<std::string> values = model.shown(record);
    for (std::size_t index = 1; index < values.size(); ++index) {
        const char* name = model.fields[index].property;
        if (call.performs(Operation::enumerateInstanceNames) || !isListed(call, name)) {
            values[index] = std::string(name) + "=";
        }
    }
    return values;
}

Snapshot::Snapshot() : leases(recordsOf(leaseStore())), warranties(recordsOf(warrantyStore())), asset(assetValues()) {}

void requireRight(const Call& call, const cimhost::ProviderResponse& response, const Snapshot& before) {
    const Snapshot after;
    require(!response.threw, "the gate does not throw: " + response.status.message);
    require(response.hasMessage == (response.status.rc != CMPI_RC_OK), "only a status other than OK has a message");
    require(response.doneCount() <= 1, "returnDone is called at most once");
    if (response.status.rc != CMPI_RC_OK) {
        require(response.events.empty(), "a failure has no results");
    }
    if (const auto status = requiredStatus(call, before)) {
        requireSame(response.status.rc, *status, "status");
    }
    if (response.status.rc == CMPI_RC_OK && call.isChange()) {
        requireChange(call, response, before, after);
    } else {
        require(before == after, "only a change that returns OK changes data");
    }
    requireReading(call, response, after);
    requireFileHolds(leaseStore(), after.leases);
    requireFileHolds(warrantyStore(), after.warranties);
}

Call harmlessRead() {
    Call call;
    call.request.operation = Operation::enumerateInstanceNames;
    call.request.path.nameSpace = "root/cimv2";
    call.request.path.className = "VELKO_OstrelAgent";
    return call;
}

}  // namespace fuzz
