// The adapters of the agent and of asset data, constructed from a namespace.

#include <gmock/gmock.h>

#include "CMPIAssetIDDetail.h"
#include "CMPIOstrelAgent.h"
#include "KO/ProviderUtilities.h"
#include "NodesFixture.h"
#include "Support.h"
#include "broker/Broker.h"
#include "broker/RequestScope.h"

namespace {

using namespace providerTest;
using testing::Each;
using testing::ElementsAre;
using testing::IsEmpty;

using KO::ProviderUtilities;
using KO::LeaseWarrantyProvider::CMPIAssetIDDetail;
using KO::LeaseWarrantyProvider::CMPIOstrelAgent;

class ProductAdapter : private ProcessNodes, public CleanAgent {
protected:
    ProductAdapter() : ProcessNodes(assetNodes) {}

    /** The namespaces and the values of a key in an adapter's paths, and the number of its instances. */
    struct VisitedPaths {
        std::vector<std::string> keys{};
        std::vector<std::string> nameSpaces{};
        std::size_t instances = 0;
    };

    template <class Adapter>
    VisitedPaths visited(const char* key) {
        Adapter adapter(broker.handle(), nullptr, std::string("root/elsewhere"));
        VisitedPaths found;
        for (; adapter; ++adapter) {
            std::string value = "(none)";
            const CMPIObjectPath* path = adapter.getObjectPath();
            ProviderUtilities::getKeyProperty(path, key, value);
            found.keys.push_back(value);
            found.nameSpaces.push_back(ProviderUtilities::getNamespace(path));
            found.instances += adapter.getCMPIInstance(nullptr) == nullptr ? 0U : 1U;
        }
        return found;
    }

    cimhost::Broker broker{};
    cimhost::RequestScope scope{broker};
};

TEST_F(ProductAdapter, OfANamespaceReturnsTheAgentWithoutComparingKeys) {
    const VisitedPaths found = visited<CMPIOstrelAgent>("Name");
    EXPECT_THAT(found.keys, ElementsAre("Test Agent"));
    EXPECT_THAT(found.nameSpaces, Each("root/elsewhere"));
    EXPECT_EQ(found.instances, 1U);
    EXPECT_THAT(logMessagesOf("OstrelAgent.cpp", "setFilter"), IsEmpty());
    EXPECT_THAT(logMessagesOf("CMPIOstrelAgent.cpp", "setObjectPath"), IsEmpty());
}

TEST_F(ProductAdapter, OfANamespaceReturnsOneAssetInstancePerComputer) {
    const VisitedPaths found = visited<CMPIAssetIDDetail>("Name");
    EXPECT_THAT(found.keys, ElementsAre("spaced", "tight", "dashless", "dash first", "dash second", "many dashes",
                                        "empty", "productless", "/system%20one"))
        << "the last computer has no name, and its Name key repeats the preceding key";
    EXPECT_THAT(found.nameSpaces, Each("root/elsewhere"));
    EXPECT_EQ(found.instances, 9U);
    EXPECT_THAT(logMessagesOf("AssetIDDetails.cpp", "setFilter"), IsEmpty());
    EXPECT_THAT(logMessagesOf("CMPIAssetIDDetail.cpp", "setObjectPath"), IsEmpty());
}

}  // namespace
