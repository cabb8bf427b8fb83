#pragma once

#include "schema/LiteralGrammar.h"

/** PEGTL rules for untyped WBEM URIs, [//host/][namespace:]Class[.Key=value,...], without white space. */
namespace cimhost::grammar::path {

struct Host : peg::plus<peg::not_one<'/'>> {};
struct HostEnd : peg::one<'/'> {};
struct HostPart : peg::seq<peg::two<'/'>, peg::must<Host, HostEnd>> {};

struct NameSpaceStep : peg::seq<NameStart, peg::star<peg::sor<NameOther, peg::one<'-', '.'>>>> {};
struct NameSpace : peg::list<NameSpaceStep, peg::one<'/'>> {};
struct NameSpacePart : peg::seq<peg::opt<NameSpace>, peg::one<':'>> {};

struct ClassName : Name {};
struct KeyName : Name {};
struct Equals : peg::one<'='> {};
struct StringPart : StringContent<> {};
struct StringEnd : peg::one<'"'> {};
struct StringLiteral : peg::if_must<peg::one<'"'>, StringPart, StringEnd> {};
struct KeyValue : peg::sor<StringLiteral, Word, Number, CharacterLiteral> {};
struct Key : peg::seq<peg::must<KeyName>, peg::must<Equals>, peg::must<KeyValue>> {};
struct Keys : peg::seq<peg::one<'.'>, peg::list_must<Key, peg::one<','>>> {};
struct PathEnd : peg::eof {};
struct Path : peg::seq<peg::sor<HostPart, peg::opt<peg::one<'/'>>>, peg::opt<NameSpacePart>, peg::must<ClassName>,
                       peg::opt<Keys>, peg::must<PathEnd>> {};

/** A literal on a command line. */
struct LoneConstant : peg::seq<peg::sor<Word, Number, CharacterLiteral>, peg::eof> {};

template <typename Rule>
using Selected = peg::parse_tree::selector<
    Rule, LiteralNodes,
    peg::parse_tree::store_content::on<Host, NameSpace, ClassName, KeyName, StringPart, KeyValue, Key>>;

/** Error messages, by rule. */
struct Messages : NoMessages {
    using NoMessages::of;
    static constexpr const char* of(Tag<Host>) { return "expected a host name after //"; }
    static constexpr const char* of(Tag<HostEnd>) { return "expected / after the host"; }
    static constexpr const char* of(Tag<ClassName>) {
        return "expected a class name, or a namespace such as root/cimv2 and a colon";
    }
    static constexpr const char* of(Tag<Key>) { return "expected Key=value"; }
    static constexpr const char* of(Tag<KeyName>) { return "expected a key name"; }
    static constexpr const char* of(Tag<Equals>) { return "expected = after the key name"; }
    static constexpr const char* of(Tag<KeyValue>) {
        return "expected a key's value: a string in quotation marks (a shell needs quotes around the whole path to "
               "keep them), a number, true or false";
    }
    static constexpr const char* of(Tag<StringPart>) { return "expected the characters of a string"; }
    static constexpr const char* of(Tag<StringEnd>) {
        return "expected the closing quotation mark; in the string, write \\\" for a quotation mark and \\\\ for a "
               "backslash";
    }
    static constexpr const char* of(Tag<PathEnd>) {
        return "expected the end of the path, . and Key=value after the class, or a comma and another key";
    }
};

template <typename Rule>
using Control = peg::must_if<Errors<Messages>>::template control<Rule>;

}  // namespace cimhost::grammar::path
