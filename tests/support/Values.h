#pragma once

#include <cmpidt.h>

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "model/Value.h"

// Builds and reads plain values, object paths and instances.

namespace testsupport {

/** @name Values */
///@{
cimhost::Value text(std::string value);
cimhost::Value uint8(std::uint8_t value);
cimhost::Value uint16(std::uint16_t value);
cimhost::Value uint32(std::uint32_t value);
cimhost::Value uint64(std::uint64_t value);
cimhost::Value sint32(std::int32_t value);
cimhost::Value sint64(std::int64_t value);
cimhost::Value boolean(bool value);
cimhost::Value real64(double value);
cimhost::Value dateTime(std::string value);
cimhost::Value reference(cimhost::ObjectPath path);
cimhost::Value nullOf(CMPIType type);
///@}

cimhost::NamedValue named(std::string name, cimhost::Value value);

/** A path in a namespace; without keys, of a class. */
cimhost::ObjectPath objectPath(std::string nameSpace, std::string className,
                               std::vector<cimhost::NamedValue> keys = {});

cimhost::Instance instance(cimhost::ObjectPath path, std::vector<cimhost::NamedValue> properties = {});

/** @name Reading paths and instances
 * Names are case-sensitive. The result is null or none if there is no such name; of typed functions, also if the value
 * is null or has another type.
 */
///@{
const cimhost::Value* find(const std::vector<cimhost::NamedValue>& values, const std::string& name);

template <class Type>
std::optional<Type> valueOf(const std::vector<cimhost::NamedValue>& values, const std::string& name) {
    const cimhost::Value* value = find(values, name);
    const bool exists =
        value != nullptr && !value->isNull && !value->isArray && std::holds_alternative<Type>(value->single);
    return exists ? std::optional<Type>(std::get<Type>(value->single)) : std::nullopt;
}

std::optional<std::string> stringOf(const std::vector<cimhost::NamedValue>& values, const std::string& name);
std::optional<std::string> dateTimeOf(const std::vector<cimhost::NamedValue>& values, const std::string& name);
std::optional<cimhost::ObjectPath> referenceOf(const std::vector<cimhost::NamedValue>& values, const std::string& name);

/** Whether there is a null value of this name. */
bool isNull(const std::vector<cimhost::NamedValue>& values, const std::string& name);

/** The names, in order. */
std::vector<std::string> namesOf(const std::vector<cimhost::NamedValue>& values);
///@}

/** The path as WBEM URI, "root/cimv2:Class.Key=\"x\"". */
std::string toText(const cimhost::ObjectPath& path);

}  // namespace testsupport
