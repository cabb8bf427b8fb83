#include <gtest/gtest.h>

#include <tao/pegtl/contrib/analyze.hpp>

#include "schema/MofGrammar.h"
#include "schema/ObjectPathGrammar.h"

namespace cimhost::test {
namespace {

TEST(Grammar, NoRuleCanLoopWithoutConsuming) {
    EXPECT_EQ(tao::pegtl::analyze<grammar::mof::File>(1), 0U);
    EXPECT_EQ(tao::pegtl::analyze<grammar::mof::LoneArray>(1), 0U);
    EXPECT_EQ(tao::pegtl::analyze<grammar::path::Path>(1), 0U);
    EXPECT_EQ(tao::pegtl::analyze<grammar::path::LoneConstant>(1), 0U);
}

}  // namespace
}  // namespace cimhost::test
