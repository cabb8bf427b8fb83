#include "configuration/TableReader.h"

#include "configuration/Toml.h"

#include <algorithm>

namespace Agent {

namespace {

const toml::table& emptyTable() {
    static const toml::table table;
    return table;
}

}  // namespace

TableReader::TableReader(const toml::table* table, std::string name, Problems& problemList)
    : source(table != nullptr ? table : &emptyTable()), tableName(std::move(name)), problems(&problemList) {}

bool TableReader::has(std::string_view key) {
    knownKeys.emplace_back(key);
    return source->contains(key);
}

std::optional<std::string> TableReader::text(std::string_view key) {
    if (!has(key)) {
        return std::nullopt;
    }
    const auto* value = source->get_as<std::string>(key);
    if (value == nullptr) {
        reject(key, "must be a string");
        return std::nullopt;
    }
    return value->get();
}

std::optional<std::string> TableReader::someText(std::string_view key) {
    std::optional<std::string> value = text(key);
    if (value && value->empty()) {
        reject(key, "must not be empty");
        return std::nullopt;
    }
    return value;
}

std::optional<bool> TableReader::flag(std::string_view key) {
    if (!has(key)) {
        return std::nullopt;
    }
    const auto* value = source->get_as<bool>(key);
    if (value == nullptr) {
        reject(key, "must be true or false");
        return std::nullopt;
    }
    return value->get();
}

std::optional<std::int64_t> TableReader::number(std::string_view key, std::int64_t minimum, std::int64_t maximum) {
    if (!has(key)) {
        return std::nullopt;
    }
    const auto* value = source->get_as<std::int64_t>(key);
    if (value == nullptr || value->get() < minimum || value->get() > maximum) {
        reject(key, "must be an integer from " + std::to_string(minimum) + " to " + std::to_string(maximum));
        return std::nullopt;
    }
    return value->get();
}

TableReader TableReader::table(std::string_view key) {
    const toml::table* value = nullptr;
    if (has(key)) {
        value = source->get_as<toml::table>(key);
        if (value == nullptr) {
            reject(key, "must be a table");
        }
    }
    return TableReader(value, nameOf(key), *problems);
}

std::vector<TableReader> TableReader::tables(std::string_view key) {
    std::vector<TableReader> readers;
    if (!has(key)) {
        return readers;
    }
    const toml::array* values = source->get_as<toml::array>(key);
    if (values == nullptr || !(values->empty() || values->is_homogeneous<toml::table>())) {
        reject(key, "must be an array of tables");
        return readers;
    }
    for (const toml::node& value : *values) {
        const std::string name = nameOf(key) + "[" + std::to_string(readers.size()) + "]";
        readers.emplace_back(value.as_table(), name, *problems);
    }
    return readers;
}

std::vector<std::pair<std::string, std::string>> TableReader::allTexts() {
    std::vector<std::pair<std::string, std::string>> entries;
    for (const auto& entry : *source) {
        const std::string key(entry.first.str());
        if (std::optional<std::string> value = text(key)) {
            entries.emplace_back(key, std::move(*value));
        }
    }
    return entries;
}

void TableReader::reject(std::string_view key, const std::string& why) {
    problems->push_back("configuration key " + nameOf(key) + " " + why + "; ignored");
}

void TableReader::rejectUnknownKeys() {
    for (const auto& entry : *source) {
        if (std::find(knownKeys.begin(), knownKeys.end(), entry.first.str()) == knownKeys.end()) {
            reject(entry.first.str(), "is unknown");
        }
    }
}

std::string TableReader::nameOf(std::string_view key) const {
    return tableName.empty() ? std::string(key) : tableName + "." + std::string(key);
}

}  // namespace Agent
