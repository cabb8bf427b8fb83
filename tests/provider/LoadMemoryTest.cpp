// Loads records with little memory. The test program replaces sysconf and operator new, including its nothrow variant,
// since the operator delete below cannot release memory from a sanitizer's variant.

#include <dlfcn.h>
#include <gmock/gmock.h>
#include <unistd.h>

#include <cstdlib>
#include <limits>
#include <new>

#include "RecordKinds.h"

namespace {

constexpr std::size_t unlimited = std::numeric_limits<std::size_t>::max();

/** Physical memory in pages, or 0 for the machine's memory; and the minimum size of allocations that fail. */
long physicalPages = 0;
std::size_t refusedSize = unlimited;

}  // namespace

extern "C" long sysconf(int name) noexcept {
    if (name == _SC_PHYS_PAGES && physicalPages != 0) {
        return physicalPages;
    }
    static const auto systemsOwn = reinterpret_cast<long (*)(int)>(dlsym(RTLD_NEXT, "sysconf"));
    return systemsOwn(name);
}

void* operator new(std::size_t size) {
    void* memory = size < refusedSize ? std::malloc(size == 0 ? 1 : size) : nullptr;
    if (memory == nullptr) {
        throw std::bad_alloc();
    }
    return memory;
}
void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
    return size < refusedSize ? std::malloc(size == 0 ? 1 : size) : nullptr;
}
void operator delete(void* memory) noexcept {
    std::free(memory);
}
void operator delete(void* memory, std::size_t) noexcept {
    std::free(memory);
}

namespace {

using namespace providerTest;
using testing::ElementsAre;

template <class Kind>
class LoadMemory : public RecordStore<Kind> {
protected:
    using Cache = typename Kind::Cache;
    using Unit = typename Kind::Unit;

    void TearDown() override {
        physicalPages = 0;
        refusedSize = unlimited;
        RecordStore<Kind>::TearDown();
    }

    /** Limits the physical memory to about `count` records. @return the exact number of records that fit */
    static std::size_t limitMemoryToRecords(std::size_t count) {
        const auto page = static_cast<std::size_t>(sysconf(_SC_PAGESIZE));
        physicalPages = static_cast<long>(count * sizeof(Unit) / page + 1);
        return static_cast<std::size_t>(physicalPages) * page / sizeof(Unit);
    }

    static std::string fileOf(std::size_t count) {
        std::string content = std::to_string(count) + "\n";
        for (std::size_t record = 0; record < count; ++record) {
            content += "R" + std::to_string(record) + "\n" + Kind::defaultRecord;
        }
        return content;
    }

    /**
     * Loads a file with this content. Expects an empty table, and per channel one log record at error level with the
     * reason.
     */
    static void expectTooLarge(const std::string& content) {
        write(RecordStore<Kind>::path(), content);
        agentEnvironment::forgetLog();
        Cache cache;
        EXPECT_EQ(Kind::count(cache), 0U);
        EXPECT_TRUE(cache.table.empty());
        EXPECT_EQ(cache.table.capacity(), 0U) << "the memory of the records read is released";
        for (const char* channel : {"log", "trace"}) {
            std::vector<std::string> failures;
            for (const LogRecord& record :
                 recordsOf(Words<Kind>::sourceFile, std::string(Kind::name) + "Cache", channel)) {
                if (record.level == 3000) {
                    failures.push_back(withoutLine(record.text));
                }
            }
            EXPECT_THAT(failures, ElementsAre(message("The records of the file do not fit into memory.",
                                                      Words<Kind>::sourceFile)));
        }
    }
};

TYPED_TEST_SUITE(LoadMemory, RecordKinds, KindNames);

TYPED_TEST(LoadMemory, LogsThatTheRecordsExceedMemory) {
    const std::size_t fitting = this->limitMemoryToRecords(40);
    this->expectTooLarge(this->fileOf(fitting + 1));
}

TYPED_TEST(LoadMemory, LogsThatCopiesOfTheLastRecordExceedMemory) {
    const std::size_t fitting = this->limitMemoryToRecords(40);
    this->expectTooLarge(std::to_string(fitting) + "\n" + std::string(1000, 'x'));
}

TYPED_TEST(LoadMemory, LogsAFailedAllocation) {
    refusedSize = 200 * sizeof(typename TypeParam::Unit);
    this->expectTooLarge(this->fileOf(200));
}

TYPED_TEST(LoadMemory, LoadsAllRecordsIfMemoryIsTooSmallForTheReservedCapacity) {
    const std::size_t fitting = this->limitMemoryToRecords(40);
    const auto cache = this->load(this->fileOf(fitting));
    EXPECT_EQ(TypeParam::count(*cache), fitting);
    ASSERT_EQ(cache->table.size(), fitting);
    EXPECT_EQ(cache->table.back().InstanceID, "R" + std::to_string(fitting - 1));
}

TYPED_TEST(LoadMemory, LoadsAllRecordsIfReservingMemoryFails) {
    refusedSize = 200 * sizeof(typename TypeParam::Unit) + 1;
    const auto cache = this->load(this->fileOf(200));
    EXPECT_EQ(TypeParam::count(*cache), 200U);
    ASSERT_EQ(cache->table.size(), 200U);
    EXPECT_EQ(cache->table.back().InstanceID, "R199");
}

}  // namespace
