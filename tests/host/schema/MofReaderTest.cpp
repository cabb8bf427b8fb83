#include <gtest/gtest.h>

#include "host/schema/Schemas.h"
#include "support/TemporaryDirectory.h"

namespace cimhost::test {
namespace {

Value defaultOf(const std::string& declaration) {
    const Schema schema = schemaOf("class C { " + declaration + " };");
    return schema.findClass("C")->properties.at(0).defaultValue;
}

TEST(MofReader, AnEmptyFileOrCommentsDeclareNothing) {
    EXPECT_TRUE(schemaOf("").classes().empty());
    EXPECT_TRUE(schemaOf("// one\n/* two\n * lines */ // at the end").classes().empty());
    EXPECT_TRUE(schemaOf("\xEF\xBB\xBF// after a byte order mark").classes().empty());
}

TEST(MofReader, TokensMayBeSeparatedByComments) {
    const Schema schema = schemaOf("/**/[/**/Key/**/]//\nclass/**/C/**/{/**/[Key]string/**/K/*;*/;/**/}/**/;");
    EXPECT_TRUE(schema.findClass("C")->findProperty("K")->isKey());
}

TEST(MofReader, KeywordsIgnoreLetterCase) {
    const Schema schema = schemaOf("CLASS A { STRING X = NULL; Boolean Y = True; }; Class B { a ReF Z; };");
    EXPECT_EQ(schema.findClass("A")->properties[0].type, CMPI_string);
    EXPECT_TRUE(element<bool>(schema.findClass("A")->properties[1].defaultValue));
    EXPECT_EQ(schema.findClass("B")->properties[0].type, CMPI_ref);
}

TEST(MofReader, ReadsEveryIntrinsicType) {
    const std::pair<const char*, CMPIType> types[] = {
        {"boolean", CMPI_boolean}, {"char16", CMPI_char16}, {"string", CMPI_string}, {"datetime", CMPI_dateTime},
        {"uint8", CMPI_uint8},     {"uint16", CMPI_uint16}, {"uint32", CMPI_uint32}, {"uint64", CMPI_uint64},
        {"sint8", CMPI_sint8},     {"sint16", CMPI_sint16}, {"sint32", CMPI_sint32}, {"sint64", CMPI_sint64},
        {"real32", CMPI_real32},   {"real64", CMPI_real64}};
    for (const auto& [name, type] : types) {
        const Schema schema = schemaOf("class C { " + std::string(name) + " One; " + name + " Many[]; };");
        const Class& c = *schema.findClass("C");
        EXPECT_EQ(c.properties[0].type, type) << name;
        EXPECT_FALSE(c.properties[0].isArray) << name;
        EXPECT_TRUE(c.properties[0].defaultValue.isNull) << name;
        EXPECT_EQ(c.properties[1].type, type) << name;
        EXPECT_TRUE(c.properties[1].isArray) << name;
    }
}

TEST(MofReader, ReadsIntegersOfAllBases) {
    EXPECT_EQ(element<std::uint32_t>(defaultOf("uint32 X = 1234;")), 1234U);
    EXPECT_EQ(element<std::uint32_t>(defaultOf("uint32 X = 0xFf;")), 255U);
    EXPECT_EQ(element<std::uint32_t>(defaultOf("uint32 X = 0777;")), 511U);
    EXPECT_EQ(element<std::uint32_t>(defaultOf("uint32 X = 1011b;")), 11U);
    EXPECT_EQ(element<std::uint32_t>(defaultOf("uint32 X = 0;")), 0U);
    EXPECT_EQ(element<std::int32_t>(defaultOf("sint32 X = -0x10;")), -16);
    EXPECT_EQ(element<std::int32_t>(defaultOf("sint32 X = +7;")), 7);
}

TEST(MofReader, ReadsTheLimitsOfIntegerTypes) {
    EXPECT_EQ(element<std::uint64_t>(defaultOf("uint64 X = 18446744073709551615;")), UINT64_MAX);
    EXPECT_EQ(element<std::int64_t>(defaultOf("sint64 X = -9223372036854775808;")), INT64_MIN);
    EXPECT_EQ(element<std::int8_t>(defaultOf("sint8 X = -128;")), -128);
    EXPECT_EQ(element<std::uint8_t>(defaultOf("uint8 X = 255;")), 255);
}

TEST(MofReader, ReadsReals) {
    EXPECT_DOUBLE_EQ(element<double>(defaultOf("real64 X = -12.5e-3;")), -0.0125);
    EXPECT_DOUBLE_EQ(element<double>(defaultOf("real64 X = .5;")), 0.5);
    EXPECT_DOUBLE_EQ(element<double>(defaultOf("real64 X = 3;")), 3.0);
    EXPECT_FLOAT_EQ(element<float>(defaultOf("real32 X = 1.25;")), 1.25F);
}

TEST(MofReader, ReadsStringsWithEscapesAndJoinsThem) {
    EXPECT_EQ(element<std::string>(defaultOf(R"(string X = "one " /* and */ "two"
                                                "\"\\\'\b\t\n\f\r";)")),
              "one two\"\\'\b\t\n\f\r");
    EXPECT_EQ(element<std::string>(defaultOf(R"(string X = "";)")), "");
    EXPECT_EQ(element<std::string>(defaultOf(R"(string X = "\x41\xe9\x20AC\xD83D\xDE00";)")),
              "A\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80");
    EXPECT_EQ(element<std::string>(defaultOf(R"(string X = "\x4" "1";)")),
              "\x04"
              "1");
    EXPECT_EQ(element<std::string>(defaultOf("string X = \"// no comment /* here */\";")), "// no comment /* here */");
}

TEST(MofReader, ReadsCharactersDateTimesAndNull) {
    EXPECT_EQ(element<Char16>(defaultOf("char16 X = 'a';")).code, u'a');
    EXPECT_EQ(element<Char16>(defaultOf(R"(char16 X = '\'';)")).code, u'\'');
    EXPECT_EQ(element<Char16>(defaultOf(R"(char16 X = '\xD83D';)")).code, 0xD83D);
    EXPECT_EQ(element<Char16>(defaultOf("char16 X = '\xE2\x82\xAC';")).code, 0x20AC);
    EXPECT_EQ(element<DateTime>(defaultOf("datetime X = \"20260131120000.000000+060\";")).value,
              "20260131120000.000000+060");
    EXPECT_TRUE(defaultOf("uint8 X = null;").isNull);
}

TEST(MofReader, ReadsArrays) {
    const Value numbers = defaultOf("uint16 X[3] = {1, 0x2, null};");
    ASSERT_EQ(numbers.elements().size(), 3U);
    EXPECT_EQ(std::get<std::uint16_t>(numbers.elements()[1]), 2);
    EXPECT_TRUE(std::holds_alternative<std::monostate>(numbers.elements()[2]));
    const Value none = defaultOf("string X[] = {};");
    EXPECT_TRUE(none.elements().empty());
    EXPECT_FALSE(none.isNull);
    EXPECT_TRUE(defaultOf("string X[] = null;").isNull);
    EXPECT_TRUE(defaultOf("string X[] = null;").isArray);
}

TEST(MofReader, ReadsQualifiersOfEveryForm) {
    const Schema schema = schemaOf(R"(
        Qualifier Level : uint16 = 3, Scope(any), Flavor(DisableOverride, Restricted);
        Qualifier Rates : real64[] = {1.5}, Scope(property);
        Qualifier Sign : char16, Scope(property);
        [Description ("a " "b"), Level : EnableOverride ToSubclass] class C {
            [Level(7), Rates{1.0, 2.5}, Sign('x'), Values{"a", "b"}, MaxLen(0x10), Write, Read(false)] string P;
            [Rates] string Q;
        };)");
    const Class& c = *schema.findClass("C");
    EXPECT_EQ(element<std::string>(c.findQualifier("Description")->value), "a b");
    EXPECT_EQ(element<std::uint16_t>(c.findQualifier("Level")->value), 3);
    EXPECT_TRUE(c.findQualifier("Level")->flavor.overridable);
    EXPECT_TRUE(c.findQualifier("Level")->flavor.toSubclass);
    const Property& p = *c.findProperty("P");
    EXPECT_EQ(element<std::uint16_t>(p.findQualifier("Level")->value), 7);
    EXPECT_FALSE(p.findQualifier("Level")->flavor.overridable);
    EXPECT_FALSE(p.findQualifier("Level")->flavor.toSubclass);
    EXPECT_EQ(formatMof(p.findQualifier("Rates")->value), "{1.0, 2.5}");
    EXPECT_EQ(element<Char16>(p.findQualifier("Sign")->value).code, u'x');
    EXPECT_EQ(formatMof(p.findQualifier("values")->value), R"({"a", "b"})");
    EXPECT_EQ(element<std::uint32_t>(p.findQualifier("MaxLen")->value), 16U);
    EXPECT_TRUE(element<bool>(p.findQualifier("Write")->value));
    EXPECT_FALSE(element<bool>(p.findQualifier("Read")->value));
    EXPECT_EQ(formatMof(c.findProperty("Q")->findQualifier("Rates")->value), "{1.5}");
}

TEST(MofReader, AFileMayDeclareAStandardQualifierItself) {
    const Schema schema = schemaOf(R"(
        Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride, ToSubclass);
        class C { [Key] string K; };)");
    EXPECT_TRUE(schema.findClass("C")->properties[0].isKey());
    EXPECT_FALSE(schema.findQualifier("key")->standard);
}

TEST(MofReader, StoresMethodsByNameAndIgnoresTheirParameters) {
    const Schema schema = schemaOf(R"(
        class C {
            [Description("starts it")]
            uint32 Start([In, Description("how")] string How, [In(false), Out] C REF Job, uint8 Levels[4]);
            string Name;
            boolean Stop();
        };)");
    const Class& c = *schema.findClass("C");
    ASSERT_EQ(c.methods.size(), 2U);
    EXPECT_EQ(c.methods[0].name, "Start");
    EXPECT_EQ(c.methods[1].name, "Stop");
    ASSERT_EQ(c.properties.size(), 1U);
    EXPECT_EQ(c.properties[0].name, "Name");
}

TEST(MofReader, APropertyMayHaveTheNameOfAKeyword) {
    const Schema schema = schemaOf("class C { string Ref; string Class; uint8 Instance; C REF Of; };");
    EXPECT_EQ(schema.findClass("C")->properties[0].name, "Ref");
    EXPECT_EQ(schema.findClass("C")->properties[0].type, CMPI_string);
    EXPECT_EQ(schema.findClass("C")->properties[3].referenceClass, "C");
}

TEST(MofReader, OtherPragmasAreIgnored) {
    EXPECT_NE(schemaOf("#pragma locale (\"en_US\")\n#pragma namespace(\"root/x\")\nclass C {};").findClass("C"),
              nullptr);
}

TEST(MofReader, IncludesAreRelativeToTheFileThatIncludes) {
    const testsupport::TemporaryDirectory directory;
    directory.write("sub/base.mof", "class Base { [Key] string Name; };");
    directory.write("sub/all.mof", "#pragma include (\"base.mof\")\nclass Derived : Base {};");
    const auto top = directory.write("top.mof", "#pragma include (\"sub/all.mof\")\nclass Top : Derived {};");
    Schema schema;
    MofReader(schema).readFile(top);
    EXPECT_TRUE(schema.isA("Top", "Base"));
}

TEST(MofReader, AFileThatIsIncludedSeveralTimesIsReadOnce) {
    const testsupport::TemporaryDirectory directory;
    const auto base = directory.write("base.mof", "#pragma include (\"base.mof\")\nclass Base {};");
    const auto top = directory.write("top.mof", "#pragma include (\"base.mof\")\n#pragma include (\"./base.mof\")\n");
    Schema schema;
    MofReader reader(schema);
    reader.readFile(base);
    reader.readFile(top);
    EXPECT_EQ(schema.classes().size(), 1U);
}

}  // namespace
}  // namespace cimhost::test
