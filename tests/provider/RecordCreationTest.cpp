// Records made and deleted.

#include "Sides.h"

#include <gmock/gmock.h>

namespace {

using namespace providerTest;
using testing::ElementsAre;

template <class Side>
class RecordCreation : public RecordStore<Side> {
protected:
    /** Identifier of each table entry; deleted ones with a bar in front. */
    static std::vector<std::string> entries() {
        std::vector<std::string> found;
        unsigned int inUse = 0;
        for (const auto& unit : RecordStore<Side>::table()) {
            found.push_back((unit.inUse ? "" : "|") + unit.InstanceID);
            inUse += unit.inUse ? 1U : 0U;
        }
        EXPECT_EQ(RecordStore<Side>::count(), inUse);
        return found;
    }
};

TYPED_TEST_SUITE(RecordCreation, Sides, SideNames);

TYPED_TEST(RecordCreation, AppendsARecordWithDefaults) {
    this->fill({"A"});
    typename TypeParam::Base base;
    EXPECT_TRUE(TypeParam::create(base, "new one"));
    EXPECT_THAT(this->entries(), ElementsAre("A", "new one"));
    const typename TypeParam::Unit expected("new one");
    EXPECT_EQ(TypeParam::members(this->table()[1]), TypeParam::members(expected));
}

TYPED_TEST(RecordCreation, LeavesTheCursorOnTheNewRecordWhenItStoodOnOne) {
    this->fill({"A", "B"});
    typename TypeParam::Base base;
    ++base;
    TypeParam::create(base, "C");
    EXPECT_EQ(this->identifier(base), "C");
    ++base;
    EXPECT_FALSE(stands(base));
}

TYPED_TEST(RecordCreation, LeavesTheCursorOnTheFirstEntryWhenItStoodAtTheEnd) {
    this->fill({"A", "B"});
    typename TypeParam::Base base;
    TypeParam::select(base, "nowhere");
    TypeParam::create(base, "C");
    EXPECT_EQ(this->identifier(base), "A");
}

TYPED_TEST(RecordCreation, LeavesTheCursorOnTheOnlyRecordOfAnEmptyTable) {
    typename TypeParam::Base base;
    TypeParam::create(base, "A");
    EXPECT_EQ(this->identifier(base), "A");
    EXPECT_TRUE(stands(base));
    EXPECT_EQ(this->identifier(base), "A");
}

TYPED_TEST(RecordCreation, LeavesTheCursorOnADeletedFirstEntryWhenItStoodAtTheEnd) {
    this->fill({"A", "B"});
    this->markDeleted(0);
    this->markDeleted(1);
    typename TypeParam::Base base;
    TypeParam::create(base, "C");
    EXPECT_EQ(this->identifier(base), "A");
    EXPECT_TRUE(stands(base));
    EXPECT_EQ(this->identifier(base), "C");
}

TYPED_TEST(RecordCreation, FindsTheNewRecordFromADeletedOne) {
    this->fill({"A"});
    typename TypeParam::Base base;
    TypeParam::remove(base);
    TypeParam::create(base, "B");
    EXPECT_EQ(this->identifier(base), "B");
    EXPECT_THAT(this->entries(), ElementsAre("|A", "B"));
}

TYPED_TEST(RecordCreation, RefusesAnIdentifierInUseAndChangesNothing) {
    this->fill({"A", "B"});
    {
        typename TypeParam::Base base;
        for (const char* identifier : {"A", "B"}) {
            EXPECT_EQ(thrown<InstrumentationException>([&] { TypeParam::create(base, identifier); }),
                      Words<TypeParam>::exists);
        }
        EXPECT_EQ(this->identifier(base), "A");
    }
    EXPECT_THAT(this->entries(), ElementsAre("A", "B"));
    EXPECT_FALSE(std::filesystem::exists(this->path()));
}

TYPED_TEST(RecordCreation, RefusesAnIdentifierInUseBeforeTheCursorToo) {
    this->fill({"A", "B"});
    typename TypeParam::Base base;
    TypeParam::select(base, "nowhere");
    EXPECT_EQ(thrown<InstrumentationException>([&] { TypeParam::create(base, "A"); }), Words<TypeParam>::exists);
    EXPECT_TRUE(this->atEnd(base));
}

TYPED_TEST(RecordCreation, ComparesIdentifiersByteForByte) {
    this->fill({"A"});
    typename TypeParam::Base base;
    for (const char* identifier : {"a", "A ", " A", "", "AA"}) {
        EXPECT_TRUE(TypeParam::create(base, identifier));
    }
    EXPECT_THAT(this->entries(), ElementsAre("A", "a", "A ", " A", "", "AA"));
}

TYPED_TEST(RecordCreation, TakesTheIdentifierOfADeletedRecord) {
    this->fill({"A", "B"});
    typename TypeParam::Base base;
    TypeParam::remove(base);
    EXPECT_TRUE(TypeParam::create(base, "A"));
    EXPECT_THAT(this->entries(), ElementsAre("|A", "B", "A"));
    ++base;
    EXPECT_FALSE(stands(base));
}

TYPED_TEST(RecordCreation, IsWrittenWhenTheCursorEnds) {
    {
        typename TypeParam::Base base;
        TypeParam::create(base, "A");
        TypeParam::create(base, "B");
        EXPECT_FALSE(std::filesystem::exists(this->path()));
    }
    EXPECT_EQ(this->file(), std::string("2\nA\n") + TypeParam::defaultRecord + "B\n" + TypeParam::defaultRecord);
}

TYPED_TEST(RecordCreation, AndDeletionLeaveNothingButTheCountInTheFile) {
    {
        typename TypeParam::Base base;
        TypeParam::create(base, "A");
    }
    {
        typename TypeParam::Base base;
        TypeParam::remove(base);
    }
    EXPECT_EQ(this->file(), "0\n");
    EXPECT_EQ(this->count(), 0U);
    typename TypeParam::Base fresh;
    EXPECT_TRUE(this->atEnd(fresh));
    EXPECT_FALSE(stands(fresh));
}

TYPED_TEST(RecordCreation, OfDeletedRecordsIsForTheTableOnly) {
    this->fill({"A", "B", "C"});
    {
        typename TypeParam::Base base;
        ++base;
        TypeParam::remove(base);
    }
    EXPECT_THAT(this->entries(), ElementsAre("A", "|B", "C"));
    EXPECT_EQ(this->file(), std::string("2\nA\n") + TypeParam::defaultRecord + "C\n" + TypeParam::defaultRecord);
}

TYPED_TEST(RecordCreation, DeletionLeavesTheCursorWhereItIs) {
    this->fill({"A", "B"});
    typename TypeParam::Base base;
    TypeParam::remove(base);
    EXPECT_EQ(this->identifier(base), "A");
    std::string text = "before";
    EXPECT_TRUE(base.getProperty(TypeParam::text, text));
    EXPECT_EQ(text, "");
    EXPECT_TRUE(stands(base));
    EXPECT_EQ(this->identifier(base), "B");
}

TYPED_TEST(RecordCreation, ARecordDeletedTwiceIsCountedDownOnce) {
    this->fill({"A", "B", "C"});
    {
        typename TypeParam::Base base;
        TypeParam::remove(base);
        TypeParam::remove(base);
        EXPECT_THAT(this->entries(), ElementsAre("|A", "B", "C"));
        EXPECT_EQ(this->count(), 2U);
    }
    EXPECT_EQ(this->file(), std::string("2\nB\n") + TypeParam::defaultRecord + "C\n" + TypeParam::defaultRecord);
}

TYPED_TEST(RecordCreation, DeletionAtTheEndIsRefused) {
    this->fill({"A"});
    {
        typename TypeParam::Base base;
        ++base;
        EXPECT_EQ(thrown<InstrumentationException>([&] { TypeParam::remove(base); }), Words<TypeParam>::notAvailable);
    }
    EXPECT_THAT(this->entries(), ElementsAre("A"));
    EXPECT_FALSE(std::filesystem::exists(this->path()));
}

TYPED_TEST(RecordCreation, KeepsTheCountThroughManyChanges) {
    for (int round = 0; round < 12; ++round) {
        typename TypeParam::Base base;
        TypeParam::create(base, "R" + std::to_string(round));
        TypeParam::create(base, "S");
        if (round % 3 == 0) {
            TypeParam::select(base, "S");
            TypeParam::remove(base);
        } else {
            TypeParam::select(base, "S");
            TypeParam::remove(base);
            typename TypeParam::Base first;
            TypeParam::remove(first);
        }
        this->entries();
    }
    EXPECT_EQ(this->count(), 4U);
    const auto reloaded = std::make_unique<typename TypeParam::Cache>();
    EXPECT_EQ(TypeParam::count(*reloaded), 4U);
}

}  // namespace
