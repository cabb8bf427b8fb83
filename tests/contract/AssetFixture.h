#pragma once

#include <string>
#include <vector>

#include "ProviderFixture.h"

namespace contract {

constexpr const char* assetClass = "VELKO_AssetIDDetails";
constexpr const char* assetFile = "asset.dat";

/** Tests of the computer's asset identification and its file. */
class AssetTest : public ProviderTest {
protected:
    static ObjectPath path(std::vector<NamedValue> keys = {});

    /** Returns the keys of the test agent's computer. */
    static std::vector<NamedValue> keys();

    /** Returns the only instance. Fails the test and returns an empty instance if there is not exactly one. */
    Instance asset();

    /** Returns its properties as "Name=value", except LocalDateTime. */
    std::vector<std::string> assetProperties();

    /** Returns one of its properties as a string: "NULL" for null, "(none)" if it does not exist. */
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
