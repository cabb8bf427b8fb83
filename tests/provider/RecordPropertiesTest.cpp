// Tests the getters and setters of leases and warranties.

#include "ElementKinds.h"

namespace {

using namespace providerTest;
using KO::LeaseWarrantyProvider::Lease;
using KO::LeaseWarrantyProvider::Warranty;

/** A property: its accessors and its member. */
template <class Element, class Unit, class Value>
struct PropertyRow {
    const char* name;
    bool (Element::*get)(Value&) const;
    void (Element::*set)(Value);
    Value Unit::*member;
};

template <class Value>
using LeaseRow = PropertyRow<Lease, LeaseUnit, Value>;
template <class Value>
using WarrantyRow = PropertyRow<Warranty, WarrantyUnit, Value>;

const LeaseRow<std::string> leaseStrings[] = {
    {"Lessor", &Lease::getLessor, &Lease::setLessor, &LeaseUnit::Lessor},
    {"BaseTermCommencementDate", &Lease::getBaseTermCommencementDate, &Lease::setBaseTermCommencementDate,
     &LeaseUnit::BaseTermCommencementDate},
    {"BaseRent", &Lease::getBaseRent, &Lease::setBaseRent, &LeaseUnit::BaseRent},
    {"FairMarketRental", &Lease::getFairMarketRental, &Lease::setFairMarketRental, &LeaseUnit::FairMarketRental},
    {"FairMarketValue", &Lease::getFairMarketValue, &Lease::setFairMarketValue, &LeaseUnit::FairMarketValue},
    {"TerminationValue", &Lease::getTerminationValue, &Lease::setTerminationValue, &LeaseUnit::TerminationValue},
};
const LeaseRow<unsigned int> leaseNumbers[] = {
    {"LeaseTerm", &Lease::getLeaseTerm, &Lease::setLeaseTerm, &LeaseUnit::LeaseTerm},
    {"NetMonthlyLeaseRateFactor", &Lease::getNetMonthlyLeaseRateFactor, &Lease::setNetMonthlyLeaseRateFactor,
     &LeaseUnit::NetMonthlyLeaseRateFactor},
};
const LeaseRow<bool> leaseFlags[] = {
    {"EarlyTerminationOption", &Lease::getEarlyTerminationOption, &Lease::setEarlyTerminationOption,
     &LeaseUnit::EarlyTerminationOption},
    {"FixedPricePurchaseOption", &Lease::getFixedPricePurchaseOption, &Lease::setFixedPricePurchaseOption,
     &LeaseUnit::FixedPricePurchaseOption},
    {"RenewalOption", &Lease::getRenewalOption, &Lease::setRenewalOption, &LeaseUnit::RenewalOption},
    {"BargainRenewalOption", &Lease::getBargainRenewalOption, &Lease::setBargainRenewalOption,
     &LeaseUnit::BargainRenewalOption},
};
const WarrantyRow<std::string> warrantyStrings[] = {
    {"Warrantor", &Warranty::getWarrantor, &Warranty::setWarrantor, &WarrantyUnit::Warrantor},
    {"CommencementDate", &Warranty::getCommencementDate, &Warranty::setCommencementDate,
     &WarrantyUnit::CommencementDate},
};
const WarrantyRow<unsigned int> warrantyNumbers[] = {
    {"Duration", &Warranty::getDuration, &Warranty::setDuration, &WarrantyUnit::Duration},
};

template <class Kind>
class RecordProperties : public RecordStore<typename Kind::Store> {
protected:
    using Element = typename Kind::Element;
    using Unit = typename Kind::Store::Unit;

    /**
     * Expects that the setter changes only the current record, that the getter returns the new value, and that both
     * throw at the end.
     */
    template <class Value>
    void expectProperty(const PropertyRow<Element, Unit, Value>& row, const Value& stored) {
        SCOPED_TRACE(row.name);
        this->emptyTable();
        this->fill({"before", "current"});
        Unit expected("current");
        expected.*row.member = stored;
        Element element;
        element.setFilter(Element::InstanceIDFilter, "current");
        (element.*row.set)(stored);
        EXPECT_EQ(Kind::Store::members(this->table()[1]), Kind::Store::members(expected));
        const Unit untouched("before");
        EXPECT_EQ(Kind::Store::members(this->table()[0]), Kind::Store::members(untouched));
        Value value{};
        EXPECT_TRUE((element.*row.get)(value));
        EXPECT_EQ(value, stored);
        ++element;
        const auto notAvailable = Words<typename Kind::Store>::notAvailable;
        EXPECT_EQ(thrown<InstrumentationException>([&] { (element.*row.get)(value); }), notAvailable);
        EXPECT_EQ(thrown<InstrumentationException>([&] { (element.*row.set)(stored); }), notAvailable);
    }
};

using LeaseProperties = RecordProperties<LeaseElementKind>;
using WarrantyProperties = RecordProperties<WarrantyElementKind>;

TEST_F(LeaseProperties, AreSetAndReturnedByTheirAccessors) {
    for (const auto& row : leaseStrings) {
        expectProperty(row, std::string("some text"));
    }
    for (const auto& row : leaseNumbers) {
        expectProperty(row, 4294967295U);
    }
    for (const auto& row : leaseFlags) {
        expectProperty(row, true);
    }
}

TEST_F(WarrantyProperties, AreSetAndReturnedByTheirAccessors) {
    for (const auto& row : warrantyStrings) {
        expectProperty(row, std::string("some text"));
    }
    for (const auto& row : warrantyNumbers) {
        expectProperty(row, 4294967295U);
    }
}

TEST_F(LeaseProperties, AreReadBackFromTheFile) {
    fill({"lease 1"});
    {
        Lease lease;
        for (const auto& row : leaseStrings) {
            (lease.*row.set)(std::string("long-enough-for-a-date-of-") + row.name);
        }
        for (const auto& row : leaseNumbers) {
            (lease.*row.set)(36);
        }
        for (const auto& row : leaseFlags) {
            (lease.*row.set)(true);
        }
    }
    const LeaseCache reloaded;
    const LeaseUnit& unit = reloaded.table.at(0);
    EXPECT_EQ(LeaseKind::members(unit), LeaseKind::members(table().at(0)));
    for (const auto& row : leaseStrings) {
        EXPECT_EQ(unit.*row.member, std::string("long-enough-for-a-date-of-") + row.name);
    }
}

template <class Kind>
class CommonProperties : public RecordProperties<Kind> {};

TYPED_TEST_SUITE(CommonProperties, ElementKinds, KindNames);

TYPED_TEST(CommonProperties, HaveAnElementName) {
    const typename TypeParam::Element element;
    std::string text = "before";
    EXPECT_TRUE(element.getElementName(text));
    EXPECT_EQ(text, std::string(TypeParam::Store::name) + " Information");
}

TYPED_TEST(CommonProperties, WithoutValuesReturnFalseAndKeepTheArguments) {
    this->fill({"A"});
    const typename TypeParam::Element element;
    std::string text = "before";
    unsigned short type = 7;
    EXPECT_FALSE(element.getCaption(text));
    EXPECT_FALSE(element.getDescription(text));
    EXPECT_FALSE(element.getConfigurationName(text));
    EXPECT_FALSE(element.getChangeableType(type));
    EXPECT_EQ(text, "before");
    EXPECT_EQ(type, 7);
}

TYPED_TEST(CommonProperties, HaveAnIdentifier) {
    this->fill({"lease 1"});
    typename TypeParam::Element element;
    std::string text;
    EXPECT_TRUE(element.getInstanceID(text));
    EXPECT_EQ(text, "lease 1");
    ++element;
    EXPECT_EQ(thrown<InstrumentationException>([&] { element.getInstanceID(text); }),
              Words<typename TypeParam::Store>::notAvailable);
}

}  // namespace
