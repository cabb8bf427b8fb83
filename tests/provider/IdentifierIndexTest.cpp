// Finding records by identifier.

#include <gtest/gtest.h>

#include "IdentifierIndex.h"
#include "LeaseBase.h"

namespace {

using KO::LeaseWarrantyProvider::IdentifierIndex;
using KO::LeaseWarrantyProvider::LeaseUnit;

class IdentifierIndexTest : public testing::Test {
protected:
    /** Appends records and updates the index. */
    void append(std::initializer_list<const char*> identifiers) {
        for (const char* identifier : identifiers) {
            table.push_back(LeaseUnit(identifier));
        }
        index.update(table);
    }

    /** Searches for all records with an identifier, one after the other. Returns their positions. */
    std::vector<std::size_t> positions(const std::string& identifier) const {
        std::vector<std::size_t> found;
        for (std::size_t next = 0; (next = index.find(table, identifier, next)) != index.none; ++next) {
            found.push_back(next);
        }
        return found;
    }

    std::vector<LeaseUnit> table{};
    IdentifierIndex<LeaseUnit> index{};
};

using Positions = std::vector<std::size_t>;

TEST_F(IdentifierIndexTest, FindsNothingInAnEmptyTable) {
    EXPECT_EQ(positions("A"), Positions{});
    append({});
    EXPECT_EQ(positions("A"), Positions{});
}

TEST_F(IdentifierIndexTest, FindsRecordsOfOneIdentifierInTableOrder) {
    append({"A", "B", "A", "C", "A", ""});
    EXPECT_EQ(positions("A"), (Positions{0, 2, 4}));
    EXPECT_EQ(positions("B"), (Positions{1}));
    EXPECT_EQ(positions(""), (Positions{5}));
    EXPECT_EQ(positions("a"), Positions{});
}

TEST_F(IdentifierIndexTest, CanStartASearchAtAnyPosition) {
    append({"A", "B", "A", "C", "A"});
    EXPECT_EQ(index.find(table, "A", 1), 2U);
    EXPECT_EQ(index.find(table, "A", 2), 2U);
    EXPECT_EQ(index.find(table, "A", 3), 4U);
    EXPECT_EQ(index.find(table, "A", 5), index.none);
    EXPECT_EQ(index.find(table, "A", index.none), index.none);
}

TEST_F(IdentifierIndexTest, OmitsDeletedRecords) {
    append({"A", "B", "A"});
    table[0].inUse = false;
    EXPECT_EQ(positions("A"), (Positions{2}));
}

/** A record type that counts the reads of its inUse flag. */
struct CountingRecord {
    struct Flag {
        bool value;
        operator bool() const {
            ++reads;
            return value;
        }
        static inline int reads = 0;
    };
    Flag inUse{true};
    std::string InstanceID{"A"};
};

TEST(IdentifierIndexOfOneIdentifierTest, TakesConstantTimeAfterManyDeletions) {
    std::vector<CountingRecord> table;
    IdentifierIndex<CountingRecord> index;
    for (int round = 0; round < 1000; ++round) {
        table.emplace_back();
        index.update(table);
        CountingRecord::Flag::reads = 0;
        EXPECT_EQ(index.find(table, "A", 0), table.size() - 1);
        EXPECT_LE(CountingRecord::Flag::reads, 2);
        table.back().inUse.value = false;
    }
    EXPECT_EQ(index.find(table, "A", 0), index.none);
}

TEST_F(IdentifierIndexTest, FindsAppendedRecords) {
    for (int record = 0; record < 1000; ++record) {
        append({std::to_string(record % 500).c_str()});
    }
    for (std::size_t record = 0; record < 500; ++record) {
        EXPECT_EQ(positions(std::to_string(record)), (Positions{record, record + 500}));
    }
}

TEST_F(IdentifierIndexTest, FindsRecordsThatWereAppendedSinceTheLastUpdate) {
    append({"A", "B"});
    table.push_back(LeaseUnit("C"));
    table.push_back(LeaseUnit("A"));
    EXPECT_EQ(positions("A"), (Positions{0, 3}));
    EXPECT_EQ(positions("C"), (Positions{2}));
    append({"C"});
    EXPECT_EQ(positions("C"), (Positions{2, 4}));
}

}  // namespace
