#include "lab/load/Ledger.h"

#include <gmock/gmock.h>

#include "support/Values.h"

namespace {

using cimhost::lab::Ledger;
using cimhost::lab::Random;
using testing::ElementsAre;
using testing::Key;

TEST(Ledger, KeepsWhatItWasTold) {
    Ledger ledger;
    EXPECT_TRUE(ledger.isEmpty());
    ledger.created("a", {});
    ledger.created("b", {{"Text", testsupport::text("x")}});
    ledger.created("c", {});
    ledger.modified("b", {{"Text", testsupport::text("y")}, {"Number", testsupport::uint32(1)}});
    ledger.removed("a");
    EXPECT_THAT(ledger.instances(), ElementsAre(Key("b"), Key("c")));
    EXPECT_THAT(ledger.instances().at("b"), ElementsAre(Key("Number"), Key("Text")));
    EXPECT_FALSE(ledger.isDoubtful("a"));
}

TEST(Ledger, AnyIsOneThatIsThere) {
    Ledger ledger;
    Random random(1, 1);
    for (const char* id : {"a", "b", "c", "d"}) {
        ledger.created(id, {});
    }
    for (int left = 4; left > 0; --left) {
        const std::string id = ledger.any(random);
        EXPECT_EQ(ledger.instances().count(id), 1U);
        ledger.removed(id);
        EXPECT_EQ(ledger.instances().count(id), 0U);
    }
    EXPECT_TRUE(ledger.isEmpty());
}

TEST(Ledger, WhatIsDoubtfulIsNotKnown) {
    Ledger ledger;
    ledger.created("a", {});
    ledger.doubt("a");
    ledger.doubt("never made");
    EXPECT_TRUE(ledger.isEmpty());
    EXPECT_THAT(ledger.doubted(), ElementsAre("a", "never made"));
}

TEST(Ledger, TakesOverAnother) {
    Ledger ledger;
    ledger.created("a", {});
    Ledger other;
    other.created("b", {});
    other.doubt("c");
    ledger.add(other);
    EXPECT_THAT(ledger.instances(), ElementsAre(Key("a"), Key("b")));
    EXPECT_TRUE(ledger.isDoubtful("c"));
}

}  // namespace
