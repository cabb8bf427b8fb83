#include <gmock/gmock.h>

#include "host/schema/Schemas.h"

namespace cimhost::test {
namespace {

using testing::ElementsAre;

std::vector<std::string> names(const std::vector<Property>& properties) {
    std::vector<std::string> found;
    for (const Property& property : properties) {
        found.push_back(property.name);
    }
    return found;
}

std::vector<std::string> names(const std::vector<const Class*>& classes) {
    std::vector<std::string> found;
    for (const Class* each : classes) {
        found.push_back(each->name);
    }
    return found;
}

constexpr auto animals = R"(
    [Abstract, Description("any animal")] class Animal { [Key] string Name; uint8 Legs = 4; string Note; };
    class Bird : Animal { uint8 Legs = 2; boolean Flies; };
    class Penguin : Bird { boolean Flies = false; };
    class Stone { [Key] uint32 Weight; };)";

TEST(ClassModel, FindsClassesAndPropertiesInAnyLetterCase) {
    const Schema schema = schemaOf(animals);
    ASSERT_NE(schema.findClass("aNIMAL"), nullptr);
    EXPECT_EQ(schema.findClass("aNIMAL")->name, "Animal");
    EXPECT_EQ(schema.findClass("animal")->findProperty("LEGS")->name, "Legs");
    EXPECT_EQ(schema.findClass("Animals"), nullptr);
    EXPECT_EQ(schema.findClass("Stone")->findProperty("Legs"), nullptr);
}

TEST(ClassModel, InheritedPropertiesAreFirstAndOverridingOnesReplaceThem) {
    const Schema schema = schemaOf(animals);
    const Class& penguin = *schema.findClass("Penguin");
    EXPECT_THAT(names(penguin.properties), ElementsAre("Name", "Legs", "Note", "Flies"));
    EXPECT_EQ(penguin.findProperty("Name")->origin, "Animal");
    EXPECT_EQ(penguin.findProperty("Legs")->origin, "Animal");
    EXPECT_EQ(penguin.findProperty("Flies")->origin, "Bird");
    EXPECT_TRUE(penguin.findProperty("Legs")->isPropagated);
    EXPECT_FALSE(penguin.findProperty("Flies")->isPropagated);
    EXPECT_EQ(element<std::uint8_t>(penguin.findProperty("Legs")->defaultValue), 2);
}

TEST(ClassModel, KeysAreInherited) {
    const Schema schema = schemaOf(animals);
    ASSERT_EQ(schema.findClass("Penguin")->keys().size(), 1U);
    EXPECT_EQ(schema.findClass("Penguin")->keys()[0]->name, "Name");
}

TEST(ClassModel, AnOverridingPropertyKeepsTheQualifiersItDoesNotRepeat) {
    const Schema schema = schemaOf(R"(
        class A { [Key, Description("a"), Experimental] string Name; };
        class B : A { [Description("b")] string Name; };)");
    const Property& name = *schema.findClass("B")->findProperty("Name");
    EXPECT_TRUE(name.isKey());
    EXPECT_EQ(element<std::string>(name.findQualifier("description")->value), "b");
    EXPECT_EQ(name.findQualifier("Experimental"), nullptr) << "a restricted qualifier stays where it is";
}

TEST(ClassModel, ClassQualifiersAreInheritedUnlessRestricted) {
    const Schema schema = schemaOf(animals);
    EXPECT_NE(schema.findClass("Bird")->findQualifier("Description"), nullptr);
    EXPECT_EQ(schema.findClass("Bird")->findQualifier("Abstract"), nullptr);
}

TEST(ClassModel, FindsSuperclassesAndSubclasses) {
    const Schema schema = schemaOf(animals);
    EXPECT_TRUE(schema.isA("penguin", "ANIMAL"));
    EXPECT_TRUE(schema.isA("Bird", "Bird"));
    EXPECT_FALSE(schema.isA("Animal", "Bird"));
    EXPECT_FALSE(schema.isA("Stone", "Animal"));
    EXPECT_TRUE(schema.isA("Unknown", "unknown"));
    EXPECT_FALSE(schema.isA("Unknown", "Animal"));
    EXPECT_THAT(names(schema.subclasses("animal")), ElementsAre("Bird", "Penguin"));
    EXPECT_THAT(names(schema.classes()), ElementsAre("Animal", "Bird", "Penguin", "Stone"));
}

TEST(ClassModel, AKeyOrAssociationHasTheQualifierWithTheValueTrue) {
    const Schema schema = schemaOf(R"(
        [Association(false)] class A { [Key(false)] string X; [Key(true)] string Y; };
        [Association] class B { [Key] A REF Left; [Key] A REF Right; };)");
    EXPECT_FALSE(schema.findClass("A")->isAssociation());
    ASSERT_EQ(schema.findClass("A")->keys().size(), 1U);
    EXPECT_EQ(schema.findClass("A")->keys()[0]->name, "Y");
    EXPECT_TRUE(schema.findClass("B")->isAssociation());
    EXPECT_EQ(schema.findClass("B")->keys()[0]->referenceClass, "A");
}

TEST(ClassModel, MethodsAreInheritedByName) {
    const Schema schema = schemaOf("class A { uint32 Go(); uint32 Stop(); }; class B : A { uint32 go(); };");
    const Class& b = *schema.findClass("B");
    ASSERT_EQ(b.methods.size(), 2U);
    EXPECT_EQ(b.methods[0].origin, "A");
    EXPECT_FALSE(b.methods[0].isPropagated);
    EXPECT_TRUE(b.methods[1].isPropagated);
    EXPECT_EQ(b.methods[1].name, "Stop");
}

}  // namespace
}  // namespace cimhost::test
