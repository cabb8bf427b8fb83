#include "support/Values.h"

#include <algorithm>
#include <utility>

#include "schema/ObjectPathText.h"

namespace testsupport {
namespace {

template <class Type>
cimhost::Value single(CMPIType type, Type value) {
    return cimhost::Value::of(type, std::move(value));
}

}  // namespace

cimhost::Value text(std::string value) {
    return single(CMPI_string, std::move(value));
}

cimhost::Value uint8(std::uint8_t value) {
    return single(CMPI_uint8, value);
}

cimhost::Value uint16(std::uint16_t value) {
    return single(CMPI_uint16, value);
}

cimhost::Value uint32(std::uint32_t value) {
    return single(CMPI_uint32, value);
}

cimhost::Value uint64(std::uint64_t value) {
    return single(CMPI_uint64, value);
}

cimhost::Value sint32(std::int32_t value) {
    return single(CMPI_sint32, value);
}

cimhost::Value sint64(std::int64_t value) {
    return single(CMPI_sint64, value);
}

cimhost::Value boolean(bool value) {
    return single(CMPI_boolean, value);
}

cimhost::Value real64(double value) {
    return single(CMPI_real64, value);
}

cimhost::Value dateTime(std::string value) {
    return single(CMPI_dateTime, cimhost::DateTime{std::move(value)});
}

cimhost::Value reference(cimhost::ObjectPath path) {
    return single(CMPI_ref, std::make_shared<const cimhost::ObjectPath>(std::move(path)));
}

cimhost::Value nullOf(CMPIType type) {
    return cimhost::Value::null(type);
}

cimhost::NamedValue named(std::string name, cimhost::Value value) {
    return {std::move(name), std::move(value)};
}

cimhost::ObjectPath objectPath(std::string nameSpace, std::string className, std::vector<cimhost::NamedValue> keys) {
    return {{}, std::move(nameSpace), std::move(className), std::move(keys)};
}

cimhost::Instance instance(cimhost::ObjectPath path, std::vector<cimhost::NamedValue> properties) {
    return {std::move(path), std::move(properties)};
}

const cimhost::Value* find(const std::vector<cimhost::NamedValue>& values, const std::string& name) {
    const auto found =
        std::find_if(values.begin(), values.end(), [&](const cimhost::NamedValue& each) { return each.name == name; });
    return found == values.end() ? nullptr : &found->value;
}

std::optional<std::string> stringOf(const std::vector<cimhost::NamedValue>& values, const std::string& name) {
    return valueOf<std::string>(values, name);
}

std::optional<std::string> dateTimeOf(const std::vector<cimhost::NamedValue>& values, const std::string& name) {
    const auto found = valueOf<cimhost::DateTime>(values, name);
    return found ? std::optional<std::string>(found->value) : std::nullopt;
}

std::optional<cimhost::ObjectPath> referenceOf(const std::vector<cimhost::NamedValue>& values,
                                               const std::string& name) {
    const auto found = valueOf<std::shared_ptr<const cimhost::ObjectPath>>(values, name);
    return found ? std::optional<cimhost::ObjectPath>(**found) : std::nullopt;
}

bool isNull(const std::vector<cimhost::NamedValue>& values, const std::string& name) {
    const cimhost::Value* value = find(values, name);
    return value != nullptr && value->isNull;
}

std::vector<std::string> namesOf(const std::vector<cimhost::NamedValue>& values) {
    std::vector<std::string> names;
    names.reserve(values.size());
    for (const cimhost::NamedValue& each : values) {
        names.push_back(each.name);
    }
    return names;
}

std::string toText(const cimhost::ObjectPath& path) {
    return cimhost::formatObjectPath(path);
}

}  // namespace testsupport
