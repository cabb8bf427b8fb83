#include <gmock/gmock.h>

#include <cmath>
#include <limits>
#include <sstream>
#include <string>
#include <variant>

#include "host/schema/Schemas.h"
#include "schema/Literal.h"

namespace cimhost::test {
namespace {

/** An instance whose only property is a string. */
Instance instanceWith(const std::string& text) {
    Instance instance;
    instance.path.className = "C";
    instance.properties.push_back({"A", Value::of(CMPI_string, text)});
    return instance;
}

TEST(MofWriter, WritesEachKindOfValueAsAConstant) {
    EXPECT_EQ(formatMof(Value::of(CMPI_boolean, true)), "TRUE");
    EXPECT_EQ(formatMof(Value::of(CMPI_uint8, std::uint8_t{200})), "200");
    EXPECT_EQ(formatMof(Value::of(CMPI_sint64, std::int64_t{INT64_MIN})), "-9223372036854775808");
    EXPECT_EQ(formatMof(Value::of(CMPI_real64, 0.1)), "0.1");
    EXPECT_EQ(formatMof(Value::of(CMPI_real64, 3.0)), "3.0");
    EXPECT_EQ(formatMof(Value::of(CMPI_real64, 1e300)), "1.0e+300");
    EXPECT_EQ(formatMof(Value::of(CMPI_char16, Char16{u'a'})), "'a'");
    EXPECT_EQ(formatMof(Value::of(CMPI_char16, Char16{u'\''})), R"('\x0027')");
    EXPECT_EQ(formatMof(Value::of(CMPI_string, std::string("a\"b\\c\n\x01"))), R"("a\"b\\c\n\x0001")");
    EXPECT_EQ(formatMof(Value::of(CMPI_string, std::monostate{})), "NULL");
    EXPECT_EQ(formatMof(Value{CMPI_string, true, false}), "{}");
}

TEST(MofWriter, ValuesThatMofCannotExpressAreNull) {
    EXPECT_EQ(formatMof(Value::of(CMPI_real64, std::numeric_limits<double>::infinity())), "NULL");
    EXPECT_EQ(formatMof(Value::of(CMPI_real32, std::nanf(""))), "NULL");
    EXPECT_EQ(formatMof(Value::of(CMPI_ref, std::shared_ptr<const ObjectPath>())), "NULL");
}

TEST(MofWriter, AnInstanceHasReplacementCharactersInsteadOfInvalidUtf8) {
    struct Case {
        std::string value;
        std::string written;
    };
    const Case cases[] = {{"\xC3\xA9 \xE2\x82\xAC \xF0\x9F\x98\x80 \xED\x9F\xBF", "\u00E9 \u20AC \U0001F600 \uD7FF"},
                          {"a\xFF\xC0\x80z", "a\uFFFD\uFFFD\uFFFDz"},
                          {"\xE2\x82z", "\uFFFDz"}};
    for (const Case& each : cases) {
        EXPECT_EQ(formatMof(instanceWith(each.value)), "instance of C {\n    A = \"" + each.written + "\";\n};\n");
    }
}

TEST(MofWriter, ALongStringIsSeveralLiteralsAndIsReadBack) {
    std::string text;
    for (int number = 0; number < 1500; ++number) {
        text += number % 3 == 0 ? "\xE2\x82\xAC" : number % 3 == 1 ? "\x01" : "\"x";
    }
    const std::string written = formatMof(instanceWith(text));
    std::istringstream lines(written);
    std::size_t literals = 0;
    for (std::string line; std::getline(lines, line);) {
        const std::size_t begin = line.find('"');
        literals += begin != std::string::npos ? 1 : 0;
        EXPECT_TRUE(begin == std::string::npos || line.rfind('"') - begin - 1 <= 1023) << line;
    }
    EXPECT_GT(literals, 5U);
    Schema schema;
    MofReader(schema).readSource("class C { string A; }; " + written, "long text");
    EXPECT_EQ(std::get<std::string>(schema.instances().front().properties.front().value.single), text);
}

TEST(MofWriter, AShortStringIsOneLiteral) {
    const std::string text(1000, 'x');
    EXPECT_EQ(formatMof(instanceWith(text)), "instance of C {\n    A = \"" + text + "\";\n};\n");
    EXPECT_EQ(formatMof(instanceWith("")), "instance of C {\n    A = \"\";\n};\n");
    EXPECT_EQ(formatMof(instanceWith(text + "y")), "instance of C {\n    A = \"" + text + "\"\n        \"y\";\n};\n");
}

TEST(MofWriter, AControlCharacterBeforeAHexadecimalDigitIsReadBack) {
    const std::string text =
        "\x01"
        "2\x7F"
        "f";
    const std::string written = formatMof(Value::of(CMPI_string, text));
    const Schema schema = schemaOf("class C { string A = " + written + "; };");
    EXPECT_EQ(formatMof(schema.findClass("C")->properties.front().defaultValue), written);
}

TEST(MofWriter, TheLargestRealNumbersAreReadBack) {
    const char* text =
        "class C { [Key] real32 A; real64 B; };"
        "instance of C { A = -3.4028234663852886e38; B = 1.7976931348623157e308; };";
    Schema schema;
    MofReader(schema).readSource(text, "numbers");
    const std::string written = formatMof(schema.instances().front());
    MofReader(schema).readSource(written, "again");
    const auto& again = schema.instances().back().properties;
    EXPECT_EQ(std::get<float>(again[0].value.single), -std::numeric_limits<float>::max());
    EXPECT_EQ(std::get<double>(again[1].value.single), std::numeric_limits<double>::max());
}

TEST(MofWriter, EmbedsAnInstanceAsAString) {
    const auto inner = std::make_shared<const Instance>(
        Instance{{"", "", "Inner", {}}, {{"Text", Value::of(CMPI_string, std::string("x"))}}});
    EXPECT_EQ(formatMof(Value::of(CMPI_instance, inner)), R"("instance of Inner {\n    Text = \"x\";\n};\n")");
}

constexpr auto everything = R"(
    class Other { [Key] string Name; };
    class Every {
        [Key] string Key;
        boolean Flag; char16 Sign; uint8 U8; uint16 U16; uint32 U32; uint64 U64; sint8 S8; sint16 S16; sint32 S32;
        sint64 S64; real32 R32; real64 R64; string Text; datetime Time; Other REF Link;
        boolean Flags[]; char16 Signs[]; uint64 Many[]; real64 Reals[]; string Words[]; datetime Times[]; string None;
    };)";

constexpr auto filled = R"(instance of Every {
    Key = "the \"key\" of \\ it";
    Flag = FALSE;
    Sign = '\x20AC';
    U8 = 255;
    U16 = 65535;
    U32 = 4294967295;
    U64 = 18446744073709551615;
    S8 = -128;
    S16 = -32768;
    S32 = -2147483648;
    S64 = -9223372036854775808;
    R32 = 1.25;
    R64 = -1.0e-10;
    Text = "line one\nline two\t\x007F";
    Time = "20260131120000.000000+060";
    Link = "root/cimv2:Other.Name=\"a,b=\\\"c\\\"\"";
    Flags = {TRUE, FALSE, NULL};
    Signs = {'a', '\x0000'};
    Many = {0, 18446744073709551615};
    Reals = {0.5, 1.0e+100};
    Words = {"", "{a, b}", NULL};
    Times = {"00000001000000.000000:000"};
    None = NULL;
};
)";

TEST(MofWriter, WritesWhatTheReaderReadsForEveryType) {
    const Schema schema = schemaOf(everything + std::string(filled));
    ASSERT_EQ(schema.instances().size(), 1U);
    EXPECT_EQ(formatMof(schema.instances()[0]), filled);
}

TEST(MofWriter, RealsReadBackAsTheSameNumber) {
    for (const double real : {0.1, 1.0 / 3, 5e-324, 1.7976931348623157e308, 123456789.125, -0.0}) {
        const Schema schema = schemaOf("class C { real64 X = " + formatMof(Value::of(CMPI_real64, real)) + "; };");
        EXPECT_EQ(element<double>(schema.findClass("C")->properties[0].defaultValue), real);
    }
}

}  // namespace
}  // namespace cimhost::test
