#include <gmock/gmock.h>

#include "lab/load/ExpectedState.h"
#include "support/Values.h"

namespace {

using cimhost::lab::ExpectedState;
using cimhost::lab::Random;
using testing::ElementsAre;
using testing::Key;

TEST(ExpectedState, RecordsChanges) {
    ExpectedState state;
    EXPECT_TRUE(state.isEmpty());
    state.created("a", {});
    state.created("b", {{"Text", testsupport::text("x")}});
    state.created("c", {});
    state.modified("b", {{"Text", testsupport::text("y")}, {"Number", testsupport::uint32(1)}});
    state.removed("a");
    EXPECT_THAT(state.instances(), ElementsAre(Key("b"), Key("c")));
    EXPECT_THAT(state.instances().at("b"), ElementsAre(Key("Number"), Key("Text")));
    EXPECT_FALSE(state.isDoubtful("a"));
}

TEST(ExpectedState, AnyReturnsAnInstance) {
    ExpectedState state;
    Random random(1, 1);
    for (const char* id : {"a", "b", "c", "d"}) {
        state.created(id, {});
    }
    for (int left = 4; left > 0; --left) {
        const std::string id = state.any(random);
        EXPECT_EQ(state.instances().count(id), 1U);
        state.removed(id);
        EXPECT_EQ(state.instances().count(id), 0U);
    }
    EXPECT_TRUE(state.isEmpty());
}

TEST(ExpectedState, ADoubtfulInstanceIsUnknown) {
    ExpectedState state;
    state.created("a", {});
    state.doubt("a");
    state.doubt("never made");
    EXPECT_TRUE(state.isEmpty());
    EXPECT_THAT(state.doubted(), ElementsAre("a", "never made"));
}

TEST(ExpectedState, AddsTheInstancesOfAnother) {
    ExpectedState state;
    state.created("a", {});
    ExpectedState other;
    other.created("b", {});
    other.doubt("c");
    state.add(other);
    EXPECT_THAT(state.instances(), ElementsAre(Key("a"), Key("b")));
    EXPECT_TRUE(state.isDoubtful("c"));
}

}  // namespace
