#pragma once

#include "Lease.h"
#include "Sides.h"
#include "Warranty.h"

/** The two elements over record stores as the typed tests see them. */
namespace providerTest {

struct LeaseElementSide {
    using Store = LeaseSide;
    using Element = KO::LeaseWarrantyProvider::Lease;

    static constexpr const char* sourceFile = "Lease.cpp";
    static bool create(Element& element, const std::string& id) { return element.createLease(id); }
    static void remove(Element& element) { element.removeLease(); }
};

struct WarrantyElementSide {
    using Store = WarrantySide;
    using Element = KO::LeaseWarrantyProvider::Warranty;

    static constexpr const char* sourceFile = "Warranty.cpp";
    static bool create(Element& element, const std::string& id) { return element.createWarranty(id); }
    static void remove(Element& element) { element.removeWarranty(); }
};

using ElementSides = testing::Types<LeaseElementSide, WarrantyElementSide>;

}  // namespace providerTest
