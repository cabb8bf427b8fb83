#include <cerrno>
#include <cstdlib>

#include "BrokerFixture.h"

namespace {

class ServicesTest : public BrokerTest {
protected:
    static cimhost::BrokerOptions options(std::vector<cimhost::LogRecord>& records) {
        cimhost::BrokerOptions made;
        made.log = [&records](const cimhost::LogRecord& record) { records.push_back(record); };
        return made;
    }

    ServicesTest() : logging(options(records)) {}

    std::vector<cimhost::LogRecord> records;
    cimhost::Broker logging;
};

TEST_F(ServicesTest, ReturnsTheTypesOfObjects) {
    const CMPIString* string = newString("s");
    EXPECT_EQ(characters(make().getType(handle(), string, &status)), "CMPIString");
    EXPECT_EQ(characters(make().getType(handle(), newInstance(), &status)), "CMPIInstance");
    EXPECT_TRUE(make().isOfType(handle(), string, "CMPIString", &status));
    EXPECT_FALSE(make().isOfType(handle(), string, "CMPIArray", &status));
    EXPECT_EQ(status.rc, CMPI_RC_OK);
}

TEST_F(ServicesTest, DescribesObjects) {
    EXPECT_EQ(characters(make().toString(handle(), newString("s"), nullptr)), "s");
    EXPECT_EQ(characters(make().toString(handle(), newPath("C"), nullptr)), "root/cimv2:C");
    CMPIInstance* instance = newInstance("C");
    instance->ft->setProperty(instance, "P", charsValue("v"), CMPI_chars);
    EXPECT_THAT(characters(make().toString(handle(), instance, nullptr)), testing::HasSubstr("P = \"v\""));
    CMPIArray* array = make().newArray(handle(), 2, CMPI_uint8, nullptr);
    EXPECT_NE(characters(make().toString(handle(), array, nullptr)), "(null)");
    EXPECT_EQ(make().toString(handle(), nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(ServicesTest, InsertsArgumentsIntoMessages) {
    const CMPIString* message =
        make().getMessage(handle(), "id", "$0 of $1, $2 $3 $9", &status, 4, CMPI_sint32, -1, CMPI_uint64,
                          CMPIUint64{5000000000}, CMPI_chars, "chars", CMPI_string, newString("string"));
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(characters(message), "-1 of 5000000000, chars string $9");
    message = make().getMessage2(handle(), "id", nullptr, "$0 $1", &status, 2, CMPI_boolean, 1, CMPI_real64, 0.5);
    EXPECT_EQ(characters(message), "true 0.500000");
}

TEST_F(ServicesTest, LeavesMessagesWithBadInsertsUnchanged) {
    EXPECT_EQ(characters(make().getMessage(handle(), "id", "a $0", &status, 1, CMPI_instance, nullptr)), "a $0");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(characters(make().getMessage(handle(), "id", "a $0", &status, 11)), "a $0");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(make().getMessage(handle(), "id", nullptr, &status, 0), nullptr);
}

TEST_F(ServicesTest, HasNoMessageFiles) {
    CMPIMsgFileHandle file = &records;
    EXPECT_EQ(make().openMessageFile(handle(), "file", &file).rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(file, nullptr);
    EXPECT_EQ(make().closeMessageFile(handle(), nullptr).rc, CMPI_RC_OK);
    EXPECT_EQ(make().closeMessageFile(handle(), &file).rc, CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(ServicesTest, HasNoQueries) {
    CMPIArray* projection = make().newArray(handle(), 0, CMPI_string, nullptr);
    EXPECT_EQ(make().newSelectExp(handle(), "select * from X", "WQL", &projection, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(projection, nullptr);
}

TEST_F(ServicesTest, PassesLogAndTraceRecordsToTheLogger) {
    const CMPIBroker* loggingHandle = logging.handle();
    EXPECT_EQ(make().logMessage(loggingHandle, CMPI_SEV_WARNING, "id", "text", newString("ignored")).rc, CMPI_RC_OK);
    EXPECT_EQ(make().trace(loggingHandle, CMPI_LEV_VERBOSE, "part", nullptr, newString("string")).rc, CMPI_RC_OK);
    ASSERT_EQ(records.size(), 2U);
    EXPECT_FALSE(records[0].isTrace);
    EXPECT_EQ(records[0].level, CMPI_SEV_WARNING);
    EXPECT_EQ(records[0].component, "id");
    EXPECT_EQ(records[0].message, "text");
    EXPECT_TRUE(records[1].isTrace);
    EXPECT_EQ(records[1].message, "string");
}

TEST_F(ServicesTest, ALoggerThatThrowsIsAFailure) {
    cimhost::BrokerOptions throwing;
    throwing.log = [](const cimhost::LogRecord&) { throw std::runtime_error("disk full"); };
    const cimhost::Broker itsBroker(throwing);
    const CMPIStatus answer = make().logMessage(itsBroker.handle(), CMPI_SEV_INFO, "id", "text", nullptr);
    EXPECT_EQ(answer.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(characters(answer.msg), "disk full");
}

// Threads, mutexes and conditions.

void* twice(void* number) {
    *static_cast<int*>(number) *= 2;
    return number;
}

TEST_F(ServicesTest, RunsThreads) {
    const CMPIBrokerExtFT& threads = *handle()->xft;
    int number = 21;
    void* thread = threads.newThread(twice, &number, 0);
    ASSERT_NE(thread, nullptr);
    void* answer = nullptr;
    EXPECT_EQ(threads.joinThread(thread, &answer), 0);
    EXPECT_EQ(answer, &number);
    EXPECT_EQ(number, 42);
    EXPECT_EQ(threads.threadSleep(1), 0);
}

void* exitEarly(void* table) {
    static_cast<const CMPIBrokerExtFT*>(table)->exitThread(table);
    return nullptr;
}

TEST_F(ServicesTest, AThreadCanExit) {
    CMPIBrokerExtFT& threads = *handle()->xft;
    void* answer = nullptr;
    EXPECT_EQ(threads.joinThread(threads.newThread(exitEarly, &threads, 0), &answer), 0);
    EXPECT_EQ(answer, &threads);
}

/** A mutex and a condition that two threads use. */
struct Meeting {
    const CMPIBrokerExtFT* threads;
    void* mutex;
    void* condition;
    bool arrived = false;
};

void* arrive(void* argument) {
    auto* meeting = static_cast<Meeting*>(argument);
    meeting->threads->lockMutex(meeting->mutex);
    meeting->arrived = true;
    meeting->threads->signalCondition(meeting->condition);
    meeting->threads->unlockMutex(meeting->mutex);
    return nullptr;
}

TEST_F(ServicesTest, ThreadsSynchronizeWithConditions) {
    const CMPIBrokerExtFT& threads = *handle()->xft;
    Meeting meeting{&threads, threads.newMutex(0), threads.newCondition(0)};
    threads.lockMutex(meeting.mutex);
    threads.lockMutex(meeting.mutex);  // recursive
    threads.unlockMutex(meeting.mutex);
    void* thread = threads.newThread(arrive, &meeting, 0);
    while (!meeting.arrived) {
        EXPECT_EQ(threads.condWait(meeting.condition, meeting.mutex), 0);
    }
    threads.unlockMutex(meeting.mutex);
    threads.joinThread(thread, nullptr);
    timespec past{0, 0};
    threads.lockMutex(meeting.mutex);
    EXPECT_EQ(threads.timedCondWait(meeting.condition, meeting.mutex, &past), ETIMEDOUT);
    threads.unlockMutex(meeting.mutex);
    threads.destroyCondition(meeting.condition);
    threads.destroyMutex(meeting.mutex);
}

int onceCalls = 0;

TEST_F(ServicesTest, HasKeysAndOnceObjects) {
    const CMPIBrokerExtFT& threads = *handle()->xft;
    unsigned long key = 0;
    ASSERT_EQ(threads.createThreadKey(&key, nullptr), 0);
    EXPECT_EQ(threads.getThreadSpecific(key), nullptr);
    EXPECT_EQ(threads.setThreadSpecific(key, &key), 0);
    EXPECT_EQ(threads.getThreadSpecific(key), &key);
    EXPECT_EQ(threads.destroyThreadKey(key), 0);
    int once = 0;
    threads.threadOnce(&once, [] { ++onceCalls; });
    threads.threadOnce(&once, [] { ++onceCalls; });
    EXPECT_EQ(onceCalls, 1);
}

TEST_F(ServicesTest, ResolvesLibraryNames) {
    char* name = handle()->xft->resolveFileName("thing");
    EXPECT_STREQ(name, "libthing.so");
    std::free(name);
}

}  // namespace
