// Common behaviour of the lease and the warranty element: filters, creation and removal.

#include <gmock/gmock.h>

#include "ElementKinds.h"

namespace {

using namespace providerTest;
using testing::ElementsAre;

template <class Kind>
class RecordElement : public RecordStore<typename Kind::Store> {
protected:
    using Element = typename Kind::Element;
    static constexpr typename Element::FilterType other = static_cast<typename Element::FilterType>(3);

    static std::string identifier(const Element& element) {
        std::string text;
        EXPECT_TRUE(element.getInstanceID(text));
        return text;
    }

    /** Returns the identifiers from the current record on. */
    static std::vector<std::string> visited(Element& element) {
        std::vector<std::string> identifiers;
        for (; element; ++element) {
            identifiers.push_back(identifier(element));
        }
        return identifiers;
    }

    static std::string identify() { return std::string("Identify a ") + Kind::Store::name + " to remove."; }
};

TYPED_TEST_SUITE(RecordElement, ElementKinds, KindNames);

TYPED_TEST(RecordElement, StartsAtTheFirstRecordInUse) {
    this->fill({"L1", "L2"});
    this->markDeleted(0);
    typename TypeParam::Element element;
    EXPECT_TRUE(hasCurrent(element));
    EXPECT_EQ(this->identifier(element), "L2");
}

TYPED_TEST(RecordElement, HasNoCurrentRecordWithoutRecords) {
    typename TypeParam::Element element;
    EXPECT_FALSE(hasCurrent(element));
}

TYPED_TEST(RecordElement, ThrowsIfTheCountIsNotZeroAndTheTableIsEmpty) {
    this->count() = 1;
    EXPECT_EQ(thrown<InstrumentationException>([] { typename TypeParam::Element element; }),
              Words<typename TypeParam::Store>::noRecords);
}

TYPED_TEST(RecordElement, VisitsEveryRecordInUseWithoutAFilter) {
    this->fill({"L3", "x", "L1", "L2", "y"});
    this->markDeleted(1);
    this->markDeleted(4);
    typename TypeParam::Element element;
    EXPECT_THAT(this->visited(element), ElementsAre("L3", "L1", "L2"));
}

TYPED_TEST(RecordElement, VisitsOnlyTheRecordOfTheFilter) {
    this->fill({"L1", "L2", "L3"});
    typename TypeParam::Element element;
    element.setFilter(TypeParam::Element::InstanceIDFilter, "L2");
    EXPECT_EQ(this->identifier(element), "L2");
    ++element;
    EXPECT_FALSE(hasCurrent(element));
}

TYPED_TEST(RecordElement, ComparesTheFilterByteForByte) {
    this->fill({"L1", "L2 ", std::string("L2\0", 3), "L22", "L"});
    for (const char* reference : {"l1", "l2", "L2", " L1", "L1 ", ""}) {
        typename TypeParam::Element element;
        element.setFilter(TypeParam::Element::InstanceIDFilter, reference);
        EXPECT_FALSE(hasCurrent(element)) << reference;
    }
}

TYPED_TEST(RecordElement, FindsARecordWithAnEmptyIdentifier) {
    this->fill({"L1", ""});
    typename TypeParam::Element element;
    element.setFilter(TypeParam::Element::InstanceIDFilter, "");
    EXPECT_TRUE(hasCurrent(element));
    EXPECT_EQ(this->identifier(element), "");
}

TYPED_TEST(RecordElement, VisitsNoRecordWithTwoDifferentIdentifierFilters) {
    this->fill({"L1", "L2"});
    typename TypeParam::Element element;
    element.setFilter(TypeParam::Element::InstanceIDFilter, "L1");
    EXPECT_TRUE(hasCurrent(element));
    element.setFilter(TypeParam::Element::InstanceIDFilter, "L2");
    EXPECT_FALSE(hasCurrent(element));
}

TYPED_TEST(RecordElement, StaysAtTheRecordWhenTheSameFilterIsSetAgain) {
    this->fill({"L1", "L2"});
    typename TypeParam::Element element;
    element.setFilter(TypeParam::Element::InstanceIDFilter, "L2");
    element.setFilter(TypeParam::Element::InstanceIDFilter, "L2");
    EXPECT_EQ(this->identifier(element), "L2");
}

TYPED_TEST(RecordElement, FiltersFromTheCurrentRecord) {
    this->fill({"L1", "L2"});
    typename TypeParam::Element element;
    ++element;
    element.setFilter(TypeParam::Element::InstanceIDFilter, "L1");
    EXPECT_FALSE(hasCurrent(element));
}

TYPED_TEST(RecordElement, VisitsEveryRecordWithAFilterOfAnotherType) {
    this->fill({"L1", "x", "L2"});
    this->markDeleted(1);
    typename TypeParam::Element element;
    element.setFilter(this->other, "anything");
    EXPECT_THAT(this->visited(element), ElementsAre("L1", "L2"));
}

TYPED_TEST(RecordElement, SkipsRecordsThatDoNotMatch) {
    this->fill({"same", "other", "same", "other"});
    typename TypeParam::Element element;
    element.setFilter(this->other, "anything");
    element.setFilter(TypeParam::Element::InstanceIDFilter, "same");
    EXPECT_THAT(this->visited(element), ElementsAre("same", "same"));
}

TYPED_TEST(RecordElement, SkipsARecordDeletedByAnotherElement) {
    this->fill({"L1", "L2"});
    typename TypeParam::Element element;
    this->markDeleted(0);
    EXPECT_TRUE(hasCurrent(element));
    EXPECT_EQ(this->identifier(element), "L2");
}

TYPED_TEST(RecordElement, EvaluatesTheCurrentRecord) {
    this->fill({"L1", "L2"});
    typename TypeParam::Element element;
    EXPECT_TRUE(element.evaluate());
    element.setFilter(this->other, "anything");
    EXPECT_TRUE(element.evaluate());
    element.setFilter(TypeParam::Element::InstanceIDFilter, "L1");
    EXPECT_TRUE(element.evaluate());
    this->table()[0].InstanceID = "changed";
    EXPECT_FALSE(element.evaluate());
}

TYPED_TEST(RecordElement, ThrowsWhenAFilterIsEvaluatedAtTheEnd) {
    typename TypeParam::Element element;
    EXPECT_TRUE(element.evaluate());
    element.setFilter(TypeParam::Element::InstanceIDFilter, "L1");
    EXPECT_EQ(thrown<InstrumentationException>([&] { element.evaluate(); }),
              Words<typename TypeParam::Store>::notAvailable);
}

TYPED_TEST(RecordElement, CreatesARecord) {
    {
        typename TypeParam::Element element;
        EXPECT_TRUE(TypeParam::create(element, "L1"));
        EXPECT_FALSE(std::filesystem::exists(this->path()));
    }
    EXPECT_EQ(this->file(), std::string("1\nL1\n") + TypeParam::Store::defaultRecord);
}

TYPED_TEST(RecordElement, RejectsADuplicateRecord) {
    this->fill({"L1"});
    typename TypeParam::Element element;
    EXPECT_EQ(thrown<InstrumentationException>([&] { TypeParam::create(element, "L1"); }),
              Words<typename TypeParam::Store>::exists);
    EXPECT_EQ(this->table().size(), 1U);
}

TYPED_TEST(RecordElement, RemovesNothingWithoutAFilter) {
    this->fill({"L1"});
    {
        typename TypeParam::Element element;
        EXPECT_TRUE(hasCurrent(element));
        EXPECT_EQ(thrown<InstrumentationException>([&] { TypeParam::remove(element); }), this->identify());
    }
    EXPECT_TRUE(this->table()[0].inUse);
    EXPECT_FALSE(std::filesystem::exists(this->path()));
}

TYPED_TEST(RecordElement, ChecksForAFilterBeforeItChecksForARecord) {
    typename TypeParam::Element element;
    EXPECT_EQ(thrown<InstrumentationException>([&] { TypeParam::remove(element); }), this->identify());
}

TYPED_TEST(RecordElement, RemovesTheRecordOfTheFilterAndRewritesTheFile) {
    this->fill({"W0", "W1", "W2"});
    {
        typename TypeParam::Element element;
        element.setFilter(TypeParam::Element::InstanceIDFilter, "W1");
        TypeParam::remove(element);
        EXPECT_FALSE(this->table()[1].inUse);
        EXPECT_EQ(this->count(), 2U);
        EXPECT_FALSE(std::filesystem::exists(this->path()));
    }
    EXPECT_EQ(this->file(),
              std::string("2\nW0\n") + TypeParam::Store::defaultRecord + "W2\n" + TypeParam::Store::defaultRecord);
}

TYPED_TEST(RecordElement, RemovesTheCurrentRecordWithAFilterOfAnotherType) {
    this->fill({"L1", "L2"});
    typename TypeParam::Element element;
    element.setFilter(this->other, "anything");
    TypeParam::remove(element);
    EXPECT_EQ(this->identifier(element), "L1");
    EXPECT_TRUE(hasCurrent(element));
    EXPECT_EQ(this->identifier(element), "L2");
}

TYPED_TEST(RecordElement, RemovesNothingIfNoRecordMatches) {
    this->fill({"L1"});
    typename TypeParam::Element element;
    element.setFilter(TypeParam::Element::InstanceIDFilter, "L2");
    EXPECT_EQ(thrown<InstrumentationException>([&] { TypeParam::remove(element); }),
              Words<typename TypeParam::Store>::notAvailable);
    EXPECT_TRUE(this->table()[0].inUse);
}

TYPED_TEST(RecordElement, PropagatesAFailedRewriteFromTheDestructor) {
    this->fill({"L1"});
    blockWithDirectory(this->path());
    EXPECT_EQ(thrown<InstrumentationException>([] {
                  typename TypeParam::Element element;
                  element.setFilter(TypeParam::Element::InstanceIDFilter, "L1");
                  TypeParam::remove(element);
              }),
              Words<typename TypeParam::Store>::cannotOpen);
    EXPECT_EQ(this->count(), 0U);
}

TYPED_TEST(RecordElement, PropagatesTheFirstExceptionIfTheRewriteFails) {
    this->fill({"L1"});
    blockWithDirectory(this->path());
    EXPECT_EQ(thrown<KO::ProviderException>([] {
                  typename TypeParam::Element element;
                  element.setFilter(TypeParam::Element::InstanceIDFilter, "L1");
                  TypeParam::remove(element);
                  throw KO::ProviderException("the first one");
              }),
              "the first one");
}

}  // namespace
