#include "ProviderFixture.h"

namespace contract {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class RecordRequestTest : public ProviderTest {};

TEST_F(RecordRequestTest, EnumerationOfNoLeasesIsAnEmptySuccess) {
    const Outcome outcome = provider().enumerateInstances(classPath("VELKO_Lease"));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(outcome.instances(), IsEmpty());
}

}  // namespace
}  // namespace contract
