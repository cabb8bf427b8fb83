// Log records of the elements with record stores.

#include <gmock/gmock.h>

#include "ElementKinds.h"

namespace {

using namespace providerTest;
using testing::ElementsAre;

template <class Kind>
class ElementTrace : public RecordStore<typename Kind::Store> {
protected:
    static std::string source() { return Kind::sourceFile; }
    static std::string named(const std::string& before) { return before + Kind::Store::name; }

    template <class Operation>
    static std::vector<std::string> loggedBy(const std::string& function, Operation operation) {
        return flowLoggedBy(source(), function, operation);
    }

    static std::vector<std::string> entryAndExit(const std::string& function, const std::string& list = {}) {
        return {entering(function, source(), list), exiting(function, source(), list)};
    }
};

TYPED_TEST_SUITE(ElementTrace, ElementKinds, KindNames);

TYPED_TEST(ElementTrace, LogsConstructionAndDestruction) {
    EXPECT_EQ(this->loggedBy(this->named(""), [] { typename TypeParam::Element element; }),
              this->entryAndExit(this->named("")));
    EXPECT_EQ(this->loggedBy(this->named("~"), [] { typename TypeParam::Element element; }),
              this->entryAndExit(this->named("~")));
}

TYPED_TEST(ElementTrace, LogsTheNamesOfOperators) {
    this->fill({"A"});
    typename TypeParam::Element element;
    EXPECT_EQ(this->loggedBy("operator bool", [&] { EXPECT_TRUE(hasCurrent(element)); }),
              this->entryAndExit("operator bool"));
    EXPECT_EQ(this->loggedBy("operator++", [&] { ++element; }), this->entryAndExit("operator++"));
}

TYPED_TEST(ElementTrace, LogsTypeAndValueOfAFilter) {
    this->fill({"A", "B"});
    typename TypeParam::Element element;
    EXPECT_EQ(this->loggedBy("setFilter", [&] { element.setFilter(TypeParam::Element::InstanceIDFilter, "B 1"); }),
              this->entryAndExit("setFilter", " filterType=0 reference=B 1"));
}

TYPED_TEST(ElementTrace, LogsEachEvaluation) {
    this->fill({"A", "B"});
    typename TypeParam::Element element;
    EXPECT_EQ(this->loggedBy("evaluate", [&] { element.setFilter(TypeParam::Element::InstanceIDFilter, "B"); }).size(),
              4U);
}

TYPED_TEST(ElementTrace, LogsTheNamesOfCreationRemovalAndGetters) {
    typename TypeParam::Element element;
    EXPECT_EQ(this->loggedBy(this->named("create"), [&] { TypeParam::create(element, "A"); }),
              this->entryAndExit(this->named("create"), " instanceId=A"));
    element.setFilter(TypeParam::Element::InstanceIDFilter, "A");
    EXPECT_EQ(this->loggedBy(this->named("remove"), [&] { TypeParam::remove(element); }),
              this->entryAndExit(this->named("remove")));
    std::string text;
    EXPECT_EQ(this->loggedBy("getInstanceID", [&] { element.getInstanceID(text); }),
              this->entryAndExit("getInstanceID"));
    EXPECT_EQ(this->loggedBy("getElementName", [&] { element.getElementName(text); }),
              this->entryAndExit("getElementName"));
    EXPECT_EQ(this->loggedBy("getCaption", [&] { element.getCaption(text); }), this->entryAndExit("getCaption"));
    EXPECT_EQ(this->loggedBy("getDescription", [&] { element.getDescription(text); }),
              this->entryAndExit("getDescription"));
}

TYPED_TEST(ElementTrace, LogsARemovalWithoutAFilterAtErrorLevelAndNoExit) {
    this->fill({"A"});
    typename TypeParam::Element element;
    agentEnvironment::forgetLog();
    EXPECT_THROW(TypeParam::remove(element), InstrumentationException);
    const auto records = recordsOf(this->source(), this->named("remove"));
    ASSERT_EQ(records.size(), 2U);
    EXPECT_EQ(withoutLine(records[0].text), entering(this->named("remove"), this->source()));
    EXPECT_EQ(withoutLine(records[1].text),
              message(std::string("Identify a ") + TypeParam::Store::name + " to remove.", this->source()));
    EXPECT_EQ(records[1].level, 3000);
}

TYPED_TEST(ElementTrace, LogsNoExitOfAFailedGetter) {
    typename TypeParam::Element element;
    std::string text;
    EXPECT_THAT(
        this->loggedBy("getInstanceID", [&] { EXPECT_THROW(element.getInstanceID(text), InstrumentationException); }),
        ElementsAre(entering("getInstanceID", this->source())));
}

using LeaseTrace = ElementTrace<LeaseElementKind>;
using WarrantyTrace = ElementTrace<WarrantyElementKind>;

TEST_F(LeaseTrace, LogsTheNamesOfPropertyAccessors) {
    fill({"A"});
    KO::LeaseWarrantyProvider::Lease lease;
    std::string text;
    unsigned int number = 0;
    bool flag = false;
    EXPECT_EQ(loggedBy("getLessor", [&] { lease.getLessor(text); }), entryAndExit("getLessor"));
    EXPECT_EQ(loggedBy("setBaseRent", [&] { lease.setBaseRent("100"); }), entryAndExit("setBaseRent"));
    EXPECT_EQ(loggedBy("getLeaseTerm", [&] { lease.getLeaseTerm(number); }), entryAndExit("getLeaseTerm"));
    EXPECT_EQ(loggedBy("setRenewalOption", [&] { lease.setRenewalOption(true); }), entryAndExit("setRenewalOption"));
    EXPECT_EQ(loggedBy("getBargainRenewalOption", [&] { lease.getBargainRenewalOption(flag); }),
              entryAndExit("getBargainRenewalOption"));
}

TEST_F(WarrantyTrace, LogsTheNamesOfPropertyAccessors) {
    fill({"A"});
    KO::LeaseWarrantyProvider::Warranty warranty;
    std::string text;
    unsigned int number = 0;
    EXPECT_EQ(loggedBy("getWarrantor", [&] { warranty.getWarrantor(text); }), entryAndExit("getWarrantor"));
    EXPECT_EQ(loggedBy("setCommencementDate", [&] { warranty.setCommencementDate("x"); }),
              entryAndExit("setCommencementDate"));
    EXPECT_EQ(loggedBy("getDuration", [&] { warranty.getDuration(number); }), entryAndExit("getDuration"));
}

}  // namespace
