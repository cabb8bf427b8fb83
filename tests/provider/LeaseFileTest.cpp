// Tests what only the lease file contains: four flags and the order of its thirteen lines.

#include <iterator>

#include "RecordKinds.h"

namespace {

using namespace providerTest;

using LeaseFile = RecordStore<LeaseKind>;

/** The flags in file order, and the line of the first one. */
constexpr bool LeaseUnit::*flags[] = {&LeaseUnit::EarlyTerminationOption, &LeaseUnit::FixedPricePurchaseOption,
                                      &LeaseUnit::RenewalOption, &LeaseUnit::BargainRenewalOption};
constexpr std::size_t lineOfFirstFlag = 4;

TEST_F(LeaseFile, InitializesNewRecordsWithFalseZeroAndEmptyStrings) {
    const LeaseUnit expected = [] {
        LeaseUnit unit;
        unit.inUse = true;
        unit.EarlyTerminationOption = unit.FixedPricePurchaseOption = unit.RenewalOption = unit.BargainRenewalOption =
            false;
        unit.LeaseTerm = unit.NetMonthlyLeaseRateFactor = 0;
        unit.InstanceID = unit.Lessor = unit.BaseRent = unit.BaseTermCommencementDate = "";
        unit.FairMarketRental = unit.FairMarketValue = unit.TerminationValue = "";
        return unit;
    }();
    const LeaseUnit defaults;
    EXPECT_EQ(LeaseKind::members(defaults), LeaseKind::members(expected));
    LeaseUnit named("lease 1");
    EXPECT_EQ(named.InstanceID, "lease 1");
    named.InstanceID = "";
    EXPECT_EQ(LeaseKind::members(named), LeaseKind::members(expected));
}

TEST_F(LeaseFile, ContainsThirteenLinesPerRecordInFileOrder) {
    LeaseUnit unit("lease 1");
    unit.Lessor = "ACME Leasing Co";
    unit.BaseTermCommencementDate = "20240101000000.000000+060";
    unit.LeaseTerm = 36;
    unit.EarlyTerminationOption = true;
    unit.RenewalOption = true;
    unit.BaseRent = "100.50 EUR";
    unit.FairMarketRental = "91";
    unit.FairMarketValue = "82";
    unit.TerminationValue = "73";
    unit.NetMonthlyLeaseRateFactor = 5;
    EXPECT_EQ(written(unit),
              "lease_1\n"
              "ACME_Leasing_Co\n"
              "20240101000000.000000+060\n"
              "36\n"
              "1\n"
              "0\n"
              "1\n"
              "0\n"
              "100.50_EUR\n"
              "91\n"
              "82\n"
              "73\n"
              "5\n");
    EXPECT_EQ(LeaseKind::members(reread(unit)), LeaseKind::members(unit));
}

TEST_F(LeaseFile, StoresFlagsAsOneOrZero) {
    for (std::size_t flag = 0; flag < std::size(flags); ++flag) {
        LeaseUnit unit("A");
        unit.*flags[flag] = true;
        std::vector<std::string> expected = linesOf(std::string("A\n") + LeaseKind::defaultRecord);
        expected[lineOfFirstFlag + flag] = "1";
        EXPECT_EQ(linesOf(written(unit)), expected);
        EXPECT_TRUE(reread(unit).*flags[flag]);
    }
}

/** Returns a file of two records, with one line of the first record replaced. */
std::string damaged(std::size_t line, const std::string& text) {
    std::vector<std::string> lines = {
        "A", "Ay", "20240101000000.000000+000", "1", "1", "1", "1", "1", "11", "12", "13", "14", "2"};
    lines[line] = text;
    std::string content = "2\n";
    for (const std::string& each : lines) {
        content += each + "\n";
    }
    return content + "B\nBee\n20250101000000.000000+000\n3\n0\n0\n0\n0\n21\n22\n23\n24\n4\n";
}

/** Expects that reading stopped in the first record, with this term and after this number of flags. */
void expectStopped(const LeaseCache& cache, unsigned int leaseTerm, std::size_t flagsRead) {
    ASSERT_EQ(cache.recordCountLease, 2U);
    ASSERT_EQ(cache.table.size(), 2U);
    LeaseUnit expected("A");
    expected.Lessor = "Ay";
    expected.BaseTermCommencementDate = "20240101000000.000000+000";
    expected.LeaseTerm = leaseTerm;
    for (std::size_t flag = 0; flag < flagsRead; ++flag) {
        expected.*flags[flag] = true;
    }
    for (const LeaseUnit& unit : cache.table) {
        EXPECT_EQ(LeaseKind::members(unit), LeaseKind::members(expected));
    }
}

TEST_F(LeaseFile, StopsReadingAtANonNumericFlag) {
    for (std::size_t flag = 0; flag < std::size(flags); ++flag) {
        for (const char* text : {"true", "x", "2", "-1", "*"}) {
            SCOPED_TRACE(text);
            expectStopped(*load(damaged(lineOfFirstFlag + flag, text)), 1, flag);
        }
    }
}

TEST_F(LeaseFile, AcceptsFlagsWithASignOrLeadingZeros) {
    for (std::size_t flag = 0; flag < std::size(flags); ++flag) {
        for (const auto& [text, value] : {std::pair("+1", true), std::pair("01", true), std::pair("+0", false),
                                          std::pair("00", false), std::pair("-0", false)}) {
            SCOPED_TRACE(text);
            const auto cache = load(damaged(lineOfFirstFlag + flag, text));
            EXPECT_EQ(cache->table.at(0).*flags[flag], value);
            EXPECT_EQ(cache->table.at(1).InstanceID, "B") << "reading continues";
        }
    }
}

TEST_F(LeaseFile, StopsReadingAtAnInvalidNumber) {
    for (const char* text : {"x", "-5", "-0", "+", "+-5", "++5", "+x", "+4294967296", "4294967296", ".5", "*"}) {
        SCOPED_TRACE(text);
        expectStopped(*load(damaged(3, text)), 0, 0);
    }
}

TEST_F(LeaseFile, ReadsLeadingDigitsOfANumberAndTheRestAsTheNextField) {
    const auto cache = load(damaged(3, "12x"));
    EXPECT_EQ(cache->table[0].LeaseTerm, 12U);
    EXPECT_FALSE(cache->table[0].EarlyTerminationOption);
}

TEST_F(LeaseFile, RepeatsValuesOfThePrecedingRecordAfterReadingStops) {
    std::string content = damaged(12, "2");
    content.replace(content.find("\n23\n"), 4, "\n");  // one line fewer, so that the last number is missing
    const auto cache = load(content);
    const LeaseUnit& second = cache->table.at(1);
    EXPECT_EQ(second.InstanceID, "B");
    EXPECT_EQ(second.FairMarketValue, "24");
    EXPECT_EQ(second.TerminationValue, "4");
    EXPECT_EQ(second.NetMonthlyLeaseRateFactor, 2U);
}

TEST_F(LeaseFile, KeepsItsBytesWhenReadAndWritten) {
    const std::string content = contentOf(std::filesystem::path(PROVIDER_TEST_DATA) / "Lease.dat");
    ASSERT_FALSE(content.empty());
    const auto cache = load(content);
    ASSERT_EQ(cache->table.size(), 3U);
    const LeaseUnit& full = cache->table[0];
    EXPECT_EQ(full.InstanceID, "/system/computer");
    EXPECT_EQ(full.Lessor, "ACME Leasing Co");
    EXPECT_EQ(full.BaseTermCommencementDate, "20240229123000.000000+060");
    EXPECT_EQ(full.LeaseTerm, 36U);
    EXPECT_TRUE(full.EarlyTerminationOption);
    EXPECT_FALSE(full.FixedPricePurchaseOption);
    EXPECT_TRUE(full.RenewalOption);
    EXPECT_FALSE(full.BargainRenewalOption);
    EXPECT_EQ(full.BaseRent, "1 250.00 EUR");
    EXPECT_EQ(full.FairMarketRental, "1100");
    EXPECT_EQ(full.FairMarketValue, "45 000");
    EXPECT_EQ(full.TerminationValue, "");
    EXPECT_EQ(full.NetMonthlyLeaseRateFactor, 4294967295U);
    EXPECT_EQ(cache->table[1].InstanceID, "lease 2");
    EXPECT_EQ(cache->table[1].Lessor, "");
    EXPECT_EQ(cache->table[2].Lessor, "M\xC3\xBCller & S\xC3\xB6hne");
    EXPECT_TRUE(cache->table[2].BargainRenewalOption);
    std::filesystem::remove(path());
    cache->flushCache();
    EXPECT_EQ(file(), content);
}

}  // namespace
