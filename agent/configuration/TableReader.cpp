#include "configuration/TableReader.h"

#include <algorithm>
#include <functional>
#include <toml.hpp>

namespace Agent {

namespace {

const TomlTable& emptyTable() {
    static const TomlTable table;
    return table;
}

template <bool (TomlValue::*hasType)() const noexcept>
bool isArrayOf(const TomlValue& value) {
    return value.is_array() && std::all_of(value.as_array().begin(), value.as_array().end(), std::mem_fn(hasType));
}

}  // namespace

TableReader::TableReader(const TomlTable* table, std::string name, Problems& problemList)
    : source(table != nullptr ? table : &emptyTable()), tableName(std::move(name)), problems(&problemList) {}

const TomlValue* TableReader::find(std::string_view key) {
    const std::string& name = knownKeys.emplace_back(key);
    const auto entry = source->find(name);
    return entry != source->end() ? &entry->second : nullptr;
}

template <class IsValid>
const TomlValue* TableReader::find(std::string_view key, IsValid isValid, const std::string& requirement) {
    const TomlValue* value = find(key);
    if (value != nullptr && !std::invoke(isValid, *value)) {
        reject(key, requirement);
        return nullptr;
    }
    return value;
}

std::optional<std::string> TableReader::string(std::string_view key) {
    const TomlValue* value = find(key, &TomlValue::is_string, "must be a string");
    return value != nullptr ? std::optional<std::string>(value->as_string().str) : std::nullopt;
}

std::optional<std::string> TableReader::nonEmptyString(std::string_view key) {
    std::optional<std::string> value = string(key);
    if (value && value->empty()) {
        reject(key, "must not be empty");
        return std::nullopt;
    }
    return value;
}

std::optional<bool> TableReader::flag(std::string_view key) {
    const TomlValue* value = find(key, &TomlValue::is_boolean, "must be true or false");
    return value != nullptr ? std::optional<bool>(value->as_boolean()) : std::nullopt;
}

std::optional<std::int64_t> TableReader::number(std::string_view key, std::int64_t minimum, std::int64_t maximum) {
    const auto isInRange = [&](const TomlValue& value) {
        return value.is_integer() && value.as_integer() >= minimum && value.as_integer() <= maximum;
    };
    const TomlValue* value =
        find(key, isInRange, "must be an integer from " + std::to_string(minimum) + " to " + std::to_string(maximum));
    return value != nullptr ? std::optional<std::int64_t>(value->as_integer()) : std::nullopt;
}

std::optional<std::vector<std::string>> TableReader::strings(std::string_view key) {
    const TomlValue* value = find(key, isArrayOf<&TomlValue::is_string>, "must be an array of strings");
    if (value == nullptr) {
        return std::nullopt;
    }
    std::vector<std::string> found;
    for (const TomlValue& each : value->as_array()) {
        found.push_back(each.as_string().str);
    }
    return found;
}

TableReader TableReader::table(std::string_view key) {
    const TomlValue* value = find(key, &TomlValue::is_table, "must be a table");
    return TableReader(value != nullptr ? &value->as_table() : nullptr, nameOf(key), *problems);
}

std::vector<TableReader> TableReader::tables(std::string_view key) {
    std::vector<TableReader> readers;
    const TomlValue* array = find(key, isArrayOf<&TomlValue::is_table>, "must be an array of tables");
    for (std::size_t index = 0; array != nullptr && index < array->as_array().size(); ++index) {
        const std::string name = nameOf(key) + "[" + std::to_string(index) + "]";
        readers.emplace_back(&array->as_array()[index].as_table(), name, *problems);
    }
    return readers;
}

std::vector<std::pair<std::string, std::string>> TableReader::allStrings() {
    std::vector<std::pair<std::string, std::string>> entries;
    for (const auto& entry : *source) {
        if (std::optional<std::string> value = string(entry.first)) {
            entries.emplace_back(entry.first, std::move(*value));
        }
    }
    return entries;
}

void TableReader::reject(std::string_view key, const std::string& why) {
    problems->push_back("configuration key " + nameOf(key) + " " + why + "; ignored");
}

void TableReader::rejectUnknownKeys() {
    for (const auto& entry : *source) {
        if (std::find(knownKeys.begin(), knownKeys.end(), entry.first) == knownKeys.end()) {
            reject(entry.first, "is unknown");
        }
    }
}

std::string TableReader::nameOf(std::string_view key) const {
    return tableName.empty() ? std::string(key) : tableName + "." + std::string(key);
}

}  // namespace Agent
