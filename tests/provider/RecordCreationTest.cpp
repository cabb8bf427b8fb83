// Creation and deletion of records.

#include <gmock/gmock.h>

#include "RecordKinds.h"

namespace {

using namespace providerTest;
using testing::ElementsAre;

template <class Kind>
class RecordCreation : public RecordStore<Kind> {
protected:
    /** Returns the identifier of each table entry, prefixed with a bar if the entry is deleted. */
    static std::vector<std::string> entries() {
        std::vector<std::string> found;
        unsigned int inUse = 0;
        for (const auto& unit : RecordStore<Kind>::table()) {
            found.push_back((unit.inUse ? "" : "|") + unit.InstanceID);
            inUse += unit.inUse ? 1U : 0U;
        }
        EXPECT_EQ(RecordStore<Kind>::count(), inUse);
        return found;
    }
};

TYPED_TEST_SUITE(RecordCreation, RecordKinds, KindNames);

TYPED_TEST(RecordCreation, AppendsARecordWithDefaults) {
    this->fill({"A"});
    typename TypeParam::Base base;
    EXPECT_TRUE(TypeParam::create(base, "new one"));
    EXPECT_THAT(this->entries(), ElementsAre("A", "new one"));
    const typename TypeParam::Unit expected("new one");
    EXPECT_EQ(TypeParam::members(this->table()[1]), TypeParam::members(expected));
}

TYPED_TEST(RecordCreation, MovesTheCursorFromARecordToTheNewRecord) {
    this->fill({"A", "B"});
    typename TypeParam::Base base;
    ++base;
    TypeParam::create(base, "C");
    EXPECT_EQ(this->identifier(base), "C");
    ++base;
    EXPECT_FALSE(hasCurrent(base));
}

TYPED_TEST(RecordCreation, MovesTheCursorFromTheEndToTheFirstEntry) {
    this->fill({"A", "B"});
    typename TypeParam::Base base;
    TypeParam::select(base, "nowhere");
    TypeParam::create(base, "C");
    EXPECT_EQ(this->identifier(base), "A");
}

TYPED_TEST(RecordCreation, MovesTheCursorToTheOnlyRecord) {
    typename TypeParam::Base base;
    TypeParam::create(base, "A");
    EXPECT_EQ(this->identifier(base), "A");
    EXPECT_TRUE(hasCurrent(base));
    EXPECT_EQ(this->identifier(base), "A");
}

TYPED_TEST(RecordCreation, MovesTheCursorFromTheEndToADeletedFirstEntry) {
    this->fill({"A", "B"});
    this->markDeleted(0);
    this->markDeleted(1);
    typename TypeParam::Base base;
    TypeParam::create(base, "C");
    EXPECT_EQ(this->identifier(base), "A");
    EXPECT_TRUE(hasCurrent(base));
    EXPECT_EQ(this->identifier(base), "C");
}

TYPED_TEST(RecordCreation, MovesTheCursorFromADeletedRecordToTheNewRecord) {
    this->fill({"A"});
    typename TypeParam::Base base;
    TypeParam::remove(base);
    TypeParam::create(base, "B");
    EXPECT_EQ(this->identifier(base), "B");
    EXPECT_THAT(this->entries(), ElementsAre("|A", "B"));
}

TYPED_TEST(RecordCreation, RejectsAnIdentifierInUseAndChangesNothing) {
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

TYPED_TEST(RecordCreation, RejectsAnIdentifierInUseBeforeTheCursor) {
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

TYPED_TEST(RecordCreation, AcceptsTheIdentifierOfADeletedRecord) {
    this->fill({"A", "B"});
    typename TypeParam::Base base;
    TypeParam::remove(base);
    EXPECT_TRUE(TypeParam::create(base, "A"));
    EXPECT_THAT(this->entries(), ElementsAre("|A", "B", "A"));
    ++base;
    EXPECT_FALSE(hasCurrent(base));
}

TYPED_TEST(RecordCreation, IsWrittenWhenTheCursorIsDestroyed) {
    {
        typename TypeParam::Base base;
        TypeParam::create(base, "A");
        TypeParam::create(base, "B");
        EXPECT_FALSE(std::filesystem::exists(this->path()));
    }
    EXPECT_EQ(this->file(), std::string("2\nA\n") + TypeParam::defaultRecord + "B\n" + TypeParam::defaultRecord);
}

TYPED_TEST(RecordCreation, AndDeletionLeaveOnlyTheCountInTheFile) {
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
    EXPECT_FALSE(hasCurrent(fresh));
}

TYPED_TEST(RecordCreation, AfterDeletionRecordsAreNotWritten) {
    this->fill({"A", "B", "C"});
    {
        typename TypeParam::Base base;
        ++base;
        TypeParam::remove(base);
    }
    EXPECT_THAT(this->entries(), ElementsAre("A", "|B", "C"));
    EXPECT_EQ(this->file(), std::string("2\nA\n") + TypeParam::defaultRecord + "C\n" + TypeParam::defaultRecord);
}

TYPED_TEST(RecordCreation, DeletionDoesNotMoveTheCursor) {
    this->fill({"A", "B"});
    typename TypeParam::Base base;
    TypeParam::remove(base);
    EXPECT_EQ(this->identifier(base), "A");
    std::string text = "before";
    EXPECT_TRUE(base.getProperty(TypeParam::text, text));
    EXPECT_EQ(text, "");
    EXPECT_TRUE(hasCurrent(base));
    EXPECT_EQ(this->identifier(base), "B");
}

TYPED_TEST(RecordCreation, ASecondDeletionDoesNotChangeTheCount) {
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

TYPED_TEST(RecordCreation, DeletionAtTheEndThrows) {
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
