// Loads record files with arbitrary content. Loading never fails.

#include <gmock/gmock.h>
#include <unistd.h>

#include <locale>
#include <type_traits>

#include "RecordKinds.h"

namespace {

using namespace providerTest;
using testing::ElementsAre;

template <class Kind>
class Loading : public RecordStore<Kind> {
protected:
    using Cache = typename Kind::Cache;

    static std::string record(const std::string& identifier) { return identifier + "\n" + Kind::defaultRecord; }

    static void expectEmpty(Cache& cache) {
        EXPECT_EQ(Kind::count(cache), 0U);
        EXPECT_TRUE(cache.table.empty());
    }

    static std::vector<std::string> identifiers(Cache& cache) {
        EXPECT_EQ(Kind::count(cache), cache.table.size());
        std::vector<std::string> found;
        for (const auto& unit : cache.table) {
            EXPECT_TRUE(unit.inUse);
            found.push_back(unit.InstanceID);
        }
        return found;
    }
};

TYPED_TEST_SUITE(Loading, RecordKinds, KindNames);

TYPED_TEST(Loading, OfAMissingFileYieldsAnEmptyTableAndCreatesNoFile) {
    typename TypeParam::Cache cache;
    this->expectEmpty(cache);
    EXPECT_FALSE(std::filesystem::exists(this->path()));
}

/** Expects every property accessor to throw an exception with this message. */
template <class Kind>
void expectNoProperty(typename Kind::Base& base, const std::string& refusal) {
    std::string text = "before";
    unsigned int number = 7;
    const auto expectRefused = [&](auto access) { EXPECT_EQ(thrown<InstrumentationException>(access), refusal); };
    expectRefused([&] { base.getProperty(Kind::Property::InstanceID, text); });
    expectRefused([&] { base.getProperty(Kind::text, text); });
    expectRefused([&] { base.getProperty(Kind::number, number); });
    expectRefused([&] { base.setProperty(Kind::text, text); });
    expectRefused([&] { base.setProperty(Kind::number, number); });
    if constexpr (std::is_same_v<Kind, LeaseKind>) {
        bool flag = true;
        expectRefused([&] { base.getProperty(Kind::Property::RenewalOption, flag); });
        expectRefused([&] { base.setProperty(Kind::Property::RenewalOption, flag); });
    }
    EXPECT_EQ(text, "before");
    EXPECT_EQ(number, 7U);
}

TYPED_TEST(Loading, OfAMissingFileLeavesCursorsAtTheEnd) {
    typename TypeParam::Cache loaded;
    this->expectEmpty(loaded);
    this->table().swap(loaded.table);
    this->count() = TypeParam::count(loaded);
    {
        typename TypeParam::Base base;
        EXPECT_TRUE(this->atEnd(base));
        EXPECT_FALSE(hasCurrent(base));
        expectNoProperty<TypeParam>(base, std::string(TypeParam::name) + " record not available");
    }
    EXPECT_FALSE(std::filesystem::exists(this->path()));
}

TYPED_TEST(Loading, OfACountOfZeroYieldsAnEmptyTable) {
    for (const char* content : {"0\n", "0", "0\nA\nB\n", "  \n\n0\n"}) {
        this->expectEmpty(*this->load(content));
    }
}

TYPED_TEST(Loading, OfAnEmptyFileYieldsAnEmptyTable) {
    for (const char* content : {"", "\n", " \t\n\n"}) {
        this->expectEmpty(*this->load(content));
    }
}

TYPED_TEST(Loading, YieldsTheRecordsInFileOrder) {
    const auto cache = this->load("3\n" + this->record("C") + this->record("A") + this->record("B"));
    EXPECT_THAT(this->identifiers(*cache), ElementsAre("C", "A", "B"));
}

TYPED_TEST(Loading, ReservesMemoryForTenRecordsOrTwiceTheCount) {
    EXPECT_GE(this->load("0\n")->table.capacity(), 10U);
    EXPECT_GE(this->load("11\n")->table.capacity(), 22U);
}

TYPED_TEST(Loading, YieldsManyRecords) {
    std::string content = "25\n";
    std::vector<std::string> expected;
    for (int number = 0; number < 25; ++number) {
        expected.push_back("R" + std::to_string(number));
        content += this->record(expected.back());
    }
    EXPECT_EQ(this->identifiers(*this->load(content)), expected);
}

TYPED_TEST(Loading, IgnoresRecordsBeyondTheCount) {
    const auto cache = this->load("1\n" + this->record("A") + this->record("B"));
    EXPECT_THAT(this->identifiers(*cache), ElementsAre("A"));
}

TYPED_TEST(Loading, YieldsTheDeclaredNumberOfRecordsForAShorterFile) {
    const auto cache = this->load("4\n" + this->record("A") + this->record("B"));
    EXPECT_THAT(this->identifiers(*cache), ElementsAre("A", "B", "B", "B"));
    EXPECT_EQ(TypeParam::members(cache->table[3]), TypeParam::members(cache->table[1]));
}

TYPED_TEST(Loading, YieldsTheDeclaredNumberOfDefaultRecordsForACountAlone) {
    const auto cache = this->load("2\n");
    EXPECT_THAT(this->identifiers(*cache), ElementsAre("", ""));
    const typename TypeParam::Unit defaults;
    EXPECT_EQ(TypeParam::members(cache->table[0]), TypeParam::members(defaults));
}

TYPED_TEST(Loading, RepeatsValuesOfThePrecedingRecordForMissingFields) {
    const std::string date = "20240101000000.000000+000";
    const bool isLease = TypeParam::linesOfRecord == 13;
    const std::string rest = isLease ? "1\n1\n1\n1\n11\n12\n13\n14\n2\n" : "";
    const auto cache = this->load("2\nA\nAy_Co\n" + date + "\n36\n" + rest + "B\nBee");
    auto expected = cache->table.at(0);
    EXPECT_EQ(expected.InstanceID, "A");
    EXPECT_EQ(expected.*TypeParam::numberMember, 36U);
    expected.InstanceID = "B";
    expected.*TypeParam::textMember = "Bee";
    EXPECT_EQ(TypeParam::members(cache->table.at(1)), TypeParam::members(expected));
}

TYPED_TEST(Loading, AcceptsAMissingLineFeedAtTheEnd) {
    std::string content = "1\n" + this->record("A");
    content.pop_back();
    EXPECT_THAT(this->identifiers(*this->load(content)), ElementsAre("A"));
}

TYPED_TEST(Loading, TreatsCarriageReturnsAsWhiteSpace) {
    std::string content;
    for (const std::string& line : linesOf("2\n" + this->record("A_1") + this->record("B"))) {
        content += line + "\r\n";
    }
    const auto cache = this->load(content);
    EXPECT_THAT(this->identifiers(*cache), ElementsAre("A 1", "B"));
    EXPECT_EQ(cache->table[0].*TypeParam::date().member, "00000000000000.000000-000");
}

TYPED_TEST(Loading, AcceptsAnyWhiteSpaceBetweenFields) {
    const auto cache = this->load("\t1 \v A\f Ay_Co\n\n 20240101000000.000000+000 7");
    EXPECT_THAT(this->identifiers(*cache), ElementsAre("A"));
    EXPECT_EQ(cache->table[0].*TypeParam::numberMember, 7U);
}

TYPED_TEST(Loading, ReadsACountWithLeadingZerosAsDecimal) {
    EXPECT_EQ(this->identifiers(*this->load("012\n")).size(), 12U);
}

TYPED_TEST(Loading, ReadsACountWithAPlusSign) {
    const auto cache = this->load("+2\n" + this->record("A") + this->record("B"));
    EXPECT_THAT(this->identifiers(*cache), ElementsAre("A", "B"));
}

/** The next change writes all records back, so a sign that stopped reading would lose the following records. */
TYPED_TEST(Loading, ReadsANumberWithAPlusSignAndTheFollowingRecords) {
    const auto sound = this->load("2\n" + this->record("A") + this->record("B"));
    for (const auto& number : TypeParam::numbers()) {
        auto lines = linesOf(this->record("A"));
        lines.at(number.line) = "+36";
        std::string content = "2\n";
        for (const std::string& line : lines) {
            content += line + "\n";
        }
        const auto cache = this->load(content + this->record("B"));
        EXPECT_THAT(this->identifiers(*cache), ElementsAre("A", "B"));
        EXPECT_EQ(cache->table[0].*number.member, 36U);
        EXPECT_EQ(TypeParam::members(cache->table[1]), TypeParam::members(sound->table[1]));
    }
}

TYPED_TEST(Loading, OfAnInvalidCountYieldsAnEmptyTable) {
    for (const char* count :
         {"-1", "-0", "+", "+-1", "x", "true", "*", "4294967296", "99999999999999999999999", "0x10", ".5"}) {
        SCOPED_TRACE(count);
        this->expectEmpty(*this->load(count + std::string("\n") + this->record("A")));
    }
}

TYPED_TEST(Loading, OfACountThatExceedsMemoryYieldsAnEmptyTable) {
    for (const char* count : {"4294967295", "2147483648", "2147483649", "3000000000"}) {
        SCOPED_TRACE(count);
        this->expectEmpty(*this->load(count + std::string("\n") + this->record("A")));
    }
}

/** The file ends within its first record, whose copies would exceed the machine's memory because of their strings. */
TYPED_TEST(Loading, OfCopiesThatExceedMemoryYieldsAnEmptyTable) {
    constexpr std::size_t length = 64U << 20U;
    const auto memory =
        static_cast<std::size_t>(sysconf(_SC_PHYS_PAGES)) * static_cast<std::size_t>(sysconf(_SC_PAGESIZE));
    write(this->path(), std::to_string(memory / length + 1) + "\n" + std::string(length, 'x'));
    typename TypeParam::Cache cache;
    this->expectEmpty(cache);
    EXPECT_LE(cache.table.capacity(), 10U);
}

TYPED_TEST(Loading, OfCopiesThatFitIntoMemoryYieldsThemAll) {
    const std::string text(1U << 10U, 'x');
    write(this->path(), "1000\n" + text);
    typename TypeParam::Cache cache;
    EXPECT_EQ(this->identifiers(cache), std::vector<std::string>(1000, text));
}

TYPED_TEST(Loading, OfADirectoryYieldsAnEmptyTable) {
    blockWithDirectory(this->path());
    typename TypeParam::Cache cache;
    this->expectEmpty(cache);
}

TYPED_TEST(Loading, OfAFileThatCannotBeOpenedYieldsAnEmptyTable) {
    std::filesystem::create_symlink(this->path(), this->path());
    typename TypeParam::Cache cache;
    this->expectEmpty(cache);
}

TYPED_TEST(Loading, WithoutADataDirectoryYieldsAnEmptyTable) {
    std::filesystem::remove_all(agentEnvironment::dataDirectory());
    typename TypeParam::Cache cache;
    this->expectEmpty(cache);
}

/** Returns pseudorandom bytes that depend only on the seed. */
std::string randomBytes(unsigned int seed, std::size_t length) {
    std::string bytes;
    while (bytes.size() < length) {
        seed = seed * 1664525U + 1013904223U;
        bytes += static_cast<char>(seed >> 24U);
    }
    return bytes;
}

TYPED_TEST(Loading, SurvivesRandomBytes) {
    for (unsigned int seed = 1; seed <= 20; ++seed) {
        SCOPED_TRACE(seed);
        const auto bare = this->load(randomBytes(seed, 2000));
        EXPECT_EQ(TypeParam::count(*bare), bare->table.size());
        const auto counted = this->load("7\n" + randomBytes(seed, 2000));
        EXPECT_EQ(this->identifiers(*counted).size(), 7U);
        counted->flushCache();
        EXPECT_EQ(this->file().substr(0, 2), "7\n");
    }
}

TYPED_TEST(Loading, SurvivesAVeryLongLine) {
    const std::string longName(1U << 20U, 'n');
    EXPECT_THAT(this->identifiers(*this->load("1\n" + this->record(longName))), ElementsAre(longName));
}

/** Groups digits, like the locale of some processes. */
struct Grouping : std::numpunct<char> {
    char do_thousands_sep() const override { return '.'; }
    std::string do_grouping() const override { return "\3"; }
};

class GlobalLocale {
public:
    explicit GlobalLocale(const std::locale& locale) : before(std::locale::global(locale)) {}
    ~GlobalLocale() { std::locale::global(before); }
    GlobalLocale(const GlobalLocale&) = delete;
    GlobalLocale& operator=(const GlobalLocale&) = delete;

private:
    std::locale before;
};

TYPED_TEST(Loading, AndWritingIgnoreTheGlobalLocale) {
    const GlobalLocale grouping(std::locale(std::locale::classic(), new Grouping));
    typename TypeParam::Unit unit("A");
    unit.*TypeParam::numberMember = 1234567;
    EXPECT_THAT(linesOf(this->written(unit)), testing::Contains("1234567"));
    EXPECT_EQ(this->reread(unit).*TypeParam::numberMember, 1234567U);
}

TYPED_TEST(Loading, AndReleasingTheTableDoNotChangeTheFile) {
    const std::string content = "2\n" + this->record("A") + "short";
    this->load(content)->table.clear();
    EXPECT_EQ(this->file(), content);
}

}  // namespace
