#pragma once

#include <string>
#include <vector>

#include "ProviderFixture.h"

namespace contract {

constexpr const char* assetClass = "VELKO_AssetIDDetails";
constexpr const char* assetFile = "asset.dat";

/** Fixture for tests of the computer's asset data and its file. */
class AssetTest : public ProviderTest {
protected:
    static ObjectPath path(std::vector<NamedValue> keys = {});

    /** Returns the keys of the test agent's computer. */
    static std::vector<NamedValue> keys();

    /** Returns the only instance. Fails the test and returns an empty instance if there is not exactly one. */
    Instance asset();

    /** Returns the properties of the instance as "Name=value", except LocalDateTime. */
    std::vector<std::string> assetProperties();

    /** Returns a property of the instance as a string: "NULL" for null, "(none)" if the property does not exist. */
    std::string property(const std::string& name);

    /** Modifies these properties. Fails the test unless the request succeeds without results. */
    void modify(std::vector<NamedValue> properties);

    /** Returns the value of a key in the file, or "(none)". */
    static std::string stored(const std::string& key);

    /** Returns the keys of the file's lines, in order. */
    static std::vector<std::string> storedKeys();
};

/** Returns a property of an instance as a string, or "(none)". */
std::string shownProperty(const Instance& instance, const std::string& name);

}  // namespace contract
