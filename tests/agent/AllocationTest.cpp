#include <gtest/gtest.h>

#include <cstdlib>
#include <new>

#include "RZLog/RZLogger.h"
#include "RZLog/RZMessageBuffer.h"

namespace {

thread_local long allocations = 0;

}  // namespace

void* operator new(std::size_t size) {
    ++allocations;
    if (void* memory = std::malloc(size)) {
        return memory;
    }
    throw std::bad_alloc();
}

// Sanitizers replace this operator; the operators below could not free its memory.
void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
    ++allocations;
    return std::malloc(size);
}

void operator delete(void* memory) noexcept {
    std::free(memory);
}
void operator delete(void* memory, std::size_t) noexcept {
    std::free(memory);
}

namespace {

class Allocation : public testing::Test {
protected:
    void SetUp() override { ::setenv("OSTREL_CONFIG", "/no/such/file", 1); }
};

TEST_F(Allocation, IsAlsoCountedInTheLibrary) {
    const long before = allocations;
    { const RZLog::RZMessageBuffer buffer; }
    EXPECT_GT(allocations, before) << "the first buffer must be made";
}

TEST_F(Allocation, IsNotNeededForARecordThatIsNotAdmitted) {
    const std::string logger = "a name that does not fit into a string object";
    const std::string text = "a text that does not fit into a string object either";
    const auto log = [&] {
        RZLog::RZLogger::logLevelMessage("log", "AllocationTest.cpp", 1, logger, 4000, nullptr, 0, 0, text);
        RZLog::RZLogger::traceLevelMessage("log", "AllocationTest.cpp", 1, logger, 6000, nullptr, 0, 0, text);
    };
    log();  // reads the configuration
    const long before = allocations;
    log();
    EXPECT_EQ(allocations, before);
}

TEST_F(Allocation, IsNotNeededForAReusedBuffer) {
    const auto useBuffer = [] {
        RZLog::RZMessageBuffer buffer;
        buffer << "a text that does not fit into a string object";
    };
    useBuffer();
    const long before = allocations;
    useBuffer();
    EXPECT_EQ(allocations, before);
}

}  // namespace
