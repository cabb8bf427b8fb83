// What the asset element asks of the framework, in which order and under which lock, and what it does
// when the framework fails.

#include "AssetFileDouble.h"
#include "AssetSupport.h"
#include "Exceptions.h"

#include <gmock/gmock.h>

#include <memory>
#include <stdexcept>

namespace {

using namespace providerTest;
using testing::Contains;
using testing::ElementsAreArray;
using testing::Not;

using Calls = std::vector<std::string>;

constexpr const char* const fixedReads[] = {
    "text USER.AssetNumber",     "text USER.AssetIdTag",    "text USER.Name",
    "text USER.Phone",           "text USER.Position",      "text USER.Department",
    "date USER.LastInventoried", "date USER.PurchaseDate",  "text USER.Location",
    "text USER.ZOPMProfile",     "date USER.ZOPMUpdateTime"};

const Calls creation = {"lock 4294967295",    "File asset.dat locked", "File::open 3 locked",
                        "File::close locked", "~File locked",          "unlock locked"};

Calls reading() {
    Calls calls = {"PropertyFile asset.dat", "lock 4294967295", "PropertyFile::open 1 locked"};
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

    /** The calls of an operation. */
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

TEST_F(AssetCalls, CreateTheFileUnderTheLockWhenThePathIsAskedFor) {
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
                                       "lock 4294967295",
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

TEST_F(AssetCalls, OfAccessorsTouchNoFile) {
    AssetIDDetails element;
    EXPECT_TRUE(callsOf([&] {
                    for (const TextGetter& getter : textGetters) {
                        valueOf(element, getter);
                    }
                    element.setOwnerName("Anna");
                    element.setFilter(AssetIDDetails::FILTER_NAME, "testhost");
                    ++element;
                }).empty());
}

/** Ways to fail. */
const std::function<void()> failures[] = {[] { throw KO::FrameworkException("no"); },
                                          [] { throw std::runtime_error("no"); }, [] { throw 5; }};

TEST_F(AssetCalls, ThatFailInReadingLeaveNothingStoredAndTheLockFree) {
    for (const char* call : {"PropertyFile asset.dat", "PropertyFile::open 1", "read text USER.AssetNumber",
                             "read text USER.Phone", "read date USER.LastInventoried", "read text USER.ZOPMProfile",
                             "read text USER.PersonalizedLabel1", "read text USER.PersonalizedData5"}) {
        for (const auto& failure : failures) {
            SCOPED_TRACE(call);
            assetFileDouble::forget();
            agentEnvironment::forgetLog();
            assetFileDouble::before(call, failure);
            const AssetIDDetails element;
            expectNothingStored(element);
            EXPECT_FALSE(assetFileDouble::locked());
            EXPECT_THAT(textsOf("AssetIDDetails.cpp", "AssetIDDetails"),
                        Contains(message("Throwing Exception in Constructor", "AssetIDDetails.cpp")));
        }
    }
}

TEST_F(AssetCalls, AfterAFailedReadAreNotMade) {
    assetFileDouble::before("read text USER.Phone", failures[0]);
    const Calls calls = callsOf([] { AssetIDDetails(); });
    EXPECT_EQ(Calls(calls.end() - 3, calls.end()),
              (Calls{"read text USER.Phone locked", "unlock locked", "~PropertyFile"}));
}

TEST_F(AssetCalls, KeepWhatWasReadBeforeAFailure) {
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
            const auto records = recordsOf("AssetIDDetails.cpp", "getFileName");
            ASSERT_EQ(records.size(), 3U);
            EXPECT_EQ(withoutLine(records[1].text),
                      message("Failed while opening Asset.dat in write mode", "AssetIDDetails.cpp"));
            EXPECT_EQ(records[1].level, 6000);
        }
    }
}

TEST_F(AssetCalls, ThatFailInWritingAreOnlyToldAndLeaveTheLockFree) {
    for (const char* call :
         {"PropertyFile asset.dat", "lock 4294967295", "PropertyFile::open 3",
          "write text USER.AssetNumber=", "write text USER.PersonalizedData5=Null", "PropertyFile::close"}) {
        for (const auto& failure : failures) {
            SCOPED_TRACE(call);
            assetFileDouble::forget();
            AssetIDDetails element;
            assetFileDouble::before(call, failure);
            agentEnvironment::forgetLog();
            element.flushAssetData();
            EXPECT_FALSE(assetFileDouble::locked());
            EXPECT_THAT(textsOf("AssetIDDetails.cpp", "flushAssetData"),
                        Contains(message("Throwing Exception while writing Data", "AssetIDDetails.cpp")));
        }
    }
}

}  // namespace
