// Requests to a store whose count is not 0 and whose table is empty.

#include <gmock/gmock.h>

#include "RequestFixture.h"

namespace {

using namespace providerTest;
using testing::ElementsAre;
using testing::IsEmpty;

/** A record class, its count, and the source file, function and message of the exception for a wrong count. */
struct CountedStore {
    const char* className;
    unsigned int& count;
    const char* storeFile;
    const char* cursor;
    const char* noRecords;
};

class MissingRecords : public RequestTest {
public:
    using RequestTest::enumerate;
    using RequestTest::enumerateNames;

protected:
    using Request = CMPIrc (MissingRecords::*)(const std::string&);

    void expectOnlyLogged(const CountedStore& store, Request request, const char* entryPoint) {
        SCOPED_TRACE(std::string(entryPoint) + " of " + store.className);
        agentEnvironment::forgetLog();
        store.count = 1;
        EXPECT_EQ((this->*request)(store.className), CMPI_RC_OK);
        store.count = 0;
        EXPECT_THAT(events, IsEmpty()) << "neither results nor their end are returned";
        EXPECT_THAT(errorsOf(store.storeFile, store.cursor), ElementsAre(message(store.noRecords, store.storeFile)));
        EXPECT_THAT(errorsOf(entryFile, entryPoint), ElementsAre(message(store.noRecords, entryFile)));
        EXPECT_EQ(logMessages().back(), std::string(78, '='));
    }

    static std::vector<std::string> errorsOf(const std::string& file, const std::string& function) {
        std::vector<std::string> errors;
        for (const LogRecord& record : recordsOf(file, function)) {
            if (record.level == 3000) {
                errors.push_back(withoutLine(record.text));
            }
        }
        return errors;
    }
};

TEST_F(MissingRecords, EndEveryEnumerationSuccessfullyWithoutResults) {
    const CountedStore stores[] = {
        {"VELKO_Lease", LeaseBase::cache.recordCountLease, "LeaseBase.cpp", "LeaseBase",
         "Zero Lease Records Available"},
        {"VELKO_Warranty", WarrantyBase::cache.recordCountWarranty, "WarrantyBase.cpp", "WarrantyBase",
         "Zero Warranty Records Available"},
    };
    for (const CountedStore& store : stores) {
        expectOnlyLogged(store, &MissingRecords::enumerate, "LeaseAndWarranty_EnumInstances");
        expectOnlyLogged(store, &MissingRecords::enumerateNames, "LeaseAndWarranty_EnumInstanceNames");
    }
}

}  // namespace
