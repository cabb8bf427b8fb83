#include "AssetFixture.h"

#include <algorithm>
#include <sstream>

#include "schema/MofWriter.h"

namespace contract {

using testsupport::named;
using testsupport::text;

ObjectPath AssetTest::path(std::vector<NamedValue> keys) {
    return testsupport::objectPath(nameSpace, assetClass, std::move(keys));
}

std::vector<NamedValue> AssetTest::keys() {
    return {named("IdentifyingNumber", text("/system")), named("Name", text("testhost")),
            named("Vendor", text("Example Maker")), named("Version", text("4.2.0"))};
}

Instance AssetTest::asset() {
    const Outcome outcome = provider().enumerateInstances(path());
    EXPECT_THAT(outcome, isOk(1));
    const auto instances = outcome.instances();
    EXPECT_EQ(instances.size(), 1U);
    return instances.size() == 1 ? instances[0] : Instance{};
}

std::vector<std::string> AssetTest::assetProperties() {
    std::vector<NamedValue> properties = asset().properties;
    properties.erase(std::remove_if(properties.begin(), properties.end(),
                                    [](const NamedValue& each) { return each.name == "LocalDateTime"; }),
                     properties.end());
    return shown(properties);
}

std::string AssetTest::property(const std::string& name) {
    return shownProperty(asset(), name);
}

void AssetTest::modify(std::vector<NamedValue> properties) {
    const Outcome outcome =
        provider().modifyInstance(path(keys()), clientInstance(path(keys()), std::move(properties)));
    EXPECT_THAT(outcome, isOk(0));
    EXPECT_THAT(outcome.events, testing::IsEmpty());
}

std::string AssetTest::stored(const std::string& key) {
    std::istringstream lines(readData(assetFile).value_or(""));
    for (std::string line; std::getline(lines, line);) {
        if (line.rfind(key + "=", 0) == 0) {
            return line.substr(key.size() + 1);
        }
    }
    return "(none)";
}

std::vector<std::string> AssetTest::storedKeys() {
    std::istringstream lines(readData(assetFile).value_or(""));
    std::vector<std::string> keys;
    for (std::string line; std::getline(lines, line);) {
        keys.push_back(line.substr(0, line.find('=')));
    }
    return keys;
}

std::string shownProperty(const Instance& instance, const std::string& name) {
    const cimhost::Value* value = testsupport::find(instance.properties, name);
    return value == nullptr ? "(none)" : cimhost::formatMof(*value);
}

}  // namespace contract
