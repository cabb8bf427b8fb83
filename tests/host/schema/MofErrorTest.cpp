#include <gmock/gmock.h>

#include "host/schema/Schemas.h"
#include "support/TemporaryDirectory.h"

namespace cimhost::test {
namespace {

using testing::EndsWith;
using testing::HasSubstr;
using testing::StartsWith;

struct BadMof {
    const char* name;
    const char* text;
    const char* position;  ///< line:column
    const char* expected;  ///< part of the message
};

void PrintTo(const BadMof& bad, std::ostream* out) {
    *out << bad.name;
}

class MofError : public testing::TestWithParam<BadMof> {};

TEST_P(MofError, NamesThePositionAndTheExpectedToken) {
    const std::string message = refusalOf(GetParam().text);
    EXPECT_THAT(message, StartsWith("test.mof:" + std::string(GetParam().position) + ": "));
    EXPECT_THAT(message, HasSubstr(GetParam().expected));
}

std::string nameOf(const testing::TestParamInfo<BadMof>& info) {
    return info.param.name;
}

const BadMof syntax[] = {
    {"NoDeclaration", "klass C {};", "1:1", "expected #pragma, \"qualifier\", \"class\""},
    {"NoClassName", "class {};", "1:7", "expected a class name"},
    {"MissingBody", "class C;", "1:8", "expected {"},
    {"NoSemicolonAfterClass", "class C {}\nclass D {};", "2:1", "expected ;"},
    {"NoSemicolonAfterProperty", "class C {\n  string A\n  string B;\n};", "3:3", "expected ;"},
    {"NoPropertyName", "class C { string ; };", "1:18", "expected the name of a property"},
    {"ClassNotClosed", "class C { string A;", "1:20", "the } that ends the class"},
    {"NothingAfterQualifiers", "class C { [Key] };", "1:17", "expected a property, a reference or a method"},
    {"QualifierListNotClosed", "class C { [Key string A; };", "1:16", "expected a comma or ]"},
    {"EmptyQualifierList", "[] class C {};", "1:2", "expected a qualifier's name"},
    {"CommaButNoQualifier", "[Key,] class C {};", "1:6", "expected a qualifier's name"},
    {"QualifiersOfNothing", "[Key] string X;", "1:7", "expected \"class\" or \"instance of\""},
    {"NoQualifierValue", "[Description()] class C {};", "1:14", "expected a value"},
    {"QualifierValueNotClosed", "[Description(\"a\"] class C {};", "1:17", "expected )"},
    {"NoFlavor", "[Key:] class C {};", "1:6", "expected a flavor"},
    {"NoSuperclass", "class C : {};", "1:11", "expected the name of the superclass"},
    {"NoDefault", "class C { uint8 A = ; };", "1:21", "expected a value or a list"},
    {"ListNotClosed", "class C { uint8 A[] = {1, 2; };", "1:28", "expected a comma or }"},
    {"CommaButNoValue", "class C { uint8 A[] = {1,}; };", "1:26", "expected a value"},
    {"NumberWithLetters", "class C { uint8 A = 12ab; };", "1:21", "expected a value"},
    {"OctalWithEight", "class C { uint8 A = 08; };", "1:21", "expected a value"},
    {"StringNotClosed", "class C { string A = \"abc;\n};", "1:27", "closing quotation mark"},
    {"UnknownEscape", "class C { string A = \"a\\qb\"; };", "1:24", "one of the escapes"},
    {"CommentNotClosed", "class C {}; /* and so on", "1:13", "expected */"},
    {"NoOf", "instance C {};", "1:10", "expected \"of\""},
    {"BadAssignment", "class C { string A; }; instance of C { A \"x\"; };", "1:42", "expected ="},
    {"InstanceNotClosed", "class C { string A; }; instance of C { A = \"x\"; ", "1:49", "the } that ends the instance"},
    {"NoScope", "Qualifier Q : string;", "1:21", "expected a comma"},
    {"UnknownScope", "Qualifier Q : string, Scope(klass);", "1:29", "expected a scope"},
    {"UnknownPragmaForm", "#pragma include file.mof", "1:17", "expected ("},
    {"NotPragma", "#include \"x\"", "1:2", "expected \"pragma\""},
    {"ControlByte", "class\x01 C {};", "1:6", "expected a class name"},
};
INSTANTIATE_TEST_SUITE_P(Syntax, MofError, testing::ValuesIn(syntax), nameOf);

const BadMof meaning[] = {
    {"UnknownType", "class C {\n    strnig A; };", "2:5", "strnig is not a data type"},
    {"UnknownQualifier", "class C { [Kye] string A; };", "1:12", "qualifier Kye is not declared"},
    {"QualifierTwice", "class C { [Key, key] string A; };", "1:17", "given twice"},
    {"UnknownFlavor", "[Key : Sweet] class C {};", "1:8", "Sweet is not a flavor"},
    {"UnknownSuperclass", "class C : D {};", "1:1", "superclass D of class C is not declared"},
    {"ClassTwice", "class C {};\nclass c {};", "2:1", "class c is declared a second time"},
    {"PropertyTwice", "class C { string A; uint8 a; };", "1:1", "declares the property a twice"},
    {"OverrideOfOtherType", "class C { string A; }; class D : C { uint8 A; };", "1:24", "C declares it as string"},
    {"OverrideOfOtherShape", "class C { string A; }; class D : C { string A[]; };", "1:24", "D.A is string[]"},
    {"ValueTooLarge", "class C { uint8 A = 256; };", "1:21", "an integer from 0 to 255"},
    {"ValueTooLow", "class C { sint8 A = -129; };", "1:21", "an integer from -128 to 127"},
    {"NegativeUnsigned", "class C { uint32 A = -1; };", "1:22", "an integer from 0 to 4294967295"},
    {"ValueOfMoreThan64Bits", "class C { uint64 A = 18446744073709551616; };", "1:22", "18446744073709551616 is not"},
    {"NumberForString", "class C { string A = 5; };", "1:22", "write it in quotation marks, \"5\""},
    {"StringForNumber", "class C { uint8 A = \"5\"; };", "1:21", "is not a uint8"},
    {"NumberForBoolean", "class C { boolean A = 1; };", "1:23", "true or false"},
    {"NoDateTime", "class C { datetime A = \"tomorrow\"; };", "1:24", "25 characters"},
    {"RealTooLarge", "class C { real32 A = 1.0e39; };", "1:22", "out of range"},
    {"RealBeyondDouble", "class C { real64 A = 1.0e999; };", "1:22", "out of range"},
    {"HalfACharacter", "class C { string A = \"\\xD800\"; };", "1:22", "surrogate"},
    {"NulCharacter", "class C { string A = \"\\x0\"; };", "1:22", "\\x0"},
    {"CharacterOf17Bits", "class C { char16 A = '\xF0\x9F\x98\x80'; };", "1:22", "16 bits"},
    {"ListForOneValue", "class C { uint8 A = {1}; };", "1:21", "A is not an array"},
    {"OneValueForList", "class C { uint8 A[] = 1; };", "1:23", "A is an array"},
    {"QualifierOfOtherType", "[Key(5)] class C {};", "1:6", "true or false"},
    {"QualifierDeclaredTwice", "Qualifier Q : string, Scope(any);\nQualifier q : string, Scope(any);", "2:1",
     "qualifier q is declared a second time"},
    {"InstanceOfUnknownClass", "instance of C {};", "1:13", "class C is not declared"},
    {"UnknownPropertyOfInstance", "class C {}; instance of C { A = 1; };", "1:29", "class C has no property A"},
    {"InstanceWithoutKey", "class C { [Key] string A; }; instance of C {};", "1:30", "the key A has no value"},
    {"InstanceWithNullKey", "class C { [Key] string A; }; instance of C { A = null; };", "1:30", "A has no value"},
    {"PropertyAssignedTwice", "class C { string A; }; instance of C { A = \"1\"; a = \"2\"; };", "1:49", "given twice"},
    {"UnknownAlias", "class C { C REF A; }; instance of C { A = $B; };", "1:43", "$B is not an alias"},
    {"AliasForString", "class C { [Key] string A; }; instance of C as $X { A = \"\"; }; instance of C { A = $X; };",
     "1:83", "not a reference"},
    {"MissingInclude", "class C {};\n#pragma include (\"missing.mof\")", "2:1",
     "missing.mof: this file does not exist"},
};
INSTANTIATE_TEST_SUITE_P(Meaning, MofError, testing::ValuesIn(meaning), nameOf);

TEST(MofErrorOfBytes, ANullCharacterIsInvalidInAString) {
    using namespace std::string_literals;
    EXPECT_THAT(refusalOf("class C { string A = \"a\0\"; };"s), StartsWith("test.mof:1:22: a string cannot hold"));
}

TEST(MofFile, AMissingFileAndADirectoryAreErrors) {
    const testsupport::TemporaryDirectory directory;
    Schema schema;
    MofReader reader(schema);
    try {
        reader.readFile(directory.path() / "none.mof");
        FAIL() << "there is no such file";
    } catch (const LoadError& error) {
        EXPECT_THAT(error.what(), EndsWith("none.mof: this file does not exist"));
    }
    EXPECT_THROW(reader.readFile(directory.path()), LoadError);
}

TEST(MofFile, AnErrorInAnIncludedFileNamesThatFile) {
    const testsupport::TemporaryDirectory directory;
    const auto bad = directory.write("bad.mof", "class {};");
    const auto top = directory.write("top.mof", "#pragma include (\"bad.mof\")");
    Schema schema;
    try {
        MofReader(schema).readFile(top);
        FAIL() << "the file was taken";
    } catch (const LoadError& error) {
        EXPECT_THAT(error.what(), StartsWith(bad + ":1:7: expected a class name"));
    }
}

TEST(MofFile, AnEmptyFileIsValid) {
    const testsupport::TemporaryDirectory directory;
    Schema schema;
    MofReader(schema).readFile(directory.write("empty.mof", ""));
    EXPECT_TRUE(schema.classes().empty());
}

TEST(MofSource, ASourceWithASyntaxErrorAddsNothing) {
    Schema schema;
    EXPECT_THROW(MofReader(schema).readSource("class A {}; class {", "x"), LoadError);
    EXPECT_EQ(schema.findClass("A"), nullptr);
}

}  // namespace
}  // namespace cimhost::test
