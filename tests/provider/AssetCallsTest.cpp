// Order and locking of the asset element's calls to the framework, and failures of the framework.

#include <gmock/gmock.h>

#include <algorithm>
#include <stdexcept>

#include "AssetFileDouble.h"
#include "AssetSupport.h"
#include "KO/Exceptions.h"

namespace {

using namespace providerTest;
using testing::Contains;
using testing::ElementsAre;
using testing::ElementsAreArray;
using testing::Not;

using Calls = std::vector<std::string>;

constexpr const char* assetSource = "AssetIDDetails.cpp";
constexpr const char* lock = "lock 4294967295";
constexpr const char* creationFailed = "Failed while opening Asset.dat in write mode";
constexpr const char* readingFailed = "Throwing Exception in Constructor";
constexpr const char* writingFailed = "Throwing Exception while writing Data";

constexpr const char* const fixedReads[] = {
    "text USER.AssetNumber",     "text USER.AssetIdTag",    "text USER.Name",
    "text USER.Phone",           "text USER.Position",      "text USER.Department",
    "date USER.LastInventoried", "date USER.PurchaseDate",  "text USER.Location",
    "text USER.ZOPMProfile",     "date USER.ZOPMUpdateTime"};

const Calls creation = {lock,           "File asset.dat locked", "File::open 3 locked", "File::close locked",
                        "~File locked", "unlock locked"};

Calls reading() {
    Calls calls = {"PropertyFile asset.dat", lock, "PropertyFile::open 1 locked"};
    for (const char* read : fixedReads) {
        calls.push_back(std::string("read ") + read + " locked");
    }
    for (const char* number : {"1", "2", "3", "4", "5"}) {
        calls.push_back(std::string("read text USER.PersonalizedLabel") + number + " locked");
        calls.push_back(std::string("read text USER.PersonalizedData") + number + " locked");
    }
    calls.insert(calls.end(), {"PropertyFile::close locked", "unlock locked", "~PropertyFile"});
    return calls;
}

class AssetCalls : public CleanAgent {
protected:
    void SetUp() override {
        CleanAgent::SetUp();
        assetFileDouble::forget();
    }
    void TearDown() override {
        EXPECT_FALSE(assetFileDouble::locked());
        assetFileDouble::forget();
        CleanAgent::TearDown();
    }

    /** Returns the framework calls of an operation. */
    template <class Operation>
    static Calls callsOf(Operation operation) {
        const std::size_t before = assetFileDouble::calls().size();
        operation();
        const Calls& all = assetFileDouble::calls();
        return {all.begin() + static_cast<std::ptrdiff_t>(before), all.end()};
    }

    static bool loaded(const AssetIDDetails& element) {
        std::string text;
        return element.getAssetNumber(text);
    }
};

TEST_F(AssetCalls, CreateTheFileAndReadItUnderTheLock) {
    Calls expected = creation;
    const Calls read = reading();
    expected.insert(expected.end(), read.begin(), read.end());
    EXPECT_THAT(callsOf([] { EXPECT_TRUE(loaded(AssetIDDetails())); }), ElementsAreArray(expected));
}

TEST_F(AssetCalls, CreateTheFileUnderTheLockInGetFileName) {
    AssetIDDetails element;
    EXPECT_THAT(callsOf([&] { element.getFileName(); }), ElementsAreArray(creation));
}

TEST_F(AssetCalls, WriteTheFileUnderTheLock) {
    AssetIDDetails element;
    element.setAssetNumber("A-1");
    element.setSystemPurchaseDate(someDate);
    element.setPersonalizedData({{"l1", "d1"}, {"", "d2"}});
    const std::string none = std::string("=") + noDate + " locked";
    EXPECT_THAT(callsOf([&] { element.flushAssetData(); }),
                ElementsAreArray(Calls{"PropertyFile asset.dat",
                                       lock,
                                       "PropertyFile::open 3 locked",
                                       "write text USER.AssetNumber=A-1 locked",
                                       "write text USER.AssetIdTag= locked",
                                       "write text USER.Name= locked",
                                       "write text USER.Phone= locked",
                                       "write text USER.Position= locked",
                                       "write text USER.Department= locked",
                                       "write date USER.LastInventoried" + none,
                                       std::string("write date USER.PurchaseDate=") + someDate + " locked",
                                       "write text USER.Location= locked",
                                       "write text USER.ZOPMProfile= locked",
                                       "write date USER.ZOPMUpdateTime" + none,
                                       "write text USER.PersonalizedLabel1=l1 locked",
                                       "write text USER.PersonalizedData1=d1 locked",
                                       "write text USER.PersonalizedLabel2= locked",
                                       "write text USER.PersonalizedData2=d2 locked",
                                       "PropertyFile::close locked",
                                       "unlock locked",
                                       "~PropertyFile"}));
}

TEST_F(AssetCalls, OfAccessorsAccessNoFile) {
    AssetIDDetails element;
    EXPECT_TRUE(callsOf([&] {
                    for (const TextGetter& getter : stringGetters) {
                        valueOf(element, getter);
                    }
                    element.setOwnerName("Anna");
                    element.setFilter(AssetIDDetails::FILTER_NAME, "testhost");
                    ++element;
                }).empty());
}

/** Functions that throw exceptions of different types. */
const std::function<void()> failures[] = {[] { throw KO::FrameworkException("no"); },
                                          [] { throw std::runtime_error("no"); }, [] { throw 5; }};

TEST_F(AssetCalls, ThatFailToReadLeaveNoValuesAndReleaseTheLock) {
    for (const char* call :
         {"PropertyFile asset.dat", "PropertyFile::open 1", "read text USER.AssetNumber", "read text USER.Phone",
          "read date USER.LastInventoried", "read text USER.ZOPMProfile", "read text USER.PersonalizedLabel1",
          "read text USER.PersonalizedData5", "PropertyFile::close"}) {
        for (const auto& failure : failures) {
            SCOPED_TRACE(call);
            assetFileDouble::forget();
            agentEnvironment::forgetLog();
            assetFileDouble::before(call, failure);
            const AssetIDDetails element;
            expectNothingStored(element);
            EXPECT_FALSE(assetFileDouble::locked());
            EXPECT_THAT(logMessagesOf(assetSource, "AssetIDDetails"), Contains(message(readingFailed, assetSource)));
        }
    }
}

TEST_F(AssetCalls, StopAfterAFailedRead) {
    assetFileDouble::before("read text USER.Phone", failures[0]);
    const Calls calls = callsOf([] { AssetIDDetails(); });
    EXPECT_EQ(Calls(calls.end() - 3, calls.end()),
              (Calls{"read text USER.Phone locked", "unlock locked", "~PropertyFile"}));
}

/** Makes one acquisition of the lock fail. @param number number of the acquisition, from 1 */
void failLock(int number, const std::function<void()>& failure) {
    assetFileDouble::before(lock, [number, failure, taken = 0]() mutable {
        if (++taken == number) {
            failure();
        }
    });
}

TEST_F(AssetCalls, ThatCannotLockForReadingReadNothing) {
    for (const auto& failure : failures) {
        assetFileDouble::forget();
        agentEnvironment::forgetLog();
        failLock(2, failure);
        Calls expected = creation;
        expected.insert(expected.end(), {"PropertyFile asset.dat", lock, "~PropertyFile"});
        EXPECT_THAT(callsOf([] { expectNothingStored(AssetIDDetails()); }), ElementsAreArray(expected));
        EXPECT_THAT(logMessagesOf(assetSource, "AssetIDDetails"), Contains(message(readingFailed, assetSource)));
    }
}

TEST_F(AssetCalls, ThatCannotLockForCreatingTheFileCreateNoFile) {
    for (const auto& failure : failures) {
        assetFileDouble::forget();
        agentEnvironment::forgetLog();
        failLock(1, failure);
        const Calls calls = callsOf([] { AssetIDDetails(); });
        EXPECT_EQ(calls.at(0), lock);
        EXPECT_THAT(calls, Not(Contains(testing::StartsWith("File"))));
        const auto records = recordsOf(assetSource, "getFileName");
        ASSERT_EQ(records.size(), 3U);
        EXPECT_EQ(withoutLine(records[1].text), message(creationFailed, assetSource));
        EXPECT_EQ(records[1].level, 6000);
        EXPECT_FALSE(assetFileDouble::locked());
    }
}

/** Returns, for each release of the lock in an operation, whether the failure was already logged. */
template <class Operation>
std::vector<bool> loggedWhenUnlocked(const char* function, const char* text, Operation operation) {
    std::vector<bool> wasLogged;
    agentEnvironment::forgetLog();
    assetFileDouble::before("unlock", [&] {
        const auto logMessages = logMessagesOf(assetSource, function);
        wasLogged.push_back(std::find(logMessages.begin(), logMessages.end(), message(text, assetSource)) !=
                            logMessages.end());
    });
    operation();
    EXPECT_THAT(logMessagesOf(assetSource, function), Contains(message(text, assetSource)));
    assetFileDouble::before("unlock", [] {});
    return wasLogged;
}

TEST_F(AssetCalls, ThatFailToReadAreLoggedBeforeTheLockIsReleased) {
    const auto make = [] { AssetIDDetails(); };
    assetFileDouble::before("File::open 3", failures[0]);
    EXPECT_THAT(loggedWhenUnlocked("getFileName", creationFailed, make), ElementsAre(true, true));
    assetFileDouble::forget();
    assetFileDouble::before("read text USER.Phone", failures[0]);
    EXPECT_THAT(loggedWhenUnlocked("AssetIDDetails", readingFailed, make), ElementsAre(false, true))
        << "the lock is first held for the file's creation";
}

TEST_F(AssetCalls, ThatFailToWriteAreLoggedAfterTheLockIsReleased) {
    AssetIDDetails element;
    assetFileDouble::before("PropertyFile::close", failures[0]);
    EXPECT_THAT(loggedWhenUnlocked("flushAssetData", writingFailed, [&] { element.flushAssetData(); }),
                ElementsAre(false));
}

TEST_F(AssetCalls, ReadLabelAndDataOfAPairBeforeEitherIsLogged) {
    std::vector<std::size_t> loggedBefore;
    for (const char* number : {"1", "2", "3", "4", "5"}) {
        assetFileDouble::before(std::string("read text USER.PersonalizedData") + number, [&] {
            const auto logMessages = logMessagesOf(assetSource, "AssetIDDetails");
            loggedBefore.push_back(static_cast<std::size_t>(
                std::count_if(logMessages.begin(), logMessages.end(), [](const std::string& text) {
                    return text == variable("label", "Null", assetSource) ||
                           text == variable("data", "Null", assetSource);
                })));
        });
    }
    AssetIDDetails();
    EXPECT_THAT(loggedBefore, ElementsAre(0, 2, 4, 6, 8));
}

TEST_F(AssetCalls, WriteTheValuesReadBeforeAFailure) {
    assetFileDouble::values() = {{"USER.AssetNumber", "A-1"}, {"USER.Name", "Anna"}, {"USER.Position", "P"}};
    assetFileDouble::before("read text USER.Phone", failures[0]);
    AssetIDDetails element;
    const Calls calls = callsOf([&] { element.flushAssetData(); });
    EXPECT_THAT(calls, Contains("write text USER.AssetNumber=A-1 locked"));
    EXPECT_THAT(calls, Contains("write text USER.Name=Anna locked"));
    EXPECT_THAT(calls, Contains("write text USER.Position= locked"));
    EXPECT_THAT(calls, Not(Contains(testing::HasSubstr("Personalized"))));
}

TEST_F(AssetCalls, ThatCannotCreateTheFileStillReadIt) {
    for (const char* call : {"File asset.dat", "File::open 3", "File::close"}) {
        for (const auto& failure : failures) {
            SCOPED_TRACE(call);
            assetFileDouble::forget();
            agentEnvironment::forgetLog();
            assetFileDouble::before(call, failure);
            EXPECT_TRUE(loaded(AssetIDDetails()));
            const auto records = recordsOf(assetSource, "getFileName");
            ASSERT_EQ(records.size(), 3U);
            EXPECT_EQ(withoutLine(records[1].text), message(creationFailed, assetSource));
            EXPECT_EQ(records[1].level, 6000);
        }
    }
}

TEST_F(AssetCalls, ThatFailToWriteAreOnlyLoggedAndReleaseTheLock) {
    for (const char* call : {"PropertyFile asset.dat", lock, "PropertyFile::open 3", "write text USER.AssetNumber=",
                             "write text USER.PersonalizedData5=Null", "PropertyFile::close"}) {
        for (const auto& failure : failures) {
            SCOPED_TRACE(call);
            assetFileDouble::forget();
            AssetIDDetails element;
            assetFileDouble::before(call, failure);
            agentEnvironment::forgetLog();
            element.flushAssetData();
            EXPECT_FALSE(assetFileDouble::locked());
            EXPECT_THAT(logMessagesOf(assetSource, "flushAssetData"), Contains(message(writingFailed, assetSource)));
        }
    }
}

}  // namespace
