#pragma once

#include <array>
#include <string>
#include <vector>

#include "model/Value.h"

// A model of the asset file, independent of the provider.

namespace testsupport {

/** The kinds of values in the asset file. */
enum class AssetKind {
    readOnly,      ///< written by other programs
    text,          ///< any string
    date,          ///< a point in time; other strings are stored as an empty one
    personalized,  ///< any string; one that is not sent repeats the preceding one of the same name
};

/** A value of the asset file. */
struct AssetField {
    const char* key;       ///< of the file
    const char* property;  ///< the CIM property with the value
    AssetKind kind;

    /** Whether it is the first personalized value, which repeats no other. */
    bool isFirst() const { return std::string(property).back() == '1'; }

    /** The value that is stored if a client sends this one. */
    std::string kept(const std::string& given) const;
};

/** The property of a stored value as "Name=value" in MOF. @param kept the stored value; empty: none */
std::string shownValue(const AssetField& field, const std::string& kept);

/** The properties of an instance in the same form, in the order of assetFields. */
std::vector<std::string> shownAsset(const cimhost::Instance& instance);

/** All values of the asset file. */
extern const std::array<AssetField, 21> assetFields;

}  // namespace testsupport
