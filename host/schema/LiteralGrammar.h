#pragma once

#include <tao/pegtl.hpp>
#include <tao/pegtl/contrib/parse_tree.hpp>
#include <tao/pegtl/must_if.hpp>
#include <vector>

#include "schema/Literal.h"

/** PEGTL rules for the literals of MOF and object paths, without surrounding white space. */
namespace cimhost::grammar {

namespace peg = tao::pegtl;

using Node = peg::parse_tree::node;

/** Selects the overload of the function that returns the message of a rule. */
template <typename Rule>
struct Tag {};

/** Returns no message. The messages of a grammar derive from it and overload of() for the rules that have one. */
struct NoMessages {
    template <typename Rule>
    static constexpr const char* of(Tag<Rule>) {
        return nullptr;
    }
};

/** The errors of a grammar. Messages::of(Tag<Rule>) returns the message for a required rule that does not match. */
template <typename Messages>
struct Errors {
    template <typename Rule>
    static constexpr const char* message = Messages::of(Tag<Rule>{});
    template <typename Rule>
    static constexpr bool raise_on_failure = false;  // the rules are also used where they are optional
};

struct NameStart : peg::sor<peg::alpha, peg::one<'_'>> {};
struct NameOther : peg::sor<peg::alnum, peg::one<'_'>> {};
struct Name : peg::seq<NameStart, peg::star<NameOther>> {};

template <typename Word>
struct Keyword : peg::seq<Word, peg::not_at<NameOther>> {};

struct NullLiteral : Keyword<TAO_PEGTL_ISTRING("null")> {};
struct TrueLiteral : Keyword<TAO_PEGTL_ISTRING("true")> {};
struct FalseLiteral : Keyword<TAO_PEGTL_ISTRING("false")> {};

struct Sign : peg::one<'+', '-'> {};
struct NumberEnd : peg::not_at<peg::sor<NameOther, peg::one<'.'>>> {};
struct Exponent : peg::seq<peg::one<'e', 'E'>, peg::opt<Sign>, peg::plus<peg::digit>> {};

struct RealLiteral : peg::seq<peg::opt<Sign>, peg::star<peg::digit>, peg::one<'.'>, peg::plus<peg::digit>,
                              peg::opt<Exponent>, NumberEnd> {};
struct BinaryLiteral : peg::seq<peg::opt<Sign>, peg::plus<peg::one<'0', '1'>>, peg::one<'b', 'B'>, NumberEnd> {};
struct HexLiteral : peg::seq<peg::opt<Sign>, peg::one<'0'>, peg::one<'x', 'X'>, peg::plus<peg::xdigit>, NumberEnd> {};
struct OctalLiteral : peg::seq<peg::opt<Sign>, peg::one<'0'>, peg::plus<peg::range<'0', '7'>>, NumberEnd> {};
struct DecimalLiteral
    : peg::seq<peg::opt<Sign>, peg::sor<peg::one<'0'>, peg::seq<peg::range<'1', '9'>, peg::star<peg::digit>>>,
               NumberEnd> {};

struct UnitEscape : peg::seq<peg::one<'x', 'X'>, peg::xdigit, peg::rep_opt<3, peg::xdigit>> {};
struct Escape : peg::seq<peg::one<'\\'>, peg::sor<UnitEscape, peg::one<'b', 't', 'n', 'f', 'r', '"', '\'', '\\'>>> {};

struct CharacterContent : peg::sor<Escape, peg::utf8::not_one<'\'', '\\', '\n', '\r'>> {};
struct CharacterLiteral : peg::seq<peg::one<'\''>, CharacterContent, peg::one<'\''>> {};

/** The content of a string literal. @tparam Refused characters that it cannot contain, such as line ends in MOF */
template <char... Refused>
struct StringContent : peg::star<peg::sor<Escape, peg::not_one<'"', '\\', Refused...>>> {};

struct Number : peg::sor<RealLiteral, BinaryLiteral, HexLiteral, OctalLiteral, DecimalLiteral> {};
struct Word : peg::sor<NullLiteral, TrueLiteral, FalseLiteral> {};

/** Selects the nodes that readLiteral() converts. */
using LiteralNodes =
    peg::parse_tree::store_content::on<NullLiteral, TrueLiteral, FalseLiteral, RealLiteral, BinaryLiteral, HexLiteral,
                                       OctalLiteral, DecimalLiteral, CharacterContent>;

/** Converts one of the LiteralNodes. @throws ValueError if a character has more than 16 bits */
Literal readLiteral(const Node& node);

/** The first child that matched this rule, or null. */
template <typename Rule>
const Node* findChild(const Node& node) {
    for (const auto& child : node.children) {
        if (child->is_type<Rule>()) {
            return child.get();
        }
    }
    return nullptr;
}

/** All children that matched this rule. */
template <typename Rule>
std::vector<const Node*> children(const Node& node) {
    std::vector<const Node*> found;
    for (const auto& child : node.children) {
        if (child->is_type<Rule>()) {
            found.push_back(child.get());
        }
    }
    return found;
}

}  // namespace cimhost::grammar
