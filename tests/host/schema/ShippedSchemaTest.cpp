#include <gmock/gmock.h>

#include <algorithm>

#include "host/schema/Schemas.h"
#include "model/Value.h"

namespace cimhost::test {
namespace {

using testing::ElementsAre;
using testing::UnorderedElementsAreArray;

const std::filesystem::path schemaDirectory = SCHEMA_DIRECTORY;

/** Each property as "name type", with * for keys and + for properties that clients may modify. */
std::vector<std::string> shape(const Class& known) {
    std::vector<std::string> rows;
    for (const Property& property : known.properties) {
        const Qualifier* write = property.findQualifier("Write");
        const bool writable = write != nullptr && element<bool>(write->value);
        const std::string type =
            property.type == CMPI_ref ? property.referenceClass : std::string(typeName(property.type));
        rows.push_back(property.name + " " + type + (property.isKey() ? "*" : "") + (writable ? "+" : ""));
    }
    return rows;
}

Schema shipped() {
    Schema schema;
    MofReader(schema).readFile(schemaDirectory / "velko.mof");
    return schema;
}

const std::vector<std::string> classNames = {"VELKO_Lease",           "VELKO_Warranty",    "VELKO_LeaseSetting",
                                             "VELKO_WarrantySetting", "VELKO_OstrelAgent", "VELKO_AssetIDDetails",
                                             "VELKO_ComputerSystem"};

TEST(ShippedSchema, HasTheClasses) {
    const Schema schema = shipped();
    std::vector<std::string> found;
    for (const Class* each : schema.classes()) {
        found.push_back(each->name);
    }
    EXPECT_THAT(found, UnorderedElementsAreArray(classNames));
}

TEST(ShippedSchema, DescribesComputersByNameVendorAndModel) {
    EXPECT_THAT(shape(*shipped().findClass("VELKO_ComputerSystem")),
                ElementsAre("Name string*", "Caption string", "Description string", "ElementName string",
                            "Vendor string", "Model string", "ProductName string"));
}

TEST(ShippedSchema, SettingsReferToComputersAndToTheirElements) {
    const Schema schema = shipped();
    EXPECT_THAT(shape(*schema.findClass("VELKO_LeaseSetting")),
                ElementsAre("Antecedent VELKO_ComputerSystem*", "Dependent VELKO_Lease*"));
    EXPECT_THAT(shape(*schema.findClass("VELKO_WarrantySetting")),
                ElementsAre("Antecedent VELKO_ComputerSystem*", "Dependent VELKO_Warranty*"));
}

TEST(ShippedSchema, EachClassFileIsCompleteWithTheQualifiers) {
    for (const std::string& name : classNames) {
        Schema schema;
        MofReader reader(schema);
        reader.readFile(schemaDirectory / "velko-qualifiers.mof");
        reader.readFile(schemaDirectory / (name + ".mof"));
        ASSERT_EQ(schema.classes().size(), 1U) << name;
        EXPECT_EQ(schema.classes()[0]->name, name);
        EXPECT_EQ(schema.classes()[0]->superclass, "") << name;
    }
}

TEST(ShippedSchema, DeclaresEveryQualifierThatItUses) {
    const Schema schema = shipped();
    for (const Class* each : schema.classes()) {
        for (const Property& property : each->properties) {
            for (const Qualifier& qualifier : property.qualifiers) {
                EXPECT_FALSE(schema.findQualifier(qualifier.name)->standard)
                    << qualifier.name << " of " << property.name;
            }
        }
    }
}

TEST(ShippedSchema, DescribesEveryClassAndPropertyInAFullSentence) {
    const auto describe = [](const Qualifier* qualifier) {
        return qualifier == nullptr ? std::string() : element<std::string>(qualifier->value);
    };
    const Schema schema = shipped();
    for (const Class* each : schema.classes()) {
        EXPECT_THAT(describe(each->findQualifier("Description")), testing::MatchesRegex("[A-Z].*[.]")) << each->name;
        for (const Property& property : each->properties) {
            EXPECT_THAT(describe(property.findQualifier("Description")), testing::MatchesRegex("[A-Z].*[.]"))
                << each->name << "." << property.name;
        }
    }
}

TEST(ShippedSchema, OnlyPropertiesOfSettingsLackTheQualifierRead) {
    const Schema schema = shipped();
    for (const Class* each : schema.classes()) {
        const bool setting = each->name == "VELKO_LeaseSetting" || each->name == "VELKO_WarrantySetting";
        EXPECT_EQ(each->isAssociation(), setting) << each->name;
        for (const Property& property : each->properties) {
            EXPECT_EQ(property.findQualifier("Read") == nullptr, setting) << each->name << "." << property.name;
        }
    }
}

TEST(ShippedSchema, TheFilesLoadInTheOrderOfTheirNamesToo) {
    std::vector<std::filesystem::path> files;
    for (const auto& entry : std::filesystem::directory_iterator(schemaDirectory)) {
        if (entry.path().extension() == ".mof") {
            files.push_back(entry.path());
        }
    }
    std::sort(files.begin(), files.end());
    Schema schema;
    MofReader reader(schema);
    for (const auto& file : files) {
        reader.readFile(file);
    }
    EXPECT_EQ(schema.classes().size(), classNames.size());
}

}  // namespace
}  // namespace cimhost::test
