#include "ProviderModel.h"
#include "Target.h"

#include "cim/Names.h"
#include "framework/PropertyText.h"
#include "model/Request.h"
#include "schema/MofWriter.h"
#include "support/AssetModel.h"
#include "support/Values.h"

#include <algorithm>
#include <iterator>
#include <map>
#include <string>

// Sequences of calls through the gate's function tables: what is answered OK was done as the standard says and
// survives a restart, what is answered otherwise has a message and has changed nothing.

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
using cim::sameName;
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
    return !call.properties || std::any_of(call.properties->begin(), call.properties->end(),
                                           [&](const std::string& each) { return cim::sameName(each, property); });
}

/** A value that a client gives for a field; none where it gives none. */
std::optional<std::string> given(const Call& call, const testsupport::ModelField& field) {
    switch (field.form) {
        case Form::number:
            return givenNumber(*call.instance, field.property);
        case Form::flag:
            return givenFlag(*call.instance, field.property);
        default:
            return givenText(*call.instance, field.property);
    }
}

/** What clients see of a value of the asset file. */
std::string shownOf(const AssetField& field, const std::string& kept) {
    const bool isEmpty = field.kind == AssetKind::personalized && kept == "Null";  // the provider's word for it
    return isEmpty ? std::string() : kept;
}

/** The values of asset data, by the file's key; absent ones are empty. */
AssetValues assetValues() {
    const KO::PropertyText properties(dataFile("asset.dat").value_or(""));
    AssetValues values;
    for (const AssetField& field : testsupport::assetFields) {
        values[field.key] = shownOf(field, properties.get(field.key).value_or(""));
    }
    return values;
}

/** A text without what an object manager may take off its ends: blanks, or also what is outside of ASCII. */
std::string trimmed(const std::string& text, bool alsoOutsideAscii) {
    const auto stays = [&](unsigned char each) { return each > ' ' && !(alsoOutsideAscii && each > 0x7F); };
    const auto begin = std::find_if(text.begin(), text.end(), stays);
    const auto end = std::find_if(text.rbegin(), std::make_reverse_iterator(begin), stays).base();
    return {begin, end};
}

/** Whether a given text is the one that is there, as it comes back to the gate, and no change. */
bool isSentBack(const Call& call, const std::string& text, const std::string& there) {
    return !there.empty() &&
           (trimmed(there, false) == text || (!call.properties.has_value() && trimmed(there, true) == text));
}

/** The records of a store. That there is no date is kept in two ways, of which clients see one. */
Records recordsOf(const Store& store) {
    Records records = store.records();
    for (ModelRecord& record : records) {
        for (std::size_t index = 0; index < record.size(); ++index) {
            const bool isNoDate =
                store.fields()[index].form == Form::date && record[index] == "00000000000000.000000-000";
            record[index] = isNoDate ? "" : record[index];
        }
    }
    return records;
}

/** All that is kept, before and after a call. */
struct Kept {
    Records leases = recordsOf(leaseStore());
    Records warranties = recordsOf(warrantyStore());
    AssetValues asset = assetValues();

    const Records& of(const Store& store) const { return &store == &leaseStore() ? leases : warranties; }

    bool operator==(const Kept& other) const {
        return leases == other.leases && warranties == other.warranties && asset == other.asset;
    }
};

/** Whether what an apt call gives comes back: in records no text of one character does, in asset data no interval. */
bool canBeKept(const Call& call, bool isRecord) {
    const auto& values = call.instance->properties;
    return std::all_of(values.begin(), values.end(), [&](const cimhost::NamedValue& each) {
        const auto text = givenText(*call.instance, each.name.c_str());
        return !text || (isRecord ? text->size() > 1 : text->find(':') == std::string::npos);
    });
}

/** Whether nothing stands in the way of a call: what it is for is there, or not yet, and its values can be kept. */
bool mustSucceed(const Call& call, const Kept& before) {
    const Store* store = storeOf(call.path.className);
    const bool isCreation = call.action == Action::createInstance;
    const bool givesValues = isCreation || call.action == Action::modifyInstance;
    if (!call.isApt || (givesValues && !canBeKept(call, store != nullptr))) {
        return false;
    }
    if (store == nullptr) {
        return !isCreation && call.action != Action::deleteInstance;
    }
    const Records& records = before.of(*store);
    const bool isThere = std::any_of(records.begin(), records.end(), [&](const ModelRecord& record) {
        return record.front() == keyText(call.path, identifierName);
    });
    return call.action <= Action::enumerateInstanceNames || isThere != isCreation;
}

void requireFileHolds(const Store& store, const Records& records) {
    RecordModel model(store.fields());
    model.records = records;
    requireSame(dataFile(store.fileName).value_or("0\n"), model.written(), store.fileName);
    requireSame<std::size_t>(store.count(), records.size(), "count of records");
}

/** The gate over the provider, and what is kept behind it. */
class Trial {
public:
    explicit Trial(Bytes& bytes) : subject(bytes.byte()) {}

    void make(const Call& call) {
        const Kept before;
        const cimhost::ProviderResponse answer = subject.make(call);
        try {
            requireRight(call, answer, before);
        } catch (const Violation& violation) {
            throw Violation(violation.what() + ("\nafter " + toText(call)) + answer.status.message);
        }
    }

private:
    static void requireRight(const Call& call, const cimhost::ProviderResponse& answer, const Kept& before) {
        const Kept after;
        require(!answer.threw, "no exception leaves the gate: " + answer.status.message);
        require(answer.hasMessage == (answer.status.rc != CMPI_RC_OK), "a status but OK has a message");
        require(answer.doneCount() <= 1, "an answer is ended once at most");
        if (answer.status.rc != CMPI_RC_OK) {
            require(answer.events.empty(), "a failure gives no part of an answer");
            require(!mustSucceed(call, before), "what can be done is done");
        }
        if (answer.status.rc == CMPI_RC_OK && isChange(call.action)) {
            requireChange(call, answer, before, after);
        } else {
            require(before == after, "only a change that was answered OK changes anything");
        }
        requireReading(call, answer, after);
        requireFileHolds(leaseStore(), after.leases);
        requireFileHolds(warrantyStore(), after.warranties);
    }

    static bool isChange(Action action) {
        return action == Action::createInstance || action == Action::modifyInstance || action == Action::deleteInstance;
    }

    static void requireChange(const Call& call, const cimhost::ProviderResponse& answer, const Kept& before,
                              const Kept& after) {
        const Store* store = storeOf(call.path.className);
        if (store == nullptr) {
            require(cim::sameName(call.path.className, "VELKO_AssetIDDetails"), "only some classes can be changed");
            require(before.leases == after.leases && before.warranties == after.warranties, "records stay");
            return requireAsset(call, before.asset, after.asset);
        }
        const Store& other = store == &leaseStore() ? warrantyStore() : leaseStore();
        require(before.of(other) == after.of(other) && before.asset == after.asset, "other classes stay");
        if (call.action == Action::createInstance) {
            requireCreated(*store, call, answer, before.of(*store), after.of(*store));
        } else if (call.action == Action::modifyInstance) {
            requireModified(*store, call, before.of(*store), after.of(*store));
        } else {
            requireRemoved(call, before.of(*store), after.of(*store));
        }
    }

    static void requireCreated(const Store& store, const Call& call, const cimhost::ProviderResponse& answer,
                               Records expected, const Records& after) {
        const auto paths = cimhost::eventsOf<cimhost::ObjectPath>(answer.events);
        require(paths.size() == 1 && answer.doneCount() == 1, "a creation answers a path");
        const auto identifier = keyText(paths.front(), identifierName);
        require(identifier && !identifier->empty(), "a new record has an identifier");
        require(
            keyText(call.path, identifierName).value_or("").empty() || keyText(call.path, identifierName) == identifier,
            "the identifier is the path's");
        RecordModel model(store.fields());
        model.records = std::move(expected);
        require(model.find(*identifier) == nullptr, "what is there already is not created");
        ModelRecord record = model.newRecord(*identifier);
        applyGiven(model, call, record, false);
        model.records.push_back(std::move(record));
        require(after == model.records, "the new record, with its values, is all that is new");
    }

    static void requireModified(const Store& store, const Call& call, Records expected, const Records& after) {
        RecordModel model(store.fields());
        model.records = std::move(expected);
        ModelRecord* record = model.find(keyText(call.path, identifierName).value_or(""));
        require(record != nullptr, "what is changed is there");
        applyGiven(model, call, *record, true);
        require(after == model.records, "the record has the values that were given, and nothing else is changed");
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
        const auto identifier = keyText(call.path, identifierName);
        const auto found = std::find_if(expected.begin(), expected.end(),
                                        [&](const ModelRecord& record) { return record.front() == identifier; });
        require(found != expected.end(), "what is deleted was there");
        expected.erase(found);
        require(after == expected, "the record, and nothing else, is deleted");
    }

    static void requireAsset(const Call& call, const AssetValues& before, const AssetValues& after) {
        require(call.action == Action::modifyInstance, "asset data can only be modified");
        for (const AssetField& field : testsupport::assetFields) {
            const std::string& there = before.at(field.key);
            const auto value = givenText(*call.instance, field.property);
            const bool isChange = value && field.kind != AssetKind::readOnly && isListed(call, field.property) &&
                                  !isSentBack(call, *value, there);
            requireSame(after.at(field.key), isChange ? shownOf(field, field.kept(*value)) : there, field.key);
        }
    }

    /** Enumerations and gets of records give what there is. */
    static void requireReading(const Call& call, const cimhost::ProviderResponse& answer, const Kept& kept) {
        const Store* store = storeOf(call.path.className);
        if (store == nullptr || call.action > Action::getInstance) {
            return;
        }
        const RecordModel model(store->fields());
        const auto identifier = keyText(call.path, identifierName);
        std::vector<std::vector<std::string>> expected;
        for (const ModelRecord& record : kept.of(*store)) {
            if (call.action != Action::getInstance || record.front() == identifier) {
                expected.push_back(shown(model, call, record));
            }
        }
        const bool isMissing = call.action == Action::getInstance && expected.empty();
        require((answer.status.rc == CMPI_RC_OK) == !isMissing, "what is there can be read");
        require(shown(model, call, answer) == expected, "the answer has the instances");
    }

    /** What an answer shows of a record: the identifier, and what the property list lets through. */
    static std::vector<std::string> shown(const RecordModel& model, const Call& call, const ModelRecord& record) {
        std::vector<std::string> values = model.shown(record);
        for (std::size_t index = 1; index < values.size(); ++index) {
            const char* name = model.fields[index].property;
            if (call.action == Action::enumerateInstanceNames || !isListed(call, name)) {
                values[index] = std::string(name) + "=";
            }
        }
        return values;
    }

    static std::vector<std::vector<std::string>> shown(const RecordModel& model, const Call& call,
                                                       const cimhost::ProviderResponse& answer) {
        std::vector<std::vector<std::string>> all;
        for (const auto& instance : cimhost::eventsOf<cimhost::Instance>(answer.events)) {
            all.push_back(model.shownFields(instance));
        }
        for (const auto& path : cimhost::eventsOf<cimhost::ObjectPath>(answer.events)) {
            ModelRecord record = model.newRecord(keyText(path, identifierName).value_or(""));
            all.push_back(shown(model, call, record));
        }
        return all;
    }

    Subject subject;
};

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Bytes bytes(data, size);
    Trial trial(bytes);
    for (std::size_t calls = 0; calls < mostCalls && !bytes.isUsedUp(); ++calls) {
        trial.make(nextCall(bytes));
    }
    return 0;
}
