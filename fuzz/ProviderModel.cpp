#include "ProviderModel.h"

#include "Target.h"

#include "cim/Names.h"
#include "framework/PropertyText.h"
#include "support/AssetModel.h"

#include <algorithm>
#include <limits>

namespace fuzz {

namespace {

using cimhost::Instance;
using cimhost::NamedValue;
using cimhost::Value;
using testsupport::AssetKind;
using testsupport::Form;
using testsupport::ModelRecord;

const Value* valueNamed(const std::vector<NamedValue>& values, const char* name) {
    const auto found = std::find_if(values.begin(), values.end(),
                                    [&](const NamedValue& each) { return cim::sameName(each.name, name); });
    return found == values.end() ? nullptr : &found->value;
}

/** The one element of a value that is there and no array. */
const cimhost::Scalar* scalarOf(const std::vector<NamedValue>& values, const char* name) {
    const Value* value = valueNamed(values, name);
    return value == nullptr || value->isNull || value->isArray ? nullptr : &value->elements.front();
}

struct AsNumber {
    template <class Other>
    std::optional<std::string> operator()(const Other& value) const {
        if constexpr (std::is_integral_v<Other> && !std::is_same_v<Other, bool>) {
            constexpr auto largest = std::numeric_limits<std::uint32_t>::max();
            const bool fits = value >= 0 && static_cast<std::uint64_t>(value) <= largest;
            return fits ? std::optional<std::string>(std::to_string(value)) : std::nullopt;
        } else {
            return std::nullopt;
        }
    }
};

struct AssetKey {
    const char* name;
    const char* value;
};

constexpr AssetKey assetPath[] = {
    {"Name", "testhost"}, {"IdentifyingNumber", "/system"}, {"Vendor", "Example Maker"}, {"Version", "4.2.0"}};

bool isAssetPath(const cimhost::ObjectPath& path) {
    return std::all_of(std::begin(assetPath), std::end(assetPath),
                       [&](const AssetKey& key) { return keyText(path, key.name).value_or(key.value) == key.value; });
}

}  // namespace

std::optional<std::string> keyText(const cimhost::ObjectPath& path, const char* name) {
    const auto* scalar = scalarOf(path.keys, name);
    const auto* text = scalar == nullptr ? nullptr : std::get_if<std::string>(scalar);
    return text == nullptr ? std::nullopt : std::optional<std::string>(*text);
}

std::optional<std::string> givenText(const Instance& instance, const char* name) {
    const auto* scalar = scalarOf(instance.properties, name);
    if (scalar == nullptr) {
        return std::nullopt;
    }
    if (const auto* date = std::get_if<cimhost::DateTime>(scalar)) {
        return date->value;
    }
    const auto* text = std::get_if<std::string>(scalar);
    return text == nullptr ? std::nullopt : std::optional<std::string>(*text);
}

std::optional<std::string> givenNumber(const Instance& instance, const char* name) {
    const auto* scalar = scalarOf(instance.properties, name);
    return scalar == nullptr ? std::nullopt : std::visit(AsNumber{}, *scalar);
}

std::optional<std::string> givenFlag(const Instance& instance, const char* name) {
    const auto* scalar = scalarOf(instance.properties, name);
    const bool* flag = scalar == nullptr ? nullptr : std::get_if<bool>(scalar);
    return flag == nullptr ? std::nullopt : std::optional<std::string>(*flag ? "1" : "0");
}

/** A path whose key cannot be read stands for all records. */
std::vector<ModelRecord*> RecordSide::selected(const cimhost::ObjectPath& path) {
    const auto identifier = keyText(path, "InstanceID");
    std::vector<ModelRecord*> found;
    for (ModelRecord& record : model.records) {
        if (!identifier || record.front() == *identifier) {
            found.push_back(&record);
        }
    }
    return found;
}

void RecordSide::write() {
    file = model.written();
}

Expectation RecordSide::apply(const Call& call) {
    switch (call.action) {
        case Action::createInstance:
            return create(call);
        case Action::modifyInstance:
            return modify(call);
        case Action::deleteInstance:
            return remove(call);
        default:
            return read(call);
    }
}

Expectation RecordSide::read(const Call& call) {
    Expectation expected{CMPI_RC_OK, 1};
    for (const ModelRecord* record : selected(call.path)) {
        auto shown = model.shown(*record);
        if (call.action == Action::enumerateInstanceNames) {
            shown.resize(1);
        }
        expected.shown.push_back(std::move(shown));
    }
    return expected;
}

/** Only the path's key counts. What exists breaks the answer off. */
Expectation RecordSide::create(const Call& call) {
    const auto identifier = keyText(call.path, "InstanceID");
    if (!identifier) {
        return {CMPI_RC_OK, 1};
    }
    if (model.find(*identifier) != nullptr) {
        return {};
    }
    model.records.push_back(model.newRecord(*identifier));
    write();
    return {CMPI_RC_OK, 1, true, {model.shown(model.records.back())}};
}

bool RecordSide::change(ModelRecord& record, const Instance& instance) const {
    bool isChanged = false;
    for (std::size_t index = 1; index < model.fields.size(); ++index) {
        const testsupport::ModelField& field = model.fields[index];
        const auto take = field.form == Form::number ? givenNumber : field.form == Form::flag ? givenFlag : givenText;
        if (const auto value = take(instance, field.property)) {
            record[index] = *value;
            isChanged = true;
        }
    }
    return isChanged;
}

/** The first record that the path selects is changed, and nothing is answered. */
Expectation RecordSide::modify(const Call& call) {
    const auto targets = selected(call.path);
    if (call.instance && !targets.empty() && change(*targets.front(), *call.instance)) {
        write();
    }
    return {};
}

/** Without a key that can be read nothing is deleted. */
Expectation RecordSide::remove(const Call& call) {
    const auto identifier = keyText(call.path, "InstanceID");
    if (identifier && model.remove(*identifier)) {
        write();
    }
    return {};
}

void RecordSide::restart() {
    model.read(file.value_or(""));
}

void RecordSide::replaceFile(const std::string& content) {
    writeDataFile(store.fileName, content);
    file = content;
}

void RecordSide::requireAgreement() const {
    require(dataFile(store.fileName) == file, std::string(store.fileName) + " is as it was written last\nfound:\n" +
                                                  dataFile(store.fileName).value_or("(none)") + "\nexpected:\n" +
                                                  file.value_or("(none)"));
    require(store.records() == model.records, std::string(store.className) + ": the table has the records");
    require(store.count() == model.records.size(), std::string(store.className) + ": the count is the records'");
}

void AssetSide::modify(const Instance& instance) {
    std::string before;  // the personalized value before, which the next repeats where it is not given
    for (const testsupport::AssetField& field : testsupport::assetFields) {
        const auto given = givenText(instance, field.property);
        if (field.kind == AssetKind::personalized) {
            before = given.value_or(field.isFirst() ? std::string() : before);
            values[field.key] = before;
        } else if (given && field.kind != AssetKind::readOnly) {
            values[field.key] = field.kept(*given);
        } else {
            values.emplace(field.key, "");
        }
    }
}

/** Every request that comes so far makes the file; a modification does not look whether the path selects anything. */
Expectation AssetSide::apply(const Call& call) {
    exists = true;
    if (call.action == Action::modifyInstance) {
        if (call.instance) {
            modify(*call.instance);
        }
        return {};
    }
    Expectation expected{CMPI_RC_OK, 1};
    if (isAssetPath(call.path)) {
        expected.shown.push_back(call.action == Action::enumerateInstanceNames ? std::vector<std::string>() : shown());
    }
    return expected;
}

std::vector<std::string> AssetSide::shown() const {
    std::vector<std::string> all;
    for (const testsupport::AssetField& field : testsupport::assetFields) {
        const auto value = values.find(field.key);
        all.push_back(testsupport::shownValue(field, value == values.end() ? "" : value->second));
    }
    return all;
}

void AssetSide::requireAgreement() const {
    const auto content = dataFile("asset.dat");
    require(content.has_value() == exists, "asset.dat is there once it was asked for");
    const KO::PropertyText found(content.value_or(""));
    for (const auto& [key, value] : values) {
        requireSame(found.get(key).value_or("(none)"), value, key);
    }
    const std::string text = content.value_or("");
    const auto lines = static_cast<std::size_t>(std::count(text.begin(), text.end(), '\n'));
    requireSame(lines, values.empty() ? std::size_t{0} : testsupport::assetFields.size(), "lines of asset.dat");
}

}  // namespace fuzz
