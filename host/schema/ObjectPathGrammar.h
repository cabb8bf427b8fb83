#pragma once

#include <tao/pegtl/must_if.hpp>

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

}  // namespace cimhost::grammar::path
