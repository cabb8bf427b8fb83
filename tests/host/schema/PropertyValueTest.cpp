#include <gmock/gmock.h>

#include "host/schema/Schemas.h"
#include "schema/Literal.h"

namespace cimhost::test {
namespace {

using testing::HasSubstr;
using testing::StartsWith;

const Schema& everySchema() {
    static const Schema known = schemaOf(R"(
        class Disk { [Key] string ID; };
        class Every {
            boolean Flag; char16 Sign; uint8 U8; sint64 S64; real32 R32; string Text; datetime Time; Disk REF Link;
            uint16 Numbers[]; string Words[]; Disk REF Links[];
        };)");
    return known;
}

Value parse(const std::string& property, const std::string& text) {
    return parsePropertyValue(text, *everySchema().findClass("Every")->findProperty(property), everySchema(),
                              "root/cimv2");
}

std::string refusal(const std::string& property, const std::string& text) {
    try {
        parse(property, text);
        return "";
    } catch (const std::runtime_error& error) {
        return error.what();
    }
}

TEST(PropertyValue, AStringIsUnchanged) {
    for (const char* text : {"", "plain", "null", "5", "\"in quotation marks\"", "back\\slash", "{1}"}) {
        EXPECT_EQ(element<std::string>(parse("Text", text)), text);
    }
}

TEST(PropertyValue, OtherTypesAreConstants) {
    EXPECT_TRUE(element<bool>(parse("Flag", "TRUE")));
    EXPECT_FALSE(element<bool>(parse("Flag", "false")));
    EXPECT_EQ(element<std::uint8_t>(parse("U8", "0xff")), 255);
    EXPECT_EQ(element<std::int64_t>(parse("S64", "-12")), -12);
    EXPECT_FLOAT_EQ(element<float>(parse("R32", "1.5")), 1.5F);
    EXPECT_FLOAT_EQ(element<float>(parse("R32", "2")), 2.0F);
    EXPECT_EQ(element<DateTime>(parse("Time", "20260131120000.000000+060")).value, "20260131120000.000000+060");
    EXPECT_EQ(element<DateTime>(parse("Time", "00000000000000.000000+000")).value, "00000000000000.000000+000");
}

TEST(PropertyValue, ACharacterMayBeInApostrophes) {
    EXPECT_EQ(element<Char16>(parse("Sign", "x")).code, u'x');
    EXPECT_EQ(element<Char16>(parse("Sign", "'x'")).code, u'x');
    EXPECT_EQ(element<Char16>(parse("Sign", "'")).code, u'\'');
    EXPECT_EQ(element<Char16>(parse("Sign", "\xE2\x82\xAC")).code, 0x20AC);
    EXPECT_NE(refusal("Sign", ""), "");
    EXPECT_NE(refusal("Sign", "xy"), "");
    EXPECT_NE(refusal("Sign", "\xFF"), "");
}

TEST(PropertyValue, AReferenceIsAPathWithoutQuotationMarks) {
    const auto link = element<std::shared_ptr<const ObjectPath>>(parse("Link", "Disk.ID=\"a\""));
    EXPECT_EQ(link->nameSpace, "root/cimv2");
    EXPECT_EQ(element<std::string>(link->keys[0].value), "a");
    EXPECT_THAT(refusal("Link", "Disk.ID=a"), StartsWith("Link: object path Disk.ID=a: character 9"));
}

TEST(PropertyValue, AnArrayIsAListInBraces) {
    EXPECT_EQ(formatMof(parse("Numbers", "{1, 0x10,3}")), "{1, 16, 3}");
    EXPECT_EQ(formatMof(parse("Numbers", " { } ")), "{}");
    EXPECT_EQ(formatMof(parse("Words", R"({"a, b", "c\"d"})")), R"({"a, b", "c\"d"})");
    EXPECT_EQ(formatMof(parse("Links", R"({"Disk.ID=\"x\""})")), R"({"root/cimv2:Disk.ID=\"x\""})");
}

TEST(PropertyValue, AnErrorNamesThePropertyAndTheRemedy) {
    EXPECT_THAT(refusal("U8", "256"), StartsWith("U8: 256 is not a uint8: it must be an integer from 0 to 255"));
    EXPECT_THAT(refusal("U8", ""), HasSubstr("an empty string is not a uint8"));
    EXPECT_THAT(refusal("U8", "null"), HasSubstr("null is not a uint8"));
    EXPECT_THAT(refusal("U8", "5x"), HasSubstr("5x is not a uint8"));
    EXPECT_THAT(refusal("Flag", "yes"), HasSubstr("true or false"));
    EXPECT_THAT(refusal("Time", "2026-01-31"), HasSubstr("25 characters"));
    EXPECT_THAT(refusal("Numbers", "1,2"), HasSubstr("expected a list of values in braces"));
    EXPECT_THAT(refusal("Numbers", "{1} {2}"), HasSubstr("nothing more"));
    EXPECT_THAT(refusal("Numbers", "{\"a\"}"), HasSubstr("is not a uint16"));
}

}  // namespace
}  // namespace cimhost::test
