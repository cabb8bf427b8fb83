#include <gmock/gmock.h>

#include "host/schema/Schemas.h"
#include "schema/Literal.h"
#include "schema/ObjectPathText.h"

namespace cimhost::test {
namespace {

using testing::AllOf;
using testing::HasSubstr;

const Schema& schema() {
    static const Schema known = schemaOf(R"(
        class Disk { [Key] string ID; };
        class Slot { [Key] uint32 Number; [Key] boolean Upper; [Key] sint8 Level; string Note; };
        class Visit { [Key] datetime At; [Key] char16 Mark; };
        [Association] class Holds { [Key] Slot REF Holder; [Key] Disk REF Held; };
        class Loose { string Text; };)");
    return known;
}

ObjectPath parse(const std::string& text) {
    return parseObjectPath(text, schema(), "root/cimv2");
}

std::string refusal(const std::string& text) {
    try {
        parse(text);
        return "";
    } catch (const PathError& error) {
        return error.what();
    }
}

TEST(ObjectPath, HasNamespaceClassAndTypedKeys) {
    const ObjectPath path = parse(R"(root/other:Slot.Number=5,Upper=true,Level=-3)");
    EXPECT_EQ(path.host, "");
    EXPECT_EQ(path.nameSpace, "root/other");
    EXPECT_EQ(path.className, "Slot");
    ASSERT_EQ(path.keys.size(), 3U);
    EXPECT_EQ(described(path.keys[0].value), described(Value::of(CMPI_uint32, std::uint32_t{5})));
    EXPECT_EQ(described(path.keys[1].value), described(Value::of(CMPI_boolean, true)));
    EXPECT_EQ(described(path.keys[2].value), described(Value::of(CMPI_sint8, std::int8_t{-3})));
}

TEST(ObjectPath, WithoutNamespaceHasTheDefaultNamespace) {
    EXPECT_EQ(parse("Disk").nameSpace, "root/cimv2");
    EXPECT_EQ(parse(":Disk").nameSpace, "root/cimv2");
    EXPECT_EQ(parse(R"(Disk.ID="a:b/c.d=e")").nameSpace, "root/cimv2");
    EXPECT_EQ(parse("root:Disk").nameSpace, "root");
    EXPECT_EQ(parse("root/PG_InterOp-2:Disk").nameSpace, "root/PG_InterOp-2");
}

TEST(ObjectPath, MayNameAHostAndBeginWithASlash) {
    EXPECT_EQ(parse("//example.org:5988/root/cimv2:Disk").host, "example.org:5988");
    EXPECT_EQ(parse("//[::1]/Disk").host, "[::1]");
    EXPECT_EQ(parse("/root/cimv2:Disk").host, "");
    EXPECT_EQ(parse("/root/cimv2:Disk").nameSpace, "root/cimv2");
}

TEST(ObjectPath, PreservesTheUsersLetterCase) {
    const ObjectPath path = parse(R"(dISK.iD="x")");
    EXPECT_EQ(path.className, "dISK");
    EXPECT_EQ(path.keys[0].name, "iD");
    EXPECT_EQ(path.keys[0].value.type, CMPI_string);
}

TEST(ObjectPath, StringKeysMayContainEscapesAndAnyOtherByte) {
    const auto text = [](const std::string& path) { return element<std::string>(parse(path).keys.at(0).value); };
    EXPECT_EQ(text(R"(Disk.ID="a\"b\\c")"), "a\"b\\c");
    EXPECT_EQ(text(R"(Disk.ID="")"), "");
    EXPECT_EQ(text(R"(Disk.ID="\x00411\x1\x2z")"), "A1\x01\x02z");
    EXPECT_EQ(text("Disk.ID=\"a\nb\xFF,c=\\x0041\""), "a\nb\xFF,c=A");
}

TEST(ObjectPath, DateTimeAndCharacterKeysAreTypedByTheClass) {
    const ObjectPath path = parse(R"(Visit.At="20260131120000.000000+060",Mark='x')");
    EXPECT_EQ(element<DateTime>(path.keys[0].value).value, "20260131120000.000000+060");
    EXPECT_EQ(element<Char16>(path.keys[1].value).code, u'x');
}

TEST(ObjectPath, AReferenceKeyIsAPathInQuotationMarks) {
    const ObjectPath path = parse(R"(Holds.Holder="other:Slot.Number=7",Held="Disk.ID=\"a\\\"b\"")");
    const auto holder = element<std::shared_ptr<const ObjectPath>>(path.keys[0].value);
    const auto held = element<std::shared_ptr<const ObjectPath>>(path.keys[1].value);
    EXPECT_EQ(path.keys[0].value.type, CMPI_ref);
    EXPECT_EQ(holder->nameSpace, "other");
    EXPECT_EQ(element<std::uint32_t>(holder->keys[0].value), 7U);
    EXPECT_EQ(held->nameSpace, "root/cimv2");
    EXPECT_EQ(element<std::string>(held->keys[0].value), "a\"b");
}

TEST(ObjectPath, OfAnUnknownClassHasKeysTypedByTheirForm) {
    const ObjectPath path = parse(R"(Unknown.A="x",B=5,C=-5,D=TRUE,E=1.5,F=0x10)");
    const CMPIType types[] = {CMPI_string, CMPI_uint64, CMPI_sint64, CMPI_boolean, CMPI_real64, CMPI_uint64};
    ASSERT_EQ(path.keys.size(), std::size(types));
    for (std::size_t i = 0; i < std::size(types); ++i) {
        EXPECT_EQ(path.keys[i].value.type, types[i]) << path.keys[i].name;
    }
    EXPECT_EQ(element<std::uint64_t>(path.keys[5].value), 16U);
}

TEST(ObjectPath, SomeKeysAreEnough) {
    EXPECT_EQ(parse("Slot.Upper=false").keys.size(), 1U);
}

class PathRoundTrip : public testing::TestWithParam<const char*> {};
TEST_P(PathRoundTrip, TheWriterWritesWhatTheReaderRead) {
    EXPECT_EQ(formatObjectPath(parse(GetParam())), GetParam());
}
INSTANTIATE_TEST_SUITE_P(
    Paths, PathRoundTrip,
    testing::Values("root/cimv2:Disk", R"(root/cimv2:Disk.ID="L1")", R"(//host:1/root/cimv2:Disk.ID="a\"b\\c\n\x0001")",
                    "root/cimv2:Slot.Number=4294967295,Upper=FALSE,Level=-128",
                    R"(root/cimv2:Visit.At="20260131120000.000000+060",Mark='\x20AC')",
                    R"(r:Holds.Holder="r:Slot.Number=7",Held="//h/r:Disk.ID=\"a\\\"b\\\\c\"")",
                    R"(root/cimv2:Unknown.A="x",B=18446744073709551615,C=-9223372036854775808,D=TRUE,E=1.5)"));

TEST(ObjectPath, AStringOfEveryByteSurvivesWritingAndReading) {
    std::string all;
    for (int byte = 1; byte < 256; ++byte) {
        all += static_cast<char>(byte);
    }
    const ObjectPath path{"", "n", "Disk", {{"ID", Value::of(CMPI_string, all)}}};
    EXPECT_EQ(element<std::string>(parse(formatObjectPath(path)).keys[0].value), all);
}

TEST(ObjectPathError, AStringKeyNeedsQuotationMarks) {
    EXPECT_THAT(refusal("Disk.ID=5"), AllOf(HasSubstr("key ID: 5 is not a string"), HasSubstr("\"5\"")));
    EXPECT_THAT(refusal("Disk.ID=L1"), AllOf(HasSubstr("character 9: expected a key's value"), HasSubstr("shell")));
    EXPECT_THAT(refusal("Disk.ID=true"), HasSubstr("true is not a string"));
}

TEST(ObjectPathError, NumbersMustFitTheirType) {
    EXPECT_THAT(refusal("Slot.Number=4294967296"), HasSubstr("key Number: 4294967296 is not a uint32"));
    EXPECT_THAT(refusal("Slot.Number=-1"), HasSubstr("from 0 to 4294967295"));
    EXPECT_THAT(refusal("Slot.Level=128"), HasSubstr("from -128 to 127"));
    EXPECT_THAT(refusal("Slot.Number=\"5\""), HasSubstr("is not a uint32"));
    EXPECT_THAT(refusal("Unknown.A=99999999999999999999"), HasSubstr("is not a uint64"));
    EXPECT_THAT(refusal("Slot.Upper=1"), HasSubstr("true or false"));
}

TEST(ObjectPathError, KeysMustBelongToTheClassAndBeUnique) {
    EXPECT_THAT(refusal("Slot.Nummer=1"), HasSubstr("class Slot has no key Nummer; its keys are Number, Upper, Level"));
    EXPECT_THAT(refusal("Slot.Note=\"x\""), HasSubstr("no key Note"));
    EXPECT_THAT(refusal("Loose.Text=\"x\""), HasSubstr("it has no keys"));
    EXPECT_THAT(refusal("Slot.Number=1,number=2"), HasSubstr("key number is given twice"));
    EXPECT_THAT(refusal("Unknown.A=1,a=2"), HasSubstr("key a is given twice"));
    EXPECT_THAT(refusal("Disk.ID=null"), HasSubstr("cannot be null"));
}

TEST(ObjectPathError, ReferencesAreCheckedToTheirEnd) {
    EXPECT_THAT(refusal("Holds.Held=5"), HasSubstr("path of a Disk"));
    EXPECT_THAT(refusal("Holds.Held=\"Slot.Number=1\""), HasSubstr("must refer to a Disk"));
    EXPECT_THAT(refusal("Holds.Held=\"Disk.ID=5\""), HasSubstr("5 is not a string"));
    EXPECT_THAT(refusal("Holds.Held=\"\""), HasSubstr("expected a class name"));
}

struct BadPath {
    const char* text;
    const char* expected;
};
void PrintTo(const BadPath& bad, std::ostream* out) {
    *out << bad.text;
}

class MalformedPath : public testing::TestWithParam<BadPath> {};
TEST_P(MalformedPath, IsRejectedWithItsPosition) {
    EXPECT_THAT(refusal(GetParam().text), HasSubstr(GetParam().expected));
}
INSTANTIATE_TEST_SUITE_P(
    Paths, MalformedPath,
    testing::Values(BadPath{"", "character 1: expected a class name"},
                    BadPath{"Disk.", "character 6: expected a key name"}, BadPath{"Disk.ID", "character 8: expected ="},
                    BadPath{"Disk.ID=", "character 9: expected a key's"},
                    BadPath{"Disk.ID=\"x", "character 11: expected the closing"},
                    BadPath{"Disk.ID=\"x\\", "character 11: expected the closing"},
                    BadPath{"Disk.ID=\"x\\q\"", "character 11: expected the closing"},
                    BadPath{"Disk.ID=\"x\",", "character 13: expected"},
                    BadPath{"Disk.ID=\"x\" ", "character 12: expected the end"},
                    BadPath{" Disk", "character 1: expected a class name"}, BadPath{"Disk Drive", "character 5:"},
                    BadPath{"root/cimv2", "character 5:"}, BadPath{"root//cimv2:Disk", "character 5:"},
                    BadPath{"root/cimv2:", "character 12: expected a class name"},
                    BadPath{"//", "character 3: expected a host name"},
                    BadPath{"//host", "character 7: expected / after"}, BadPath{"http://h/r:Disk", "character 6"},
                    BadPath{"1Disk", "character 1"}, BadPath{"Disk.ID==\"x\"", "character 9"},
                    BadPath{"Disk.ID=\"\\xD800\"", "surrogate"}, BadPath{"Disk.ID=\"\\x0\"", "\\x0"}));

TEST(ObjectPathError, ANullCharacterIsInvalidInAKey) {
    using namespace std::string_view_literals;
    EXPECT_NE(refusal(std::string("Disk.ID=\"a\0b\""sv)), "");
}

TEST(ObjectPathError, DeepNestingAndLongPathsAreRejectedQuickly) {
    std::string nested = "Disk.ID=";
    for (int depth = 0; depth < 200; ++depth) {
        nested = "Holds.Held=\"" + nested + "\"";
    }
    EXPECT_NE(refusal(nested), "");
    EXPECT_NE(refusal(std::string(1 << 20, '/')), "");
    EXPECT_NE(refusal("Disk.ID=\"" + std::string(1 << 20, '\\')), "");
    EXPECT_NE(refusal("Slot.Number=" + std::string(1 << 20, '9')), "");
    EXPECT_EQ(parse("Disk.ID=\"" + std::string(1 << 20, 'x') + "\"").keys.size(), 1U);
}

}  // namespace
}  // namespace cimhost::test
