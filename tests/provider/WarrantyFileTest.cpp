// Tests what only the warranty file contains: the order of its four lines.

#include "RecordKinds.h"

namespace {

using namespace providerTest;

using WarrantyFile = RecordStore<WarrantyKind>;

TEST_F(WarrantyFile, InitializesNewRecordsWithZeroAndEmptyStrings) {
    const WarrantyUnit defaults;
    EXPECT_EQ(WarrantyKind::members(defaults), std::make_tuple(true, 0U, std::string(), std::string(), std::string()));
    const WarrantyUnit named("warranty 1");
    EXPECT_EQ(WarrantyKind::members(named),
              std::make_tuple(true, 0U, std::string("warranty 1"), std::string(), std::string()));
}

TEST_F(WarrantyFile, ContainsFourLinesPerRecordInFileOrder) {
    WarrantyUnit unit("warranty 1");
    unit.Warrantor = "Acme Service";
    unit.CommencementDate = "20240101000000.000000+060";
    unit.Duration = 24;
    EXPECT_EQ(written(unit), "warranty_1\nAcme_Service\n20240101000000.000000+060\n24\n");
    EXPECT_EQ(WarrantyKind::members(reread(unit)), WarrantyKind::members(unit));
}

TEST_F(WarrantyFile, ContainsFiveLinesForASingleRecord) {
    {
        WarrantyBase base;
        base.createWarranty("W1");
        base.setProperty(WarrantyKind::Property::Warrantor, std::string("Acme Service"));
    }
    EXPECT_EQ(file(), "1\nW1\nAcme_Service\n00000000000000.000000-000\n0\n");
}

TEST_F(WarrantyFile, StopsReadingAtAnInvalidNumber) {
    for (const char* text : {"x", "-5", "-0", "+", "+-5", "+4294967296", "4294967296", "true"}) {
        SCOPED_TRACE(text);
        const auto cache = load("2\nA\nAy\n20240101000000.000000+000\n" + std::string(text) +
                                "\nB\nBee\n20250101000000.000000+000\n7\n");
        ASSERT_EQ(cache->table.size(), 2U);
        EXPECT_EQ(WarrantyKind::members(cache->table[0]), std::make_tuple(true, 0U, std::string("A"), std::string("Ay"),
                                                                          std::string("20240101000000.000000+000")));
        EXPECT_EQ(WarrantyKind::members(cache->table[1]), WarrantyKind::members(cache->table[0]));
    }
}

TEST_F(WarrantyFile, KeepsItsBytesWhenReadAndWritten) {
    const std::string content = contentOf(std::filesystem::path(PROVIDER_TEST_DATA) / "Warranty.dat");
    ASSERT_FALSE(content.empty());
    const auto cache = load(content);
    ASSERT_EQ(cache->table.size(), 3U);
    EXPECT_EQ(WarrantyKind::members(cache->table[0]),
              std::make_tuple(true, 4294967295U, std::string("/system/computer"), std::string("Acme Service & Co"),
                              std::string("20240229123000.000000+060")));
    EXPECT_EQ(cache->table[1].Warrantor, "");
    EXPECT_EQ(cache->table[2].Warrantor, "M\xC3\xBCller S\xC3\xB6hne");
    std::filesystem::remove(path());
    cache->flushCache();
    EXPECT_EQ(file(), content);
}

}  // namespace
