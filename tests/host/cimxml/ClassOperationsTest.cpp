#include "CimXmlFixture.h"

namespace cimhost::cimxml::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::UnorderedElementsAre;

class ClassOperationsTest : public CimXmlTest {
protected:
    XmlElement getClass(const std::string& name, const std::string& parameters = "") {
        const XmlElement result = response("GetClass", className("ClassName", name) + parameters);
        EXPECT_EQ(statusOf(result), 0);
        return returned(result).at(0);
    }

    std::vector<std::string> namesOf(const std::string& operation, const std::string& parameters) {
        std::vector<std::string> names;
        for (const XmlElement& each : returned(response(operation, parameters))) {
            const XmlElement* path = each.name == "CLASSNAME" ? &each : each.child("CLASSPATH")->child("CLASSNAME");
            names.push_back(*path->attribute("NAME"));
        }
        return names;
    }
};

TEST_F(ClassOperationsTest, GetClassIsLocalUnlessAskedOtherwise) {
    const XmlElement local = getClass("derived");
    EXPECT_EQ(*local.attribute("SUPERCLASS"), "Base");
    EXPECT_THAT(namesIn(local, "PROPERTY"), ElementsAre("Size", "Flag", "When", "Tags"));
    EXPECT_THAT(namesIn(local, "METHOD"), IsEmpty());
    const XmlElement complete = getClass("Derived", value("LocalOnly", "false"));
    EXPECT_THAT(namesIn(complete, "PROPERTY"), ElementsAre("Name", "Size", "Flag", "When", "Tags"));
    EXPECT_THAT(namesIn(complete, "METHOD"), ElementsAre("Resize"));
}

TEST_F(ClassOperationsTest, QualifiersShowWhetherTheyAreInherited) {
    const XmlElement complete = getClass("Derived", value("LocalOnly", "false"));
    const XmlElement& name = *complete.child("PROPERTY");
    EXPECT_THAT(namesIn(name, "QUALIFIER"), ElementsAre("Key", "MaxLen"));
    EXPECT_EQ(*name.attribute("PROPAGATED"), "true");
    EXPECT_EQ(*name.child("QUALIFIER")->attribute("PROPAGATED"), "true");
    EXPECT_EQ(*name.child("QUALIFIER")->attribute("OVERRIDABLE"), "false");
    EXPECT_EQ(name.child("QUALIFIER")->child("VALUE")->characters, "TRUE");
    const XmlElement without = getClass("Derived", value("IncludeQualifiers", "false"));
    EXPECT_THAT(namesIn(without, "QUALIFIER"), IsEmpty());
    EXPECT_THAT(namesIn(*without.child("PROPERTY"), "QUALIFIER"), IsEmpty());
}

TEST_F(ClassOperationsTest, ClassOriginAndPropertyListAreApplied) {
    const XmlElement found = getClass("Derived", value("LocalOnly", "false") + value("IncludeClassOrigin", "true") +
                                                     properties({"name", "SIZE", "FLAG"}));
    EXPECT_THAT(namesIn(found, "PROPERTY"), ElementsAre("Name", "Size", "Flag"));
    EXPECT_EQ(*found.children[1].attribute("CLASSORIGIN"), "Base");
    EXPECT_EQ(*found.children[2].attribute("CLASSORIGIN"), "Base") << "overriding does not change the origin";
    EXPECT_EQ(found.children[2].attribute("PROPAGATED"), nullptr);
    EXPECT_EQ(*found.children[3].attribute("CLASSORIGIN"), "Derived");
    EXPECT_EQ(getClass("Base").child("PROPERTY")->attribute("CLASSORIGIN"), nullptr);
}

TEST_F(ClassOperationsTest, ClassesHaveDefaultsReferencesAndMethods) {
    const XmlElement base = getClass("Base");
    EXPECT_EQ(base.children[2].child("VALUE")->characters, "7");
    const XmlElement& method = *base.child("METHOD");
    EXPECT_EQ(*method.attribute("TYPE"), "uint32");
    ASSERT_NE(method.child("PARAMETER"), nullptr);
    EXPECT_EQ(*method.child("PARAMETER")->attribute("NAME"), "Size");
    EXPECT_THAT(namesIn(*method.child("PARAMETER"), "QUALIFIER"), ElementsAre("In"));
    EXPECT_EQ(*getClass("Link").child("PROPERTY.REFERENCE")->attribute("REFERENCECLASS"), "Base");
}

TEST_F(ClassOperationsTest, UnknownClassesAndQualifiersAreErrors) {
    EXPECT_EQ(statusOf(response("GetClass", className("ClassName", "Nothing"))), CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(statusOf(response("EnumerateClassNames", className("ClassName", "Nothing"))), CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_EQ(statusOf(response("GetQualifier", value("QualifierName", "Nothing"))), CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(ClassOperationsTest, EnumerationOfClassesIsShallowUnlessAskedOtherwise) {
    EXPECT_THAT(namesOf("EnumerateClassNames", ""), ElementsAre("Base", "Other", "Unserved", "Link"));
    EXPECT_THAT(namesOf("EnumerateClassNames", value("DeepInheritance", "true")),
                ElementsAre("Base", "Derived", "Other", "Unserved", "Link"));
    EXPECT_THAT(namesOf("EnumerateClassNames", className("ClassName", "base")), ElementsAre("Derived"));
    const XmlElement classes = response("EnumerateClasses", "");
    ASSERT_EQ(returned(classes).size(), 4U);
    EXPECT_EQ(returned(classes)[0].name, "CLASS");
}

TEST_F(ClassOperationsTest, QualifierDeclarationsHaveTypeAndFlavor) {
    const XmlElement key = returned(response("GetQualifier", value("QualifierName", "key"))).at(0);
    EXPECT_EQ(key.name, "QUALIFIER.DECLARATION");
    EXPECT_EQ(*key.attribute("NAME"), "Key");
    EXPECT_EQ(*key.attribute("TYPE"), "boolean");
    EXPECT_EQ(*key.attribute("OVERRIDABLE"), "false");
    EXPECT_EQ(key.child("VALUE")->characters, "FALSE");
    EXPECT_EQ(returned(response("EnumerateQualifiers", "")).size(), schema.qualifiers().size());
    for (const auto& [name, byDefault] : {std::pair{"In", "TRUE"}, {"Read", "TRUE"}, {"ArrayType", "Bag"}}) {
        const XmlElement declared = returned(response("GetQualifier", value("QualifierName", name))).at(0);
        EXPECT_EQ(declared.child("VALUE")->characters, byDefault) << name;
    }
}

TEST_F(ClassOperationsTest, QualifierDeclarationsHaveTheirScope) {
    MofReader(schema).readSource(
        "Qualifier Mine : string, Scope(Reference, METHOD, schema); Qualifier All : string = \"x\", Scope(any);",
        "test qualifiers");
    const auto declared = [&](const std::string& name) {
        return returned(response("GetQualifier", value("QualifierName", name))).at(0);
    };
    const auto scopeOf = [&](const std::string& name) {
        std::vector<std::string> scope;
        const XmlElement declaration = declared(name);
        for (const auto& [attribute, isInScope] : declaration.child("SCOPE")->attributes) {
            EXPECT_EQ(isInScope, "true");
            scope.push_back(attribute);
        }
        return scope;
    };
    EXPECT_THAT(scopeOf("Mine"), UnorderedElementsAre("REFERENCE", "METHOD"));
    EXPECT_THAT(scopeOf("All"), UnorderedElementsAre("CLASS", "ASSOCIATION", "REFERENCE", "PROPERTY", "METHOD",
                                                     "PARAMETER", "INDICATION"));
    EXPECT_THAT(scopeOf("Key"), UnorderedElementsAre("PROPERTY", "REFERENCE"));
    EXPECT_EQ(declared("All").children.at(0).name, "SCOPE");
    EXPECT_EQ(declared("All").children.at(1).characters, "x");
}

TEST_F(ClassOperationsTest, AssociationsOfClassesComeFromTheSchema) {
    const std::string derived = className("ObjectName", "Derived");
    EXPECT_THAT(namesOf("ReferenceNames", derived), ElementsAre("Link"));
    EXPECT_THAT(namesOf("AssociatorNames", derived), ElementsAre("Other"));
    EXPECT_THAT(namesOf("AssociatorNames", className("ObjectName", "Other")), ElementsAre("Base"));
    EXPECT_THAT(namesOf("AssociatorNames", derived + value("Role", "to")), IsEmpty());
    EXPECT_THAT(namesOf("AssociatorNames", derived + value("ResultRole", "TO")), ElementsAre("Other"));
    EXPECT_THAT(namesOf("AssociatorNames", derived + className("ResultClass", "Base")), IsEmpty());
    for (const char* filter : {"ResultClass", "AssocClass"}) {
        EXPECT_EQ(statusOf(response("AssociatorNames", derived + className(filter, "Nothing"))),
                  CMPI_RC_ERR_INVALID_PARAMETER);
    }
    const XmlElement classes = response("Associators", derived);
    EXPECT_NE(returned(classes).at(0).child("CLASS"), nullptr);
    EXPECT_THAT(manager.requests, IsEmpty());
}

TEST_F(ClassOperationsTest, ClassesWithControlCharactersAreWellFormed) {
    MofReader(schema).readSource("[Description(\"a\\x1b\\x0D\")] class Odd { [Key] string Name = \"\\x1\"; };", "odd");
    const XmlElement got = response("GetClass", className("ClassName", "Odd"));
    ASSERT_EQ(statusOf(got), 0);
    EXPECT_EQ(returned(got)[0].children[0].children[0].characters, "a\xEF\xBF\xBD\r");
}

}  // namespace
}  // namespace cimhost::cimxml::test
