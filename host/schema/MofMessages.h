#pragma once

#include "schema/MofGrammar.h"

namespace cimhost::grammar::mof {

/** Error messages of the MOF parser, by rule. */
struct Messages : NoMessages {
    using NoMessages::of;
    static constexpr const char* of(Tag<ClosedComment>) { return "this comment is not closed: expected */"; }
    static constexpr const char* of(Tag<CommentBody>) { return "this comment is not closed: expected */"; }
    static constexpr const char* of(Tag<StringPart>) { return "expected the characters of a string"; }
    static constexpr const char* of(Tag<StringEnd>) {
        return "this string is wrong here: expected its closing quotation mark, or one of the escapes \\b \\t \\n \\f "
               "\\r \\\" \\' \\\\ \\xHHHH";
    }
    static constexpr const char* of(Tag<Constant>) {
        return "expected a value: a string in quotation marks, a number, true, false, null, a character in apostrophes "
               "or an alias";
    }
    static constexpr const char* of(Tag<Initializer>) { return "expected a value or a list of values in braces"; }
    static constexpr const char* of(Tag<Flavors>) { return "expected a flavor such as DisableOverride"; }
    static constexpr const char* of(Tag<CommaList<Qualifier>>) { return "expected a qualifier's name"; }
    static constexpr const char* of(Tag<Qualifier>) { return "expected a qualifier's name"; }
    static constexpr const char* of(Tag<Parameter>) { return "expected a parameter: its type and its name"; }
    static constexpr const char* of(Tag<UnqualifiedFeature>) {
        return "expected a property, a reference or a method after qualifiers";
    }
    static constexpr const char* of(Tag<Token<ParameterName>>) { return "expected the parameter's name"; }
    static constexpr const char* of(Tag<Token<FeatureName>>) {
        return "expected the name of a property, reference or method";
    }
    static constexpr const char* of(Tag<Token<ClassName>>) { return "expected a class name"; }
    static constexpr const char* of(Tag<Token<SuperclassName>>) { return "expected the name of the superclass"; }
    static constexpr const char* of(Tag<Token<Alias>>) { return "expected an alias such as $Name"; }
    static constexpr const char* of(Tag<ClassBodyEnd>) {
        return "expected a property, a reference, a method or the } that ends the class";
    }
    static constexpr const char* of(Tag<Token<OfWord>>) { return "expected \"of\" after \"instance\""; }
    static constexpr const char* of(Tag<InstanceBodyEnd>) {
        return "expected \"Name = value;\" or the } that ends the instance";
    }
    static constexpr const char* of(Tag<Token<ScopeWord>>) { return "expected \"Scope\""; }
    static constexpr const char* of(Tag<Token<FlavorWord>>) { return "expected \"Flavor\""; }
    static constexpr const char* of(Tag<CommaList<Token<MetaElement>>>) { return "expected a scope such as property"; }
    static constexpr const char* of(Tag<Token<MetaElement>>) { return "expected a scope such as property"; }
    static constexpr const char* of(Tag<CommaList<Token<FlavorName>>>) {
        return "expected a flavor such as DisableOverride";
    }
    static constexpr const char* of(Tag<Token<FlavorName>>) { return "expected a flavor such as DisableOverride"; }
    static constexpr const char* of(Tag<Token<QualifierName>>) { return "expected a qualifier's name"; }
    static constexpr const char* of(Tag<Token<DataType>>) { return "expected a data type"; }
    static constexpr const char* of(Tag<Token<PragmaWord>>) { return "expected \"pragma\" after #"; }
    static constexpr const char* of(Tag<Token<PragmaName>>) { return "expected the pragma's name, such as include"; }
    static constexpr const char* of(Tag<StringValue>) { return "expected a string in quotation marks"; }
    static constexpr const char* of(Tag<ClassOrInstance>) {
        return "expected \"class\" or \"instance of\" after qualifiers";
    }
    static constexpr const char* of(Tag<FileEnd>) {
        return "expected #pragma, \"qualifier\", \"class\", \"instance of\" or qualifiers in [ ]";
    }
    static constexpr const char* of(Tag<ArrayInitializer>) {
        return "expected a list of values in braces, such as {1, 2} or {\"a\", \"b\"}";
    }
    static constexpr const char* of(Tag<LoneArrayEnd>) { return "expected nothing more after the closing brace"; }
    static constexpr const char* of(Tag<Mark<'{'>>) { return "expected {"; }
    static constexpr const char* of(Tag<Mark<'}'>>) { return "expected a comma or }"; }
    static constexpr const char* of(Tag<Mark<'('>>) { return "expected ("; }
    static constexpr const char* of(Tag<Mark<')'>>) { return "expected )"; }
    static constexpr const char* of(Tag<Mark<']'>>) { return "expected a comma or ]"; }
    static constexpr const char* of(Tag<Mark<':'>>) { return "expected :"; }
    static constexpr const char* of(Tag<Mark<','>>) { return "expected a comma"; }
    static constexpr const char* of(Tag<Mark<'='>>) { return "expected ="; }
    static constexpr const char* of(Tag<Mark<';'>>) { return "expected ;"; }
};

template <typename Rule>
using Control = peg::must_if<Errors<Messages>>::template control<Rule>;

}  // namespace cimhost::grammar::mof
