#include "ProviderModel.h"

#include <algorithm>
#include <limits>

#include "Target.h"
#include "cim/Names.h"
#include "framework/PropertyText.h"
#include "support/AssetModel.h"

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

/** The element of a value that is neither null nor an array; a null pointer for other values. */
const cimhost::Scalar* scalarOf(const std::vector<NamedValue>& values, const char* name) {
    const Value* value = valueNamed(values, name);
    return value == nullptr || value->isNull || value->isArray ? nullptr : &value->single;
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
                       [&](const AssetKey& key) { return keyString(path, key.name).value_or(key.value) == key.value; });
}

}  // namespace

std::optional<std::string> keyString(const cimhost::ObjectPath& path, const char* name) {
    const auto* scalar = scalarOf(path.keys, name);
    const auto* string = scalar == nullptr ? nullptr : std::get_if<std::string>(scalar);
    return string == nullptr ? std::nullopt : std::optional<std::string>(*string);
}

std::optional<std::string> givenString(const Instance& instance, const char* name) {
    const auto* scalar = scalarOf(instance.properties, name);
    if (scalar == nullptr) {
        return std::nullopt;
    }
    if (const auto* date = std::get_if<cimhost::DateTime>(scalar)) {
        return date->value;
    }
    const auto* string = std::get_if<std::string>(scalar);
    return string == nullptr ? std::nullopt : std::optional<std::string>(*string);
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

/** Without a key that can be read, a path selects all records. */
std::vector<ModelRecord*> ExpectedRecords::selected(const cimhost::ObjectPath& path) {
    const auto identifier = keyString(path, "InstanceID");
    std::vector<ModelRecord*> found;
    for (ModelRecord& record : model.records) {
        if (!identifier || record.front() == *identifier) {
            found.push_back(&record);
        }
    }
    return found;
}

void ExpectedRecords::write() {
    file = model.written();
}

Expectation ExpectedRecords::apply(const Call& call) {
    switch (call.request.operation) {
        case cimhost::Operation::createInstance:
            return create(call);
        case cimhost::Operation::modifyInstance:
            return modify(call);
        case cimhost::Operation::deleteInstance:
            return remove(call);
        default:
            return read(call);
    }
}

Expectation ExpectedRecords::read(const Call& call) {
    Expectation expected{CMPI_RC_OK, 1};
    for (const ModelRecord* record : selected(call.request.path)) {
        auto shown = model.shown(*record);
        if (call.performs(cimhost::Operation::enumerateInstanceNames)) {
            shown.resize(1);
        }
        expected.shown.push_back(std::move(shown));
    }
    return expected;
}

/** Only the key of the path is used. If the record exists, the provider returns nothing, not even Done. */
Expectation ExpectedRecords::create(const Call& call) {
    const auto identifier = keyString(call.request.path, "InstanceID");
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

bool ExpectedRecords::change(ModelRecord& record, const Instance& instance) const {
    bool isChanged = false;
    for (std::size_t index = 1; index < model.fields.size(); ++index) {
        const testsupport::ModelField& field = model.fields[index];
        const auto take = field.form == Form::number ? givenNumber : field.form == Form::flag ? givenFlag : givenString;
        if (const auto value = take(instance, field.property)) {
            record[index] = *value;
            isChanged = true;
        }
    }
    return isChanged;
}

/** Changes the first selected record and returns nothing. */
Expectation ExpectedRecords::modify(const Call& call) {
    const auto targets = selected(call.request.path);
    if (call.hasInstance && !targets.empty() && change(*targets.front(), call.request.instance)) {
        write();
    }
    return {};
}

/** Without a key that can be read, nothing is deleted. */
Expectation ExpectedRecords::remove(const Call& call) {
    const auto identifier = keyString(call.request.path, "InstanceID");
    if (identifier && model.remove(*identifier)) {
        write();
    }
    return {};
}

void ExpectedRecords::restart() {
    model.read(file.value_or(""));
}

void ExpectedRecords::replaceFile(const std::string& content) {
    writeDataFile(store.fileName, content);
    file = content;
}

void ExpectedRecords::requireAgreement() const {
    require(dataFile(store.fileName) == file, std::string(store.fileName) + " has the expected content\nfound:\n" +
                                                  dataFile(store.fileName).value_or("(none)") + "\nexpected:\n" +
                                                  file.value_or("(none)"));
    require(store.records() == model.records, std::string(store.className) + ": the table has the expected records");
    require(store.count() == model.records.size(),
            std::string(store.className) + ": the count is the number of records");
}

void ExpectedAsset::modify(const Instance& instance) {
    std::string before;  // the preceding personalized value, which the provider copies if the next one is not sent
    for (const testsupport::AssetField& field : testsupport::assetFields) {
        const auto given = givenString(instance, field.property);
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

/** All requests create the file. A modification does not check the path. */
Expectation ExpectedAsset::apply(const Call& call) {
    exists = true;
    if (call.performs(cimhost::Operation::modifyInstance)) {
        if (call.hasInstance) {
            modify(call.request.instance);
        }
        return {};
    }
    Expectation expected{CMPI_RC_OK, 1};
    if (isAssetPath(call.request.path)) {
        expected.shown.push_back(call.performs(cimhost::Operation::enumerateInstanceNames) ? std::vector<std::string>()
                                                                                           : shown());
    }
    return expected;
}

std::vector<std::string> ExpectedAsset::shown() const {
    std::vector<std::string> all;
    for (const testsupport::AssetField& field : testsupport::assetFields) {
        const auto value = values.find(field.key);
        all.push_back(testsupport::shownValue(field, value == values.end() ? "" : value->second));
    }
    return all;
}

void ExpectedAsset::requireAgreement() const {
    const auto content = dataFile("asset.dat");
    require(content.has_value() == exists, "asset.dat exists after a request");
    const KO::PropertyText properties(content.value_or(""));
    for (const auto& [key, value] : values) {
        requireSame(properties.get(key).value_or("(none)"), value, key);
    }
    const std::string found = content.value_or("");
    const auto lines = static_cast<std::size_t>(std::count(found.begin(), found.end(), '\n'));
    requireSame(lines, values.empty() ? std::size_t{0} : testsupport::assetFields.size(), "lines of asset.dat");
}

}  // namespace fuzz
