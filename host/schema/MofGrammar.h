#pragma once

#include "schema/LiteralGrammar.h"

/** The grammar of MOF (CIM 2) as PEGTL rules, bottom up. After the first token of a rule, the rest is required. */
namespace cimhost::grammar::mof {

struct LineComment : peg::seq<peg::two<'/'>, peg::until<peg::eolf>> {};
struct CommentBody : peg::seq<peg::string<'/', '*'>, peg::until<peg::string<'*', '/'>>> {};
struct ClosedComment : peg::at<CommentBody> {};  // looks ahead, to report an error at the start of the comment
struct BlockComment : peg::if_must<peg::at<peg::string<'/', '*'>>, ClosedComment, CommentBody> {};
struct Skip : peg::star<peg::sor<peg::space, LineComment, BlockComment>> {};

template <typename Rule>
struct Token : peg::seq<Rule, Skip> {};
template <typename Rule>
struct Need : peg::must<Token<Rule>> {};
template <char C>
struct Mark : Token<peg::one<C>> {};
template <char C>
struct NeedMark : peg::must<Mark<C>> {};
template <typename Item>
struct CommaList : peg::list_must<Item, Mark<','>> {};

// Constants and initializers.
struct StringPart : StringContent<'\n', '\r'> {};
struct StringEnd : peg::one<'"'> {};
struct StringLiteral : peg::if_must<peg::one<'"'>, StringPart, StringEnd> {};
struct StringValue : peg::plus<Token<StringLiteral>> {};
struct Alias : peg::seq<peg::one<'$'>, Name> {};
struct Constant : peg::sor<StringValue, Token<peg::sor<Word, Number, CharacterLiteral, Alias>>> {};
struct ArrayInitializer : peg::seq<Mark<'{'>, peg::opt<CommaList<Constant>>, NeedMark<'}'>> {};
struct Initializer : peg::sor<ArrayInitializer, Constant> {};
struct DefaultValue : peg::if_must<Mark<'='>, Initializer> {};

// Qualifiers.
struct FlavorName : Name {};
struct QualifierName : Name {};
struct Flavors : peg::plus<Token<FlavorName>> {};
struct ParenthesisedValue : peg::seq<Mark<'('>, peg::must<Constant>, NeedMark<')'>> {};
struct Qualifier : peg::seq<Token<QualifierName>, peg::opt<peg::sor<ParenthesisedValue, ArrayInitializer>>,
                            peg::opt<peg::if_must<Mark<':'>, Flavors>>> {};
struct QualifierList : peg::seq<Mark<'['>, peg::must<CommaList<Qualifier>>, NeedMark<']'>> {};

// Properties, references and methods.
struct DataType : Name {};
struct FeatureName : Name {};
struct ParameterName : Name {};
struct ArraySize : DecimalLiteral {};
struct ReferenceMark : peg::seq<Keyword<TAO_PEGTL_ISTRING("ref")>, Skip, peg::at<NameStart>> {};
struct ArrayMark : peg::seq<Mark<'['>, peg::opt<Token<ArraySize>>, NeedMark<']'>> {};
struct Parameter : peg::seq<peg::opt<QualifierList>, Token<DataType>, peg::opt<ReferenceMark>, Need<ParameterName>,
                            peg::opt<ArrayMark>> {};
struct ParameterList : peg::seq<Mark<'('>, peg::opt<CommaList<Parameter>>, NeedMark<')'>> {};
struct PropertyRest : peg::seq<peg::opt<ArrayMark>, peg::opt<DefaultValue>> {};
struct UnqualifiedFeature : peg::seq<Token<DataType>, peg::opt<ReferenceMark>, Need<FeatureName>,
                                     peg::sor<ParameterList, PropertyRest>, NeedMark<';'>> {};
struct Feature : peg::sor<peg::if_must<QualifierList, UnqualifiedFeature>, UnqualifiedFeature> {};

// Classes.
struct ClassName : Name {};
struct SuperclassName : Name {};
struct AliasClause : peg::seq<Token<Keyword<TAO_PEGTL_ISTRING("as")>>, Need<Alias>> {};
struct Superclass : peg::seq<Mark<':'>, Need<SuperclassName>> {};
struct ClassBodyEnd : Mark<'}'> {};
struct ClassDeclaration
    : peg::seq<Token<Keyword<TAO_PEGTL_ISTRING("class")>>, Need<ClassName>, peg::opt<AliasClause>, peg::opt<Superclass>,
               NeedMark<'{'>, peg::star<Feature>, peg::must<ClassBodyEnd>, NeedMark<';'>> {};

// Instances.
struct OfWord : Keyword<TAO_PEGTL_ISTRING("of")> {};
struct AssignedName : Name {};
struct Assignment
    : peg::seq<peg::opt<QualifierList>, Token<AssignedName>, NeedMark<'='>, peg::must<Initializer>, NeedMark<';'>> {};
struct InstanceBodyEnd : Mark<'}'> {};
struct InstanceDeclaration
    : peg::seq<Token<Keyword<TAO_PEGTL_ISTRING("instance")>>, Need<OfWord>, Need<ClassName>, peg::opt<AliasClause>,
               NeedMark<'{'>, peg::star<Assignment>, peg::must<InstanceBodyEnd>, NeedMark<';'>> {};

// Qualifier declarations.
struct ScopeWord : Keyword<TAO_PEGTL_ISTRING("scope")> {};
struct FlavorWord : Keyword<TAO_PEGTL_ISTRING("flavor")> {};
struct MetaElement
    : Keyword<peg::sor<TAO_PEGTL_ISTRING("class"), TAO_PEGTL_ISTRING("association"), TAO_PEGTL_ISTRING("indication"),
                       TAO_PEGTL_ISTRING("qualifier"), TAO_PEGTL_ISTRING("property"), TAO_PEGTL_ISTRING("reference"),
                       TAO_PEGTL_ISTRING("method"), TAO_PEGTL_ISTRING("parameter"), TAO_PEGTL_ISTRING("schema"),
                       TAO_PEGTL_ISTRING("any")>> {};
struct ScopeClause
    : peg::seq<NeedMark<','>, Need<ScopeWord>, NeedMark<'('>, peg::must<CommaList<Token<MetaElement>>>, NeedMark<')'>> {
};
struct FlavorClause
    : peg::seq<Mark<','>, Need<FlavorWord>, NeedMark<'('>, peg::must<CommaList<Token<FlavorName>>>, NeedMark<')'>> {};
struct QualifierDeclaration
    : peg::seq<Token<Keyword<TAO_PEGTL_ISTRING("qualifier")>>, Need<QualifierName>, NeedMark<':'>, Need<DataType>,
               peg::opt<ArrayMark>, peg::opt<DefaultValue>, ScopeClause, peg::opt<FlavorClause>, NeedMark<';'>> {};

// Directives and the file.
struct PragmaWord : Keyword<TAO_PEGTL_ISTRING("pragma")> {};
struct PragmaName : Name {};
struct Pragma
    : peg::seq<Mark<'#'>, Need<PragmaWord>, Need<PragmaName>, NeedMark<'('>, peg::must<StringValue>, NeedMark<')'>> {};
struct ClassOrInstance : peg::sor<ClassDeclaration, InstanceDeclaration> {};
struct QualifiedDeclaration : peg::if_must<QualifierList, ClassOrInstance> {};
struct UnqualifiedDeclaration : ClassOrInstance {};
struct ByteOrderMark : peg::string<'\xEF', '\xBB', '\xBF'> {};
struct FileEnd : peg::eof {};
struct File : peg::seq<peg::opt<ByteOrderMark>, Skip,
                       peg::star<peg::sor<Pragma, QualifierDeclaration, QualifiedDeclaration, UnqualifiedDeclaration>>,
                       peg::must<FileEnd>> {};

/** An array initializer outside of a MOF file. */
struct LoneArrayEnd : peg::eof {};
struct LoneArray : peg::seq<Skip, peg::must<ArrayInitializer>, peg::must<LoneArrayEnd>> {};

/** The nodes that MofBuilder reads. */
template <typename Rule>
using Selected = peg::parse_tree::selector<
    Rule, LiteralNodes,
    peg::parse_tree::store_content::on<StringPart, Alias, Constant, ArrayInitializer, DefaultValue, FlavorName,
                                       QualifierName, Qualifier, QualifierList, DataType, FeatureName, ArraySize,
                                       ReferenceMark, ArrayMark, Parameter, ParameterName, ParameterList, Feature,
                                       ClassName, SuperclassName, ClassDeclaration, AssignedName, Assignment,
                                       InstanceDeclaration, QualifierDeclaration, ScopeClause, MetaElement,
                                       FlavorClause, PragmaName, Pragma, QualifiedDeclaration, AliasClause>>;

/** Error messages, by rule. */
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
