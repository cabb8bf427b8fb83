#pragma once

#include <tao/pegtl/must_if.hpp>

#include "schema/MofGrammar.h"

/** Error messages of the MOF parser, by rule. */
namespace cimhost::grammar::mof {

/** The message if a required rule does not match. */
template <typename Rule>
inline constexpr const char* expected = nullptr;

template <>
inline constexpr auto expected<ClosedComment> = "this comment is not closed: expected */";
template <>
inline constexpr auto expected<CommentBody> = "this comment is not closed: expected */";
template <>
inline constexpr auto expected<StringPart> = "expected the characters of a string";
template <>
inline constexpr auto expected<StringEnd> =
    "this string is wrong here: expected its closing quotation mark, or one of the escapes \\b \\t \\n \\f \\r \\\" "
    "\\' \\\\ \\xHHHH";
template <>
inline constexpr auto expected<Constant> =
    "expected a value: a string in quotation marks, a number, true, false, null, a character in apostrophes or an "
    "alias";
template <>
inline constexpr auto expected<Initializer> = "expected a value or a list of values in braces";
template <>
inline constexpr auto expected<Flavors> = "expected a flavor such as DisableOverride";
template <>
inline constexpr auto expected<CommaList<Qualifier>> = "expected a qualifier's name";
template <>
inline constexpr auto expected<Qualifier> = "expected a qualifier's name";
template <>
inline constexpr auto expected<Parameter> = "expected a parameter: its type and its name";
template <>
inline constexpr auto expected<UnqualifiedFeature> = "expected a property, a reference or a method after qualifiers";
template <>
inline constexpr auto expected<Token<ParameterName>> = "expected the parameter's name";
template <>
inline constexpr auto expected<Token<FeatureName>> = "expected the name of a property, reference or method";
template <>
inline constexpr auto expected<Token<ClassName>> = "expected a class name";
template <>
inline constexpr auto expected<Token<SuperclassName>> = "expected the name of the superclass";
template <>
inline constexpr auto expected<Token<Alias>> = "expected an alias such as $Name";
template <>
inline constexpr auto expected<ClassBodyEnd> =
    "expected a property, a reference, a method or the } that ends the class";
template <>
inline constexpr auto expected<Token<OfWord>> = "expected \"of\" after \"instance\"";
template <>
inline constexpr auto expected<InstanceBodyEnd> = "expected \"Name = value;\" or the } that ends the instance";
template <>
inline constexpr auto expected<Token<ScopeWord>> = "expected \"Scope\"";
template <>
inline constexpr auto expected<Token<FlavorWord>> = "expected \"Flavor\"";
template <>
inline constexpr auto expected<CommaList<Token<MetaElement>>> = "expected a scope such as property";
template <>
inline constexpr auto expected<Token<MetaElement>> = "expected a scope such as property";
template <>
inline constexpr auto expected<CommaList<Token<FlavorName>>> = "expected a flavor such as DisableOverride";
template <>
inline constexpr auto expected<Token<FlavorName>> = "expected a flavor such as DisableOverride";
template <>
inline constexpr auto expected<Token<QualifierName>> = "expected a qualifier's name";
template <>
inline constexpr auto expected<Token<DataType>> = "expected a data type";
template <>
inline constexpr auto expected<Token<PragmaWord>> = "expected \"pragma\" after #";
template <>
inline constexpr auto expected<Token<PragmaName>> = "expected the pragma's name, such as include";
template <>
inline constexpr auto expected<StringValue> = "expected a string in quotation marks";
template <>
inline constexpr auto expected<ClassOrInstance> = "expected \"class\" or \"instance of\" after qualifiers";
template <>
inline constexpr auto expected<FileEnd> =
    "expected #pragma, \"qualifier\", \"class\", \"instance of\" or qualifiers in [ ]";
template <>
inline constexpr auto expected<ArrayInitializer> =
    "expected a list of values in braces, such as {1, 2} or {\"a\", \"b\"}";
template <>
inline constexpr auto expected<LoneArrayEnd> = "expected nothing more after the closing brace";
template <>
inline constexpr auto expected<Mark<'{'>> = "expected {";
template <>
inline constexpr auto expected<Mark<'}'>> = "expected a comma or }";
template <>
inline constexpr auto expected<Mark<'('>> = "expected (";
template <>
inline constexpr auto expected<Mark<')'>> = "expected )";
template <>
inline constexpr auto expected<Mark<']'>> = "expected a comma or ]";
template <>
inline constexpr auto expected<Mark<':'>> = "expected :";
template <>
inline constexpr auto expected<Mark<','>> = "expected a comma";
template <>
inline constexpr auto expected<Mark<'='>> = "expected =";
template <>
inline constexpr auto expected<Mark<';'>> = "expected ;";

struct Errors {
    template <typename Rule>
    static constexpr const char* message = expected<Rule>;
    template <typename Rule>
    static constexpr bool raise_on_failure = false;  // the rules are also used where they may fail
};
template <typename Rule>
using Control = peg::must_if<Errors>::control<Rule>;

}  // namespace cimhost::grammar::mof
