#pragma once

#include "Schema.h"

#include <cmpift.h>

#include <optional>
#include <string>
#include <utility>
#include <vector>

// Values as the gate looks at them: as text, whatever their type. A string and a datetime are their characters, a
// number its decimal digits, a flag "true" or "false". The schema says what a text stands for.

namespace gate {

/** Values of properties, each named once. */
using Values = std::vector<std::pair<const Property*, std::string>>;

/** How the provider writes that there is no date. */
constexpr const char* noDate = "00000000000000.000000-000";

/**
 * The value that an object manager gave for a property; none when there is none or it is null. See
 * cim::hasValue() for what decides. Fails when it is of another type or does not fit, or when the object manager could
 * not give it.
 */
std::optional<std::string> valueOf(const CMPIData& data, const CMPIStatus& status, const Property& property);

/** A property of an instance, likewise. */
std::optional<std::string> propertyOf(const CMPIInstance* instance, const Property& property);

/** A key of a path that is text, a number or a flag; none also when the object manager cannot give it. */
std::optional<std::string> keyOf(const CMPIObjectPath* path, const Property& property);

/** A key or property that refers to an object; null when there is none. */
CMPIObjectPath* referenceOf(const CMPIObjectPath* path, const char* key);

/** The number or flag that a text stands for. */
CMPIValue scalarFrom(const std::string& text, CMPIType type);

/** Sets a property that refers to an object. */
void setReference(const CMPIInstance* instance, const char* name, const CMPIObjectPath* target);

/** Adds a key of type string. */
void addKey(const CMPIObjectPath* path, const char* name, const std::string& text);

/** Adds a key that refers to an object. */
void addReference(const CMPIObjectPath* path, const char* name, const CMPIObjectPath* target);

}  // namespace gate
