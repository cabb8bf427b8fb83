// Reads and writes each property number with each type.

#include <type_traits>
#include <variant>

#include "RecordKinds.h"

namespace {

using namespace providerTest;

constexpr const char* wrongType = "Incorrect Type or Property";
constexpr const char* wrongTypeOfNumber = "Incorrect Type or Property.";
constexpr const char* wrongTypeOfText = "Incorrect Type or Property or Property is read-Only.";

template <class Unit>
using Member = std::variant<std::monostate, std::string Unit::*, unsigned int Unit::*, bool Unit::*>;

/** Returns the member of each property number, from 0. Other numbers are invalid. */
template <class Kind>
std::vector<Member<typename Kind::Unit>> membersByNumber() {
    using Unit = typename Kind::Unit;
    if constexpr (std::is_same_v<Kind, LeaseKind>) {
        return {&Unit::InstanceID,
                &Unit::LeaseTerm,
                &Unit::NetMonthlyLeaseRateFactor,
                &Unit::Lessor,
                &Unit::BaseTermCommencementDate,
                &Unit::BaseRent,
                &Unit::FairMarketRental,
                &Unit::FairMarketValue,
                &Unit::TerminationValue,
                &Unit::EarlyTerminationOption,
                &Unit::FixedPricePurchaseOption,
                &Unit::RenewalOption,
                &Unit::BargainRenewalOption};
    } else {
        return {&Unit::InstanceID, &Unit::Warrantor, &Unit::CommencementDate, &Unit::Duration};
    }
}

template <class Kind>
class PropertyAccess : public RecordStore<Kind> {
protected:
    using Property = typename Kind::Property;
    using Unit = typename Kind::Unit;
    using Base = typename Kind::Base;

    /** Returns the valid property numbers and some invalid ones. */
    static std::vector<int> numbers() {
        std::vector<int> found = {-2147483647 - 1, -1, 100, 2147483647};
        const int count = static_cast<int>(membersByNumber<Kind>().size());
        for (int number = 0; number <= count; ++number) {
            found.push_back(number);
        }
        return found;
    }

    static Member<Unit> memberOf(int number) {
        const auto members = membersByNumber<Kind>();
        const auto index = static_cast<std::size_t>(number);
        return number >= 0 && index < members.size() ? members[index] : Member<Unit>();
    }

    /** Returns the member that a property number accesses with a type; null if the access is invalid. */
    template <class Value>
    static Value Unit::*reached(int number) {
        const Member<Unit> member = memberOf(number);
        const auto* typed = std::get_if<Value Unit::*>(&member);
        return typed == nullptr ? nullptr : *typed;
    }

    template <class Value>
    void expectGet(int number, const Value& sentinel, const Value& stored) {
        this->emptyTable();
        this->fill({"before", "current", "after"});
        const auto member = reached<Value>(number);
        if (member != nullptr) {
            this->table()[1].*member = stored;
        }
        Base base;
        ++base;
        Value value = sentinel;
        const auto get = [&] { EXPECT_TRUE(base.getProperty(static_cast<Property>(number), value)); };
        EXPECT_EQ(thrown<InstrumentationException>(get), member == nullptr ? wrongType : "");
        EXPECT_EQ(value, member == nullptr ? sentinel : stored);
    }

    template <class Value>
    void expectSet(int number, const Value& stored, const char* refusal) {
        this->emptyTable();
        this->fill({"before", "current", "after"});
        std::filesystem::remove(this->path());
        const bool writable = reached<Value>(number) != nullptr && number != 0;
        std::vector<Unit> expected = this->table();
        if (writable) {
            expected[1].*reached<Value>(number) = stored;
        }
        {
            Base base;
            ++base;
            const auto set = [&] { base.setProperty(static_cast<Property>(number), stored); };
            EXPECT_EQ(thrown<InstrumentationException>(set), writable ? "" : refusal);
        }
        for (std::size_t index = 0; index < expected.size(); ++index) {
            EXPECT_EQ(Kind::members(this->table()[index]), Kind::members(expected[index])) << index;
        }
        EXPECT_EQ(std::filesystem::exists(this->path()), writable) << "the file is written only after a change";
    }

    template <class Value>
    void expectNothingAtTheEnd(int number, const Value& sentinel) {
        this->emptyTable();
        this->fill({"A"});
        Base base;
        ++base;
        Value value = sentinel;
        const auto property = static_cast<Property>(number);
        EXPECT_EQ(thrown<InstrumentationException>([&] { base.getProperty(property, value); }),
                  Words<Kind>::notAvailable);
        EXPECT_EQ(value, sentinel);
        EXPECT_EQ(thrown<InstrumentationException>([&] { base.setProperty(property, sentinel); }),
                  Words<Kind>::notAvailable);
    }
};

TYPED_TEST_SUITE(PropertyAccess, RecordKinds, KindNames);

TYPED_TEST(PropertyAccess, ReadsStringsAndRejectsOtherProperties) {
    for (const int number : this->numbers()) {
        SCOPED_TRACE(number);
        this->template expectGet<std::string>(number, "untouched", "stored text");
    }
}

TYPED_TEST(PropertyAccess, ReadsNumbersAndRejectsOtherProperties) {
    for (const int number : this->numbers()) {
        SCOPED_TRACE(number);
        this->template expectGet<unsigned int>(number, 12345U, 4294967295U);
    }
}

TYPED_TEST(PropertyAccess, WritesStringsExceptTheIdentifierAndRejectsOtherProperties) {
    for (const int number : this->numbers()) {
        SCOPED_TRACE(number);
        this->template expectSet<std::string>(number, "stored text", wrongTypeOfText);
    }
}

TYPED_TEST(PropertyAccess, WritesNumbersAndRejectsOtherProperties) {
    for (const int number : this->numbers()) {
        SCOPED_TRACE(number);
        this->template expectSet<unsigned int>(number, 4294967295U, wrongTypeOfNumber);
    }
}

TYPED_TEST(PropertyAccess, IsRejectedAtTheEnd) {
    for (const int number : this->numbers()) {
        SCOPED_TRACE(number);
        this->template expectNothingAtTheEnd<std::string>(number, "untouched");
        this->template expectNothingAtTheEnd<unsigned int>(number, 12345U);
    }
}

TYPED_TEST(PropertyAccess, AccessesADeletedCurrentRecord) {
    this->fill({"A"});
    typename TypeParam::Base base;
    TypeParam::remove(base);
    base.setProperty(TypeParam::text, std::string("late"));
    std::string text;
    EXPECT_TRUE(base.getProperty(TypeParam::text, text));
    EXPECT_EQ(text, "late");
}

using LeaseFlagAccess = PropertyAccess<LeaseKind>;

TEST_F(LeaseFlagAccess, ReadsFlagsAndRejectsOtherProperties) {
    for (const int number : numbers()) {
        SCOPED_TRACE(number);
        expectGet<bool>(number, false, true);
        expectGet<bool>(number, true, false);
    }
}

TEST_F(LeaseFlagAccess, WritesFlagsAndRejectsOtherProperties) {
    for (const int number : numbers()) {
        SCOPED_TRACE(number);
        expectSet<bool>(number, true, wrongType);
    }
}

TEST_F(LeaseFlagAccess, IsRejectedAtTheEnd) {
    for (const int number : numbers()) {
        SCOPED_TRACE(number);
        expectNothingAtTheEnd<bool>(number, true);
    }
}

template <class Base, class Property, class = void>
constexpr bool readsFlags = false;

template <class Base, class Property>
constexpr bool readsFlags<Base, Property,
                          std::void_t<decltype(std::declval<Base&>().getProperty(Property(), std::declval<bool&>()))>> =
    true;

TEST(WarrantyFlagAccess, DoesNotExist) {
    EXPECT_TRUE((readsFlags<LeaseBase, LeaseKind::Property>));
    EXPECT_FALSE((readsFlags<WarrantyBase, WarrantyKind::Property>));
}

}  // namespace
