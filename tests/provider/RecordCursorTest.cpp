// Position and movement of a cursor over the records.

#include <gmock/gmock.h>

#include "RecordKinds.h"

namespace {

using namespace providerTest;
using testing::ElementsAre;

template <class Kind>
class RecordCursor : public RecordStore<Kind> {
protected:
    /** Returns the identifiers from the current record on. */
    static std::vector<std::string> visited(typename Kind::Base& base) {
        std::vector<std::string> identifiers;
        for (; base; ++base) {
            identifiers.push_back(RecordStore<Kind>::identifier(base));
        }
        return identifiers;
    }
};

TYPED_TEST_SUITE(RecordCursor, RecordKinds, KindNames);

TYPED_TEST(RecordCursor, StartsAtTheEndOfAnEmptyTable) {
    typename TypeParam::Base base;
    EXPECT_FALSE(hasCurrent(base));
    EXPECT_TRUE(this->atEnd(base));
}

TYPED_TEST(RecordCursor, StartsAtTheFirstRecordInUse) {
    this->fill({"A", "B", "C"});
    this->markDeleted(0);
    typename TypeParam::Base base;
    EXPECT_EQ(this->identifier(base), "B");
    EXPECT_TRUE(hasCurrent(base));
}

TYPED_TEST(RecordCursor, StartsAtTheEndIfTheCountIsZero) {
    this->fill({"A"});
    this->count() = 0;
    typename TypeParam::Base base;
    EXPECT_TRUE(this->atEnd(base));
    EXPECT_FALSE(hasCurrent(base));
}

TYPED_TEST(RecordCursor, ThrowsIfTheCountIsNotZeroAndTheTableIsEmpty) {
    this->count() = 1;
    EXPECT_EQ(thrown<InstrumentationException>([] { typename TypeParam::Base base; }), Words<TypeParam>::noRecords);
}

TYPED_TEST(RecordCursor, ThrowsIfTheCountIsNotZeroAndAllRecordsAreDeleted) {
    this->fill({"A", "B"});
    this->markDeleted(0);
    this->markDeleted(1);
    this->count() = 2;
    agentEnvironment::forgetLog();
    EXPECT_EQ(thrown<InstrumentationException>([] { typename TypeParam::Base base; }), Words<TypeParam>::noRecords);
    const std::string function = std::string(TypeParam::name) + "Base";
    const auto records = recordsOf(Words<TypeParam>::sourceFile, function);
    ASSERT_FALSE(records.empty());
    EXPECT_EQ(withoutLine(records.back().text), message(Words<TypeParam>::noRecords, Words<TypeParam>::sourceFile));
    EXPECT_EQ(records.back().level, 3000);
}

TYPED_TEST(RecordCursor, VisitsTheRecordsInUseInTableOrder) {
    this->fill({"C", "A", "x", "B", "y"});
    this->markDeleted(2);
    this->markDeleted(4);
    typename TypeParam::Base base;
    EXPECT_THAT(this->visited(base), ElementsAre("C", "A", "B"));
}

TYPED_TEST(RecordCursor, StaysAtTheEnd) {
    this->fill({"A"});
    typename TypeParam::Base base;
    ++base;
    EXPECT_FALSE(hasCurrent(base));
    ++base;
    ++base;
    EXPECT_FALSE(hasCurrent(base));
    EXPECT_TRUE(this->atEnd(base));
}

TYPED_TEST(RecordCursor, StaysAtTheEndWhenARecordIsAppended) {
    this->fill({"A"});
    typename TypeParam::Base base;
    ++base;
    this->fill({"B"});
    EXPECT_FALSE(hasCurrent(base));
}

TYPED_TEST(RecordCursor, MovesFromADeletedRecordWhenItsConditionIsEvaluated) {
    this->fill({"A", "B", "C"});
    typename TypeParam::Base base;
    this->markDeleted(0);
    this->markDeleted(1);
    EXPECT_EQ(this->identifier(base), "A");
    EXPECT_TRUE(hasCurrent(base));
    EXPECT_EQ(this->identifier(base), "C");
}

TYPED_TEST(RecordCursor, MovesToTheEndWhenOnlyDeletedRecordsFollow) {
    this->fill({"A", "B"});
    typename TypeParam::Base base;
    this->markDeleted(0);
    this->markDeleted(1);
    EXPECT_FALSE(this->atEnd(base));
    EXPECT_FALSE(hasCurrent(base));
    EXPECT_TRUE(this->atEnd(base));
}

TYPED_TEST(RecordCursor, SelectsARecordByItsIdentifier) {
    this->fill({"A", "B", "C"});
    typename TypeParam::Base base;
    TypeParam::select(base, "B");
    EXPECT_EQ(this->identifier(base), "B");
    EXPECT_THAT(this->visited(base), ElementsAre("B", "C"));
}

TYPED_TEST(RecordCursor, SelectsTheCurrentRecord) {
    this->fill({"A", "B"});
    typename TypeParam::Base base;
    ++base;
    TypeParam::select(base, "B");
    EXPECT_EQ(this->identifier(base), "B");
    TypeParam::select(base, "B");
    EXPECT_EQ(this->identifier(base), "B");
}

TYPED_TEST(RecordCursor, SelectsForwardOnly) {
    this->fill({"A", "B", "C"});
    typename TypeParam::Base base;
    TypeParam::select(base, "C");
    TypeParam::select(base, "B");
    EXPECT_FALSE(hasCurrent(base));
    typename TypeParam::Base fresh;
    TypeParam::select(fresh, "B");
    EXPECT_EQ(this->identifier(fresh), "B");
}

TYPED_TEST(RecordCursor, ComparesIdentifiersByteForByte) {
    this->fill({"Lease 1", "lease 10", "lease", std::string("lease 1\0x", 9), " lease 1", "lease 1", "lease 1 "});
    typename TypeParam::Base base;
    TypeParam::select(base, "lease 1");
    EXPECT_THAT(this->visited(base), ElementsAre("lease 1", "lease 1 "));
}

TYPED_TEST(RecordCursor, MovesToTheEndIfNoRecordHasTheIdentifier) {
    this->fill({"A", "B"});
    for (const char* identifier : {"a", "", "AB", "C"}) {
        typename TypeParam::Base base;
        TypeParam::select(base, identifier);
        EXPECT_TRUE(this->atEnd(base)) << identifier;
    }
}

TYPED_TEST(RecordCursor, SelectsNoDeletedRecord) {
    this->fill({"A", "B", "B"});
    this->markDeleted(1);
    typename TypeParam::Base base;
    TypeParam::select(base, "B");
    EXPECT_EQ(this->identifier(base), "B");
    ++base;
    EXPECT_FALSE(hasCurrent(base));
    this->markDeleted(2);
    typename TypeParam::Base second;
    TypeParam::select(second, "B");
    EXPECT_TRUE(this->atEnd(second));
}

TYPED_TEST(RecordCursor, StaysAtTheEndWhenSelecting) {
    this->fill({"A"});
    typename TypeParam::Base base;
    ++base;
    TypeParam::select(base, "A");
    EXPECT_TRUE(this->atEnd(base));
}

TYPED_TEST(RecordCursor, KeepsItsPositionWhenAnotherCursorAppendsRecords) {
    this->fill({"A", "B"});
    typename TypeParam::Base base;
    ++base;
    {
        typename TypeParam::Base other;
        for (int number = 0; number < 100; ++number) {
            TypeParam::create(other, "N" + std::to_string(number));
        }
    }
    EXPECT_EQ(this->identifier(base), "B");
    EXPECT_EQ(this->visited(base).size(), 101U);
}

TYPED_TEST(RecordCursor, SeesChangesByAnotherCursorAtOnce) {
    this->fill({"A"});
    typename TypeParam::Base first;
    typename TypeParam::Base second;
    first.setProperty(TypeParam::text, std::string("changed"));
    std::string text;
    second.getProperty(TypeParam::text, text);
    EXPECT_EQ(text, "changed");
    TypeParam::remove(second);
    EXPECT_FALSE(hasCurrent(first));
}

}  // namespace
