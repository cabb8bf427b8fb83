#include <algorithm>
#include <iterator>
#include <map>
#include <string>

#include "ProviderModel.h"
#include "Target.h"
#include "cim/DateTime.h"
#include "cim/Names.h"
#include "framework/PropertyText.h"
#include "model/Request.h"
#include "schema/MofWriter.h"
#include "support/AssetModel.h"
#include "support/Values.h"

// Sequences of calls of the gate's function tables: a call that returns OK has the effect that CIM defines, and
// survives a restart; any other call has a message and changes nothing.

extern "C" {
CMPIInstanceMI* LeaseAndWarrantyGate_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
CMPIAssociationMI* LeaseAndWarrantyGate_Create_AssociationMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
}

fuzz::Interfaces fuzz::openInterfaces(const CMPIBroker* broker) {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    return {LeaseAndWarrantyGate_Create_InstanceMI(broker, nullptr, &status),
            LeaseAndWarrantyGate_Create_AssociationMI(broker, nullptr, &status)};
}

namespace {

using namespace fuzz;
using cimhost::Operation;
using testsupport::AssetField;
using testsupport::AssetKind;
using testsupport::Form;
using testsupport::ModelRecord;
using testsupport::RecordModel;
using Records = std::vector<ModelRecord>;
using AssetValues = std::map<std::string, std::string>;

constexpr std::size_t mostCalls = 30;
constexpr const char* identifierName = "InstanceID";

bool isListed(const Call& call, const char* property) {
    return !call.request.properties ||
           std::any_of(call.request.properties->begin(), call.request.properties->end(),
                       [&](const std::string& each) { return cim::sameName(each, property); });
}

/** The value that a client sends for a field; none if it does not. */
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

/** Removes the characters from both ends that an object manager may remove: blanks, and possibly non-ASCII bytes. */
std::string trimmed(const std::string& value, bool alsoOutsideAscii) {
    const auto stays = [&](unsigned char each) { return each > ' ' && !(alsoOutsideAscii && each > 0x7F); };
    const auto begin = std::find_if(value.begin(), value.end(), stays);
    const auto end = std::find_if(value.rbegin(), std::make_reverse_iterator(begin), stays).base();
    return {begin, end};
}

/** Whether a sent value is the stored one, as the client received it, and therefore not a change. */
bool isSentBack(const Call& call, const std::string& value, const std::string& stored) {
    return !stored.empty() && (trimmed(stored, false) == value ||
                               (!call.request.properties.has_value() && trimmed(stored, true) == value));
}

/** The records of a store. There are two representations of no date, which clients cannot distinguish. */
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

/** All stored data, before or after a call. */
struct Snapshot {
    Records leases = recordsOf(leaseStore());
    Records warranties = recordsOf(warrantyStore());
    AssetValues asset = assetValues();

    const Records& of(const Store& store) const { return &store == &leaseStore() ? leases : warranties; }

    bool operator==(const Snapshot& other) const {
        return leases == other.leases && warranties == other.warranties && asset == other.asset;
    }
};

/** Whether the values of a valid call can be stored: records lose strings of one character, asset data intervals. */
bool canBeStored(const Call& call, bool isRecord) {
    const auto& values = call.request.instance.properties;
    return std::all_of(values.begin(), values.end(), [&](const cimhost::NamedValue& each) {
        const auto value = givenString(call.request.instance, each.name.string().c_str());
        return !value || (isRecord ? value->size() > 1 : value->find(':') == std::string::npos);
    });
}

/** Whether a call must succeed: its instance exists, or does not exist yet, and its values can be stored. */
bool mustSucceed(const Call& call, const Snapshot& before) {
    const Store* store = storeOf(call.request.path.className);
    const bool isCreation = call.performs(Operation::createInstance);
    const bool hasValues = isCreation || call.performs(Operation::modifyInstance);
    if (!call.isValid || (hasValues && !canBeStored(call, store != nullptr))) {
        return false;
    }
    if (store == nullptr) {
        return !isCreation && !call.performs(Operation::deleteInstance);
    }
    const Records& records = before.of(*store);
    const bool exists = std::any_of(records.begin(), records.end(), [&](const ModelRecord& record) {
        return record.front() == keyString(call.request.path, identifierName);
    });
    return call.request.operation <= Operation::enumerateInstanceNames || exists != isCreation;
}

void requireFileHolds(const Store& store, const Records& records) {
    RecordModel model(store.fields());
    model.records = records;
    requireSame(dataFile(store.fileName).value_or("0\n"), model.written(), store.fileName);
    requireSame<std::size_t>(store.count(), records.size(), "count of records");
}

/** A sequence of calls of the gate. */
class TestCase {
public:
    explicit TestCase(Bytes& bytes) : gate(bytes.byte()) {}

    void perform(const Call& call) {
        const Snapshot before;
        const cimhost::ProviderResponse response = gate.perform(call);
        if (call.isChange() && response.status.rc != CMPI_RC_OK) {
            gate.perform(anyRead());  // before it, the gate loads a provider again whose change was rolled back
        }
        try {
            requireRight(call, response, before);
        } catch (const Violation& violation) {
            throw Violation(violation.what() + ("\nafter " + describe(call)) + response.status.message);
        }
    }

private:
    static Call anyRead() {
        Call call;
        call.request.operation = Operation::enumerateInstanceNames;
        call.request.path.nameSpace = "root/cimv2";
        call.request.path.className = "VELKO_OstrelAgent";
        return call;
    }

    static void requireRight(const Call& call, const cimhost::ProviderResponse& response, const Snapshot& before) {
        const Snapshot after;
        require(!response.threw, "the gate does not throw: " + response.status.message);
        require(response.hasMessage == (response.status.rc != CMPI_RC_OK), "only a status other than OK has a message");
        require(response.doneCount() <= 1, "returnDone is called at most once");
        if (response.status.rc != CMPI_RC_OK) {
            require(response.events.empty(), "a failure has no results");
            require(!mustSucceed(call, before), "a valid request succeeds");
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

    static void requireChange(const Call& call, const cimhost::ProviderResponse& response, const Snapshot& before,
                              const Snapshot& after) {
        const Store* store = storeOf(call.request.path.className);
        if (store == nullptr) {
            require(cim::sameName(call.request.path.className, "VELKO_AssetIDDetails"),
                    "only some classes can be changed");
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

    static void requireCreated(const Store& store, const Call& call, const cimhost::ProviderResponse& response,
                               Records expected, const Records& after) {
        const auto paths = cimhost::eventsOf<cimhost::ObjectPath>(response.events);
        require(paths.size() == 1 && response.doneCount() == 1, "a creation returns a path");
        const auto identifier = keyString(paths.front(), identifierName);
        require(identifier && !identifier->empty(), "a new record has an identifier");
        require(keyString(call.request.path, identifierName).value_or("").empty() ||
                    keyString(call.request.path, identifierName) == identifier,
                "the identifier is the path's");
        RecordModel model(store.fields());
        model.records = std::move(expected);
        require(model.find(*identifier) == nullptr, "what is there already is not created");
        ModelRecord record = model.newRecord(*identifier);
        applyGiven(model, call, record, false);
        model.records.push_back(std::move(record));
        require(after == model.records, "the new record, with its values, is the only change");
    }

    static void requireModified(const Store& store, const Call& call, Records expected, const Records& after) {
        RecordModel model(store.fields());
        model.records = std::move(expected);
        ModelRecord* record = model.find(keyString(call.request.path, identifierName).value_or(""));
        require(record != nullptr, "the modified record exists");
        applyGiven(model, call, *record, true);
        require(after == model.records, "the record has the sent values, and nothing else is changed");
    }

    static void applyGiven(const RecordModel& model, const Call& call, ModelRecord& record, bool byList) {
        for (std::size_t index = 1; index < model.fields.size(); ++index) {
            const testsupport::ModelField& field = model.fields[index];
            const auto value = given(call, field);
            if (value && (!byList || isListed(call, field.property))) {
                record[index] = *value;
            }
        }
    }

    static void requireRemoved(const Call& call, Records expected, const Records& after) {
        const auto identifier = keyString(call.request.path, identifierName);
        const auto found = std::find_if(expected.begin(), expected.end(),
                                        [&](const ModelRecord& record) { return record.front() == identifier; });
        require(found != expected.end(), "the deleted record existed");
        expected.erase(found);
        require(after == expected, "only the record is deleted");
    }

    static void requireAsset(const Call& call, const AssetValues& before, const AssetValues& after) {
        require(call.performs(Operation::modifyInstance), "asset data can only be modified");
        for (const AssetField& field : testsupport::assetFields) {
            const std::string& stored = before.at(field.key);
            const auto value = givenString(call.request.instance, field.property);
            const bool isChange = value && field.kind != AssetKind::readOnly && isListed(call, field.property) &&
                                  !isSentBack(call, *value, stored);
            requireSame(after.at(field.key), isChange ? shownOf(field, field.kept(*value)) : stored, field.key);
        }
    }

    /** Enumerations and gets of records return the stored records. */
    static void requireReading(const Call& call, const cimhost::ProviderResponse& response, const Snapshot& stored) {
        const Store* store = storeOf(call.request.path.className);
        if (store == nullptr || !call.isRead()) {
            return;
        }
        const RecordModel model(store->fields());
        const auto identifier = keyString(call.request.path, identifierName);
        std::vector<std::vector<std::string>> expected;
        for (const ModelRecord& record : stored.of(*store)) {
            if (!call.performs(Operation::getInstance) || record.front() == identifier) {
                expected.push_back(shown(model, call, record));
            }
        }
        const bool isMissing = call.performs(Operation::getInstance) && expected.empty();
        require((response.status.rc == CMPI_RC_OK) == !isMissing, "an existing record can be read");
        require(shown(model, call, response) == expected, "the response has the instances");
    }

    /** The values of a record that a response must have: the identifier, and the listed properties. */
    static std::vector<std::string> shown(const RecordModel& model, const Call& call, const ModelRecord& record) {
        std::vector<std::string> values = model.shown(record);
        for (std::size_t index = 1; index < values.size(); ++index) {
            const char* name = model.fields[index].property;
            if (call.performs(Operation::enumerateInstanceNames) || !isListed(call, name)) {
                values[index] = std::string(name) + "=";
            }
        }
        return values;
    }

    static std::vector<std::vector<std::string>> shown(const RecordModel& model, const Call& call,
                                                       const cimhost::ProviderResponse& response) {
        std::vector<std::vector<std::string>> all;
        for (const auto& instance : cimhost::eventsOf<cimhost::Instance>(response.events)) {
            all.push_back(model.shownFields(instance));
        }
        for (const auto& path : cimhost::eventsOf<cimhost::ObjectPath>(response.events)) {
            ModelRecord record = model.newRecord(keyString(path, identifierName).value_or(""));
            all.push_back(shown(model, call, record));
        }
        return all;
    }

    SystemUnderTest gate;
};

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Bytes bytes(data, size);
    TestCase test(bytes);
    for (std::size_t calls = 0; calls < mostCalls && !bytes.isAtEnd(); ++calls) {
        test.perform(nextCall(bytes));
    }
    return 0;
}
