#pragma once

#include <array>
#include <string>
#include <vector>

#include "model/Value.h"

// The rules of the asset file, written down a second time and independently of the provider.

namespace testsupport {

/** How a value of the asset file comes about. */
enum class AssetKind {
    readOnly,      ///< only read: other programs write it
    text,          ///< any text
    date,          ///< a point in time; what is none is kept as an empty text
    personalized,  ///< any text; one that is not given repeats the one before it of the same name
};

/** A value that the asset file holds. */
struct AssetField {
    const char* key;       ///< of the file
    const char* property;  ///< the CIM property that shows it
    AssetKind kind;

    /** Whether it is the first of those that repeat one another. */
    bool isFirst() const { return std::string(property).back() == '1'; }

    /** What is kept of a value that a client gives. */
    std::string kept(const std::string& given) const;
};

/** What an instance shows of a value that the file holds, "" without one: "Name=value" as MOF. */
std::string shownValue(const AssetField& field, const std::string& kept);

/** The same of a real instance, in the order of assetFields. */
std::vector<std::string> shownAsset(const cimhost::Instance& instance);

/** All that the asset file holds; those that repeat one another in their order. */
extern const std::array<AssetField, 21> assetFields;

}  // namespace testsupport
