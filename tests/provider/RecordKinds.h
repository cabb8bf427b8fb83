#pragma once

#include <memory>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

#include "KO/Exceptions.h"
#include "LeaseBase.h"
#include "Support.h"
#include "WarrantyBase.h"

/** Parameters of typed tests: the two record stores. */
namespace providerTest {

using KO::InstrumentationException;
using KO::LeaseWarrantyProvider::LeaseBase;
using KO::LeaseWarrantyProvider::LeaseCache;
using KO::LeaseWarrantyProvider::LeaseUnit;
using KO::LeaseWarrantyProvider::WarrantyBase;
using KO::LeaseWarrantyProvider::WarrantyCache;
using KO::LeaseWarrantyProvider::WarrantyUnit;

/** A member of a record and its line in the file, counted from the record's first line. */
template <class Unit, class Value>
struct Line {
    Value Unit::*member;
    std::size_t line;
};

struct LeaseKind {
    using Base = LeaseBase;
    using Cache = LeaseCache;
    using Unit = LeaseUnit;
    using Property = KO::LeaseWarrantyProvider::Properties::Lease;

    static constexpr const char* name = "Lease";
    static constexpr const char* defaultRecord = "*\n00000000000000.000000-000\n0\n0\n0\n0\n0\n*\n*\n*\n*\n0\n";
    static constexpr std::size_t linesOfRecord = 13;
    static constexpr Property text = Property::Lessor;
    static constexpr std::string Unit::*textMember = &Unit::Lessor;
    static constexpr Property number = Property::LeaseTerm;
    static constexpr unsigned int Unit::*numberMember = &Unit::LeaseTerm;

    static Cache& cache() { return Base::cache; }
    static unsigned int& count(Cache& cache) { return cache.recordCountLease; }
    static bool create(Base& base, const std::string& id) { return base.createLease(id); }
    static void select(Base& base, const std::string& id) { base.selectLease(id); }
    static void remove(Base& base) { base.deleteLease(); }

    static std::vector<Line<Unit, std::string>> values() {
        return {{&Unit::Lessor, 1},
                {&Unit::BaseRent, 8},
                {&Unit::FairMarketRental, 9},
                {&Unit::FairMarketValue, 10},
                {&Unit::TerminationValue, 11}};
    }
    static Line<Unit, std::string> date() { return {&Unit::BaseTermCommencementDate, 2}; }
    static std::vector<Line<Unit, unsigned int>> numbers() {
        return {{&Unit::LeaseTerm, 3}, {&Unit::NetMonthlyLeaseRateFactor, 12}};
    }

    static auto members(const Unit& unit) {
        return std::tie(unit.inUse, unit.EarlyTerminationOption, unit.FixedPricePurchaseOption, unit.RenewalOption,
                        unit.BargainRenewalOption, unit.LeaseTerm, unit.NetMonthlyLeaseRateFactor, unit.InstanceID,
                        unit.Lessor, unit.BaseRent, unit.BaseTermCommencementDate, unit.FairMarketRental,
                        unit.FairMarketValue, unit.TerminationValue);
    }
};

struct WarrantyKind {
    using Base = WarrantyBase;
    using Cache = WarrantyCache;
    using Unit = WarrantyUnit;
    using Property = KO::LeaseWarrantyProvider::Properties::Warranty;

    static constexpr const char* name = "Warranty";
    static constexpr const char* defaultRecord = "*\n00000000000000.000000-000\n0\n";
    static constexpr std::size_t linesOfRecord = 4;
    static constexpr Property text = Property::Warrantor;
    static constexpr std::string Unit::*textMember = &Unit::Warrantor;
    static constexpr Property number = Property::Duration;
    static constexpr unsigned int Unit::*numberMember = &Unit::Duration;

    static Cache& cache() { return Base::cache; }
    static unsigned int& count(Cache& cache) { return cache.recordCountWarranty; }
    static bool create(Base& base, const std::string& id) { return base.createWarranty(id); }
    static void select(Base& base, const std::string& id) { base.selectWarranty(id); }
    static void remove(Base& base) { base.deleteWarranty(); }

    static std::vector<Line<Unit, std::string>> values() { return {{&Unit::Warrantor, 1}}; }
    static Line<Unit, std::string> date() { return {&Unit::CommencementDate, 2}; }
    static std::vector<Line<Unit, unsigned int>> numbers() { return {{&Unit::Duration, 3}}; }

    static auto members(const Unit& unit) {
        return std::tie(unit.inUse, unit.Duration, unit.InstanceID, unit.Warrantor, unit.CommencementDate);
    }
};

using RecordKinds = testing::Types<LeaseKind, WarrantyKind>;

struct KindNames {
    template <class Kind>
    static std::string GetName(int number) {
        return number == 0 ? LeaseKind::name : WarrantyKind::name;
    }
};

/** Messages and names of a record kind. The two kinds differ in one word. */
template <class Kind>
struct Words {
    static std::string with(const std::string& before, const std::string& after) { return before + Kind::name + after; }

    inline static const std::string fileName = with("", ".dat");
    inline static const std::string sourceFile = with("", "Base.cpp");
    inline static const std::string countName = with("recordCount", "");
    inline static const std::string noRecords = with("Zero ", " Records Available");
    inline static const std::string notAvailable = with("", " record not available");
    inline static const std::string exists = with("", " with the supplied instance Id exists.");
    inline static const std::string cannotOpen = with("Could not open ", " record.");
};

/** A store with an empty table and no file, for each kind of record. */
template <class Kind>
class RecordStore : public CleanAgent {
protected:
    using Base = typename Kind::Base;
    using Cache = typename Kind::Cache;
    using Unit = typename Kind::Unit;

    void SetUp() override {
        CleanAgent::SetUp();
        emptyTable();
    }
    void TearDown() override {
        emptyTable();
        CleanAgent::TearDown();
    }

    static void emptyTable() {
        table().clear();
        Kind::cache().index = {};
        count() = 0;
    }

    static std::vector<Unit>& table() { return Kind::cache().table; }
    static unsigned int& count() { return Kind::count(Kind::cache()); }

    /** Appends records in use to the table without writing the file. */
    static void fill(const std::vector<std::string>& identifiers) {
        for (const std::string& identifier : identifiers) {
            table().push_back(Unit(identifier));
            ++count();
        }
    }

    static void markDeleted(std::size_t index) {
        table()[index].inUse = false;
        --count();
    }

    static std::string identifier(const Base& base) {
        std::string text;
        base.getProperty(Kind::Property::InstanceID, text);
        return text;
    }

    /** Returns whether the cursor is at the end. Unlike the cursor's operator bool, does not move it. */
    static bool atEnd(const Base& base) {
        std::string text;
        return !thrown<InstrumentationException>([&] { base.getProperty(Kind::Property::InstanceID, text); }).empty();
    }

    static std::filesystem::path path() { return agentEnvironment::dataDirectory() / Words<Kind>::fileName; }
    static std::string file() { return contentOf(path()); }

    /** Loads a file with this content. */
    static std::unique_ptr<Cache> load(const std::string& content) {
        write(path(), content);
        return std::make_unique<Cache>();
    }

    /** Returns the lines that the store writes for one record, without the count. */
    static std::string written(const Unit& unit) {
        Cache cache;
        cache.table = {unit};
        Kind::count(cache) = 1;
        cache.flushCache();
        const std::string content = file();
        EXPECT_EQ(content.substr(0, 2), "1\n");
        return content.substr(2);
    }

    /** Returns a record that was written and read back. */
    static Unit reread(const Unit& unit) {
        const auto cache = load("1\n" + written(unit));
        return cache->table.at(0);
    }
};

/** Splits a string into lines. Each line must end with a line feed. */
inline std::vector<std::string> linesOf(const std::string& text) {
    std::vector<std::string> lines;
    std::string line;
    for (const char byte : text) {
        if (byte == '\n') {
            lines.push_back(std::exchange(line, {}));
        } else {
            line += byte;
        }
    }
    EXPECT_EQ(line, "") << "the last line has no line feed";
    return lines;
}

}  // namespace providerTest
