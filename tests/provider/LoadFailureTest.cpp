// Failures of the framework while records are loaded. The test program replaces PlatformUtilities::getKelsaDataDir.

#include <gmock/gmock.h>

#include <stdexcept>

#include "KO/PlatformUtilities.h"
#include "RecordKinds.h"

namespace {

/** A function that throws an exception instead of returning the data directory; null if there is none. */
void (*insteadOfDataDirectory)() = nullptr;

}  // namespace

const char* KO::PlatformUtilities::getKelsaDataDir() {
    if (insteadOfDataDirectory != nullptr) {
        insteadOfDataDirectory();
    }
    static const std::string directory = agentEnvironment::dataDirectory().string() + "/";
    return directory.c_str();
}

namespace {

using namespace providerTest;
using testing::ElementsAre;

template <class Kind>
class LoadFailure : public RecordStore<Kind> {
protected:
    void SetUp() override {
        RecordStore<Kind>::SetUp();
        write(this->path(), std::string("1\nA\n") + Kind::defaultRecord);
    }
    void TearDown() override {
        insteadOfDataDirectory = nullptr;
        RecordStore<Kind>::TearDown();
    }
};

TYPED_TEST_SUITE(LoadFailure, RecordKinds, KindNames);

TYPED_TEST(LoadFailure, LeavesAnEmptyTableAndIsLoggedAtErrorLevel) {
    insteadOfDataDirectory = [] { throw std::runtime_error("no directory"); };
    agentEnvironment::forgetLog();
    typename TypeParam::Cache cache;
    EXPECT_EQ(TypeParam::count(cache), 0U);
    EXPECT_TRUE(cache.table.empty());
    const std::string function = std::string(TypeParam::name) + "Cache";
    const std::string source = Words<TypeParam>::sourceFile;
    EXPECT_THAT(logMessagesOf(source, function),
                ElementsAre(entering(function, source), message("no directory", source), exiting(function, source)));
    for (const char* channel : {"log", "trace"}) {
        const auto records = recordsOf(source, function, channel);
        ASSERT_EQ(records.size(), 3U);
        EXPECT_EQ(records[1].level, 3000);
        EXPECT_EQ(records[1].logger, "Tarvik.LeaseAndWarrantyProvider");
    }
}

TYPED_TEST(LoadFailure, DoesNotAffectTheNextLoad) {
    insteadOfDataDirectory = [] { throw KO::FrameworkException("not now"); };
    { typename TypeParam::Cache failed; }
    insteadOfDataDirectory = nullptr;
    typename TypeParam::Cache cache;
    EXPECT_EQ(TypeParam::count(cache), 1U);
    ASSERT_EQ(cache.table.size(), 1U);
    EXPECT_EQ(cache.table[0].InstanceID, "A");
}

}  // namespace
