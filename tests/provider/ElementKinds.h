#pragma once

#include "Lease.h"
#include "RecordKinds.h"
#include "Warranty.h"

/** Parameters of typed tests: the two elements with record stores. */
namespace providerTest {

struct LeaseElementKind {
    using Store = LeaseKind;
    using Element = KO::LeaseWarrantyProvider::Lease;

    static constexpr const char* sourceFile = "Lease.cpp";
    static bool create(Element& element, const std::string& id) { return element.createLease(id); }
    static void remove(Element& element) { element.removeLease(); }
};

struct WarrantyElementKind {
    using Store = WarrantyKind;
    using Element = KO::LeaseWarrantyProvider::Warranty;

    static constexpr const char* sourceFile = "Warranty.cpp";
    static bool create(Element& element, const std::string& id) { return element.createWarranty(id); }
    static void remove(Element& element) { element.removeWarranty(); }
};

using ElementKinds = testing::Types<LeaseElementKind, WarrantyElementKind>;

}  // namespace providerTest
