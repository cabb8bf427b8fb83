// A load that the framework fails. The program's own PlatformUtilities::getKelsaDataDir takes the place of the
// framework's.

#include "KO/PlatformUtilities.h"
#include "Sides.h"

#include <gmock/gmock.h>

#include <stdexcept>

namespace {

/** What the framework throws in place of naming the data directory; null for nothing. */
void (*insteadOfNaming)() = nullptr;

}  // namespace

const char* KO::PlatformUtilities::getKelsaDataDir() {
    if (insteadOfNaming != nullptr) {
        insteadOfNaming();
    }
    static const std::string directory = agentEnvironment::dataDirectory().string() + "/";
    return directory.c_str();
}

namespace {

using namespace providerTest;
using testing::ElementsAre;

template <class Side>
class LoadFailure : public RecordStore<Side> {
protected:
    void SetUp() override {
        RecordStore<Side>::SetUp();
        write(this->path(), std::string("1\nA\n") + Side::defaultRecord);
    }
    void TearDown() override {
        insteadOfNaming = nullptr;
        RecordStore<Side>::TearDown();
    }
};

TYPED_TEST_SUITE(LoadFailure, Sides, SideNames);

TYPED_TEST(LoadFailure, LeavesAnEmptyTableAndIsToldAtErrorLevel) {
    insteadOfNaming = [] { throw std::runtime_error("no directory"); };
    agentEnvironment::forgetLog();
    typename TypeParam::Cache cache;
    EXPECT_EQ(TypeParam::count(cache), 0U);
    EXPECT_TRUE(cache.table.empty());
    const std::string function = std::string(TypeParam::name) + "Cache";
    const std::string source = Words<TypeParam>::sourceFile;
    EXPECT_THAT(textsOf(source, function),
                ElementsAre(entering(function, source), message("no directory", source), exiting(function, source)));
    for (const char* channel : {"log", "trace"}) {
        const auto records = recordsOf(source, function, channel);
        ASSERT_EQ(records.size(), 3U);
        EXPECT_EQ(records[1].level, 3000);
        EXPECT_EQ(records[1].logger, "Tarvik.LeaseAndWarrantyProvider");
    }
}

TYPED_TEST(LoadFailure, DoesNotHinderTheNextLoad) {
    insteadOfNaming = [] { throw KO::FrameworkException("not now"); };
    { typename TypeParam::Cache failed; }
    insteadOfNaming = nullptr;
    typename TypeParam::Cache cache;
    EXPECT_EQ(TypeParam::count(cache), 1U);
    ASSERT_EQ(cache.table.size(), 1U);
    EXPECT_EQ(cache.table[0].InstanceID, "A");
}

}  // namespace
