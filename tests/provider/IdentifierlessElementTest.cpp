// An element with a store whose records have no identifier.

#include "ElementKinds.h"
#include "RecordElementImpl.h"

// These types are not in an unnamed namespace, since the explicit instantiations below also define unused operations.
namespace providerTest {

/** A store with one record that has no properties. */
class IdentifierlessBase {
public:
    enum class Property { InstanceID };

    operator bool() { return true; }
    void operator++() {}
    bool isTraced() const { return true; }
    void skipTo(const std::string&) {}
    bool create(const std::string&) { return true; }
    void remove() {}
    bool getProperty(Property, std::string&) const { return false; }
};

/** Traits with this store and with the names of an element. */
template <class Element>
struct Identifierless {
    using Base = IdentifierlessBase;
    static inline const KO::TraceSource& traceSource = Element::traceSource;
    static inline const KO::LeaseWarrantyProvider::RecordElementNames& names = Element::names;
};

}  // namespace providerTest

namespace KO::LeaseWarrantyProvider {

template class RecordElement<providerTest::Identifierless<LeaseElementTraits>>;
template class RecordElement<providerTest::Identifierless<WarrantyElementTraits>>;

}  // namespace KO::LeaseWarrantyProvider

namespace {

using namespace providerTest;
using KO::LeaseWarrantyProvider::LeaseElementTraits;
using KO::LeaseWarrantyProvider::RecordElement;
using KO::LeaseWarrantyProvider::WarrantyElementTraits;

struct IdentifierlessLease {
    using Element = RecordElement<Identifierless<LeaseElementTraits>>;
    static constexpr const char* sourceFile = "Lease.cpp";
    static constexpr const char* refusal = "Could not find Instance ID property on Lease.";
};

struct IdentifierlessWarranty {
    using Element = RecordElement<Identifierless<WarrantyElementTraits>>;
    static constexpr const char* sourceFile = "Warranty.cpp";
    static constexpr const char* refusal = "Could not find Instance ID property on Warranty.";
};

template <class Kind>
class IdentifierlessElement : public CleanAgent {};

using IdentifierlessKinds = testing::Types<IdentifierlessLease, IdentifierlessWarranty>;
TYPED_TEST_SUITE(IdentifierlessElement, IdentifierlessKinds, KindNames);

TYPED_TEST(IdentifierlessElement, ThrowsWhenComparedWithAnIdentifier) {
    typename TypeParam::Element element;
    agentEnvironment::forgetLog();
    EXPECT_EQ(thrown<InstrumentationException>([&] { element.setFilter(TypeParam::Element::InstanceIDFilter, "any"); }),
              TypeParam::refusal);
    EXPECT_EQ(thrown<InstrumentationException>([&] { element.evaluate(); }), TypeParam::refusal);
    const auto records = recordsOf(TypeParam::sourceFile, "evaluate");
    ASSERT_EQ(records.size(), 4U) << "an entry and a message per call, and no exit";
    for (const std::size_t failed : {1U, 3U}) {
        EXPECT_EQ(withoutLine(records[failed].text), message(TypeParam::refusal, TypeParam::sourceFile));
        EXPECT_EQ(records[failed].level, 3000);
    }
}

TYPED_TEST(IdentifierlessElement, MatchesFiltersOfAnotherType) {
    typename TypeParam::Element element;
    element.setFilter(static_cast<typename TypeParam::Element::FilterType>(3), "any");
    EXPECT_TRUE(element.evaluate());
}

}  // namespace
