#include <gmock/gmock.h>

#include <map>

#include "host/schema/Schemas.h"
#include "schema/Registration.h"

namespace cimhost::test {
namespace {

using testing::ElementsAre;

const std::filesystem::path directory = SCHEMA_DIRECTORY;

/** The classes and properties of OpenPegasus's registrations. */
constexpr auto pegasusClasses = R"(
    class PG_ProviderModule {
        [Key] string Name; string Vendor; string Version; string InterfaceType; string InterfaceVersion;
        string Location; uint16 UserContext;
    };
    class PG_Provider { [Key] string ProviderModuleName; [Key] string Name; };
    class PG_ProviderCapabilities {
        [Key] string ProviderModuleName; [Key] string ProviderName; [Key] string CapabilityID;
        string ClassName; string Namespaces[]; uint16 ProviderType[]; string SupportedProperties[];
        string SupportedMethods[];
    };)";

/** A provider's registration files, and their expected content. */
struct Shipped {
    const char* provider;  ///< also the name of its library
    const char* sfcbFile;
    const char* module;  ///< of OpenPegasus
    std::vector<std::string> classes;
};
void PrintTo(const Shipped& shipped, std::ostream* out) {
    *out << shipped.provider;
}

const std::vector<std::string> served = {"VELKO_Lease",           "VELKO_Warranty",    "VELKO_LeaseSetting",
                                         "VELKO_WarrantySetting", "VELKO_OstrelAgent", "VELKO_AssetIDDetails"};

class ShippedRegistration : public testing::TestWithParam<Shipped> {
protected:
    static Schema classes() {
        Schema schema;
        MofReader(schema).readFile(directory / "velko.mof");
        return schema;
    }

    /** The instances of a class of OpenPegasus, in order, each as its properties in MOF. */
    static std::vector<std::map<std::string, std::string>> instancesOf(const std::string& className) {
        Schema schema;
        MofReader reader(schema);
        reader.readSource(pegasusClasses, "pegasus");
        reader.readFile(directory / "pegasus" / (std::string(GetParam().provider) + ".mof"));
        std::vector<std::map<std::string, std::string>> found;
        for (const Instance& instance : schema.instances()) {
            if (instance.path.className == className) {
                found.emplace_back();
                for (const NamedValue& property : instance.properties) {
                    found.back()[property.name] = formatMof(property.value);
                }
            }
        }
        return found;
    }

    static std::string quoted(const std::string& text) { return '"' + text + '"'; }
};

TEST_P(ShippedRegistration, KeepsAllClassesInOneProcessOfSfcb) {
    const Schema schema = classes();
    std::vector<std::string> found;
    for (const ProviderRegistration& stanza : readRegistrationFile(directory / GetParam().sfcbFile)) {
        found.push_back(stanza.className);
        EXPECT_EQ(stanza.provider, GetParam().provider);
        EXPECT_EQ(stanza.location, GetParam().provider);
        EXPECT_TRUE(stanza.instance);
        EXPECT_EQ(stanza.association, schema.findClass(stanza.className)->isAssociation()) << stanza.className;
        EXPECT_THAT(stanza.nameSpaces, ElementsAre("root/cimv2"));
        EXPECT_EQ(stanza.group, "LeaseAndWarranty");
        EXPECT_EQ(stanza.unload, "never");
    }
    EXPECT_EQ(found, GetParam().classes);
}

TEST_P(ShippedRegistration, NamesTheLibraryToOpenPegasus) {
    const auto modules = instancesOf("PG_ProviderModule");
    ASSERT_EQ(modules.size(), 1U);
    EXPECT_EQ(modules[0].at("Name"), quoted(GetParam().module));
    EXPECT_EQ(modules[0].at("Location"), quoted(GetParam().provider));
    EXPECT_EQ(modules[0].at("Version"), quoted(PROJECT_VERSION));
    EXPECT_EQ(modules[0].at("InterfaceType"), quoted("CMPI"));
    EXPECT_EQ(modules[0].at("InterfaceVersion"), quoted("2.0.0"));
    EXPECT_EQ(modules[0].at("UserContext"), "4") << "the privileged user, not whoever asks";
    const auto providers = instancesOf("PG_Provider");
    ASSERT_EQ(providers.size(), 1U);
    EXPECT_EQ(providers[0].at("ProviderModuleName"), quoted(GetParam().module));
    EXPECT_EQ(providers[0].at("Name"), quoted(GetParam().provider));
}

TEST_P(ShippedRegistration, NamesTheClassesToOpenPegasus) {
    const Schema schema = classes();
    std::vector<std::string> found;
    for (const auto& each : instancesOf("PG_ProviderCapabilities")) {
        const std::string name = each.at("ClassName").substr(1, each.at("ClassName").size() - 2);
        found.push_back(name);
        EXPECT_EQ(each.at("CapabilityID"), quoted(name));
        EXPECT_EQ(each.at("ProviderModuleName"), quoted(GetParam().module));
        EXPECT_EQ(each.at("ProviderName"), quoted(GetParam().provider));
        EXPECT_EQ(each.at("Namespaces"), "{\"root/cimv2\"}");
        // With its second number only, enumerations of an association class would be empty.
        EXPECT_EQ(each.at("ProviderType"), schema.findClass(name)->isAssociation() ? "{2, 3}" : "{2}") << name;
    }
    EXPECT_EQ(found, GetParam().classes);
}

INSTANTIATE_TEST_SUITE_P(
    AllProviders, ShippedRegistration,
    testing::Values(Shipped{"LeaseAndWarrantyProvider", "LeaseAndWarrantyProvider.reg", "LeaseAndWarranty", served},
                    Shipped{"LeaseAndWarrantyGate", "gate/LeaseAndWarrantyGate.reg", "LeaseAndWarranty", served},
                    Shipped{"OstrelComputerSystemProvider",
                            "OstrelComputerSystemProvider.reg",
                            "OstrelComputerSystem",
                            {"VELKO_ComputerSystem"}}),
    [](const auto& tested) { return std::string(tested.param.provider); });

}  // namespace
}  // namespace cimhost::test
