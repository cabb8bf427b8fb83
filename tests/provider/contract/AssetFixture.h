#pragma once

#include "ProviderFixture.h"

#include <string>
#include <vector>

namespace contract {

constexpr const char* assetClass = "VELKO_AssetIDDetails";
constexpr const char* assetFile = "asset.dat";

/** The asset identification of the computer, and its file. */
class AssetTest : public ProviderTest {
protected:
    static ObjectPath path(std::vector<NamedValue> keys = {});

    /** The keys of the test agent's one computer. */
    static std::vector<NamedValue> keys();

    /** The one instance; fails the test, and is empty, when there is not exactly one. */
    Instance asset();

    /** Its properties as text, "Name=value", without LocalDateTime. */
    std::vector<std::string> assetTexts();

    /** One property of it as text, "NULL" for null, "(none)" when the instance does not have it. */
    std::string property(const std::string& name);

    /** Modifies with these properties; fails the test unless the answer is an empty success. */
    void modify(std::vector<NamedValue> properties);

    /** What the file has for a key; "(none)" without a line for it. */
    static std::string stored(const std::string& key);

    /** The keys of the file's lines, in order. */
    static std::vector<std::string> storedKeys();
};

/** One property of an instance as text, "(none)" when it is not there. */
std::string shownProperty(const Instance& instance, const std::string& name);

}  // namespace contract
